#pragma once

#include <iterator>
#include <utility>

#include <fmt/format.h>

namespace quorl::generator {

/// The text of a generated file while it grows.
using Output = fmt::memory_buffer;

template <typename... Args>
void emit(Output& out, fmt::format_string<Args...> format, Args&&... args) {
  fmt::format_to(std::back_inserter(out), format, std::forward<Args>(args)...);
}

}  // namespace quorl::generator
