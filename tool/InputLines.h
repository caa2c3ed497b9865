#pragma once

#include <cstddef>
#include <functional>
#include <string>

namespace quorl::tool {

/// Hands each line of standard input with its number, from 1, to `take`, until the end or until standard output takes
/// no more of what is printed meanwhile. False if the end was an error, which the user is told.
bool forEachInputLine(const std::function<void(std::size_t number, const std::string& line)>& take);

}  // namespace quorl::tool
