#pragma once

#include <optional>
#include <string>
#include <string_view>

#include <tl/expected.hpp>

#include "messages/MetricCodable.h"
#include "messages/MetricDictionary.h"

// Messages as JSON, one form for what is read and what is written: integers are numbers, booleans true and false, texts
// and enumerators strings, and a byte string is {"$bytes":"<hexadecimal>"}.

namespace quorl::tool {

/// One line, without its line break, in the order of the message's table; null for no dictionary.
std::string messageLine(const std::optional<MetricDictionary>& dictionary);

/// Sets each field that `json`, the text of an object, names. The error says what is wrong and names the place; the
/// message is then half filled. An enumerator that has no name may be given as "(unknown: 17)", as it is shown, or as
/// 17.
tl::expected<void, std::string> fillFromJson(MetricCodable& message, std::string_view json);

}  // namespace quorl::tool
