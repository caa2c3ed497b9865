#pragma once

#include <optional>
#include <string>
#include <string_view>

// How a stored value and its name read on a screen. Nothing here changes what is stored. Any thread.

namespace quorl {

/// The display text of a value: a bandwidth in resource blocks becomes one in MHz ("50" gives "10 MHz"), all else
/// stays. A bandwidth that is no known count of resource blocks reads " MHz".
std::string processValue(std::string_view key, std::string_view value);

/// The display text of an attribute name: of a name with "section-" the piece behind its last '-', followed by "CA "
/// and the section if there is one; any other name as it stands.
std::string processAttributeName(std::string_view key, std::string_view value,
                                 std::optional<std::string_view> section = std::nullopt);

}  // namespace quorl
