#pragma once

#include <string_view>

namespace quorl::desktop {

/// Tells the user something on standard error, each line of it behind the program's name.
void tell(std::string_view text);

}  // namespace quorl::desktop
