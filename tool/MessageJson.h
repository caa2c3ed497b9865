#pragma once

#include <string>

#include <nlohmann/json.hpp>
#include <tl/expected.hpp>

#include "messages/MetricCodable.h"
#include "messages/MetricDictionary.h"

// Messages as JSON, one form for what is read and what is written: integers are numbers, booleans true and false, texts
// and enumerators strings, and a byte string is {"$bytes":"<hexadecimal>"}.

namespace quorl::tool {

/// Keeps the order of a message's table.
using Json = nlohmann::ordered_json;

inline constexpr char kBytesKey[] = "$bytes";

Json toJson(const MetricDictionary& dictionary);

/// One line, without its line break.
std::string jsonLine(const Json& value);

/// Sets each field that `object` names. The error names the place and says what is wrong there; the message is then
/// half filled. An enumerator that has no name may be given as "(unknown: 17)", as it is shown, or as 17.
tl::expected<void, std::string> fillFromJson(MetricCodable& message, const Json& object);

}  // namespace quorl::tool
