#pragma once

#include <string_view>

namespace quorl {

/// Ends the process: writes "Fatal error: " and `reason` to standard error and aborts. For our bugs and for the few
/// situations in which running on makes no sense; never for bad input.
[[noreturn]] void fatalStop(std::string_view reason);

}  // namespace quorl
