#pragma once

#include <string>

namespace quorl {

/// Cleans a value of one enumerator prefix such as "SYS_MODE_": of the known prefixes the first that occurs anywhere
/// in `value` is removed, all its occurrences, and no other is tried.
void removeEnumeratorPrefix(std::string& value);

}  // namespace quorl
