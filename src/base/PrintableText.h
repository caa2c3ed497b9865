#pragma once

#include <string>
#include <string_view>

namespace quorl {

/// `text` with a dot for each control character, C0, DEL and C1 alike, and for each byte that is no UTF-8: texts that
/// come from outside must not reach a terminal as commands.
std::string printable(std::string_view text);

}  // namespace quorl
