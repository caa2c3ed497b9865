#include "MessageJson.h"

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <string_view>
#include <utility>
#include <variant>

#include <fmt/format.h>
#include <nlohmann/json.hpp>

#include "Hexadecimal.h"
#include "JsonLine.h"
#include "messages/MessageFields.h"
#include "messages/MessageRef.h"
#include "messages/MessageTable.h"

namespace quorl::tool {
namespace {

using Json = nlohmann::ordered_json;  // keeps the order of a message's table

constexpr char kBytesKey[] = "$bytes";

Json toJson(const MetricDictionary& dictionary);

Json bytesJson(std::string_view bytes) {
  Json object = Json::object();
  object[kBytesKey] = hexText(bytes);
  return object;
}

struct ValueToJson {
  template <typename Plain>
  Json operator()(const Plain& plain) const {
    return plain;
  }
  Json operator()(const MetricFloat& number) const { return number.value; }
  Json operator()(const Text& text) const { return text.view(); }
  Json operator()(const ByteString& bytes) const { return bytesJson(bytes.view()); }
  Json operator()(const MetricDictionary& dictionary) const { return toJson(dictionary); }
  Json operator()(const MetricDictionaryList& list) const {
    Json array = Json::array();
    for (const MetricDictionary& element : list) array.push_back(toJson(element));
    return array;
  }
  Json operator()(const NumberList& list) const {
    Json array = Json::array();
    for (const std::uint64_t bits : list.bits) {
      if (list.isSigned) {
        array.push_back(static_cast<std::int64_t>(bits));
      } else {
        array.push_back(bits);
      }
    }
    return array;
  }
};

Json toJson(const MetricValue& value) {
  return std::visit(ValueToJson{}, static_cast<const MetricValue::variant&>(value));
}

Json toJson(const MetricDictionary& dictionary) {
  Json object = Json::object();
  for (const MetricEntry& entry : dictionary.entries()) object[entry.key.string()] = toJson(entry.value);
  return object;
}

using Outcome = tl::expected<void, std::string>;

/// A value as an error shows it: a long one is cut.
std::string shown(const Json& value) {
  constexpr std::size_t kEnough = 60;
  std::string text = value.dump(-1, ' ', /*ensure_ascii=*/true);
  if (text.size() > kEnough) text.replace(kEnough, std::string::npos, "...");
  return text;
}

tl::unexpected<std::string> fault(std::string_view place, std::string_view text) {
  return tl::unexpected(fmt::format("{}: {}", place, text));
}

template <typename T>
std::optional<T> integer(const Json& value) {
  if (value.is_number_unsigned()) {
    const auto number = value.get<std::uint64_t>();
    return std::in_range<T>(number) ? std::optional(static_cast<T>(number)) : std::nullopt;
  }
  if (value.is_number_integer()) {
    const auto number = value.get<std::int64_t>();
    return std::in_range<T>(number) ? std::optional(static_cast<T>(number)) : std::nullopt;
  }
  return std::nullopt;
}

template <typename T>
tl::unexpected<std::string> noInteger(std::string_view place, const Json& value) {
  if (!value.is_number_integer()) return fault(place, fmt::format("a whole number is wanted, not {}", shown(value)));
  return fault(place, fmt::format("{} is out of range, which is {} to {}", shown(value), std::numeric_limits<T>::min(),
                                  std::numeric_limits<T>::max()));
}

/// The integer of a text such as "(unknown: 17)".
std::optional<std::int32_t> namelessEnumerator(std::string_view name) {
  constexpr std::string_view kPrefix = "(unknown: ";
  if (!name.starts_with(kPrefix) || !name.ends_with(')')) return std::nullopt;
  const std::string_view digits = name.substr(kPrefix.size(), name.size() - kPrefix.size() - 1);
  std::int32_t value = 0;
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
  return error == std::errc() && end == digits.data() + digits.size() ? std::optional(value) : std::nullopt;
}

std::optional<std::int32_t> enumerator(const EnumTable& enumeration, std::string_view name) {
  const auto found = std::find_if(enumeration.entries.begin(), enumeration.entries.end(),
                                  [name](const EnumTable::Entry& entry) { return entry.name == name; });
  return found != enumeration.entries.end() ? std::optional(found->value) : namelessEnumerator(name);
}

std::optional<std::string> bytesOf(const Json& value) {
  if (!value.is_object() || value.size() != 1 || !value.contains(kBytesKey)) return std::nullopt;
  const Json& text = value.front();
  return text.is_string() ? hexBytes(text.get_ref<const std::string&>()) : std::nullopt;
}

Outcome fillObject(MetricCodable& message, const Json& object, const std::string& place);

/// Sets one field; its member is found by its stored type.
class FieldFiller {
 public:
  FieldFiller(MetricCodable& message, const FieldEntry& field, const Json& value, const std::string& place)
      : message_(message), field_(field), value_(value), place_(place) {}

  Outcome operator()(std::uint32_t& member) const { return fillInteger(member); }
  Outcome operator()(std::uint64_t& member) const { return fillInteger(member); }
  Outcome operator()(std::int32_t& member) const {
    if (field_.kind != FieldKind::Enumeration || !value_.is_string()) return fillInteger(member);
    const auto& name = value_.get_ref<const std::string&>();
    const auto value = enumerator(*field_.enumeration, name);
    if (!value) return fault(place_, fmt::format("there is no enumerator {}", shown(value_)));
    member = *value;
    fields::setFlag(message_, field_);
    return {};
  }
  Outcome operator()(bool& member) const {
    if (!value_.is_boolean()) return fault(place_, fmt::format("true or false is wanted, not {}", shown(value_)));
    member = value_.get<bool>();
    fields::setFlag(message_, field_);
    return {};
  }
  Outcome operator()(std::optional<ByteString>& member) const {
    const auto bytes = bytesOf(value_);
    if (!bytes) return fault(place_, R"({"$bytes":"<hexadecimal>"} is wanted)");
    member = ByteString(*bytes);
    return {};
  }
  Outcome operator()(std::optional<Text>& member) const {
    if (!value_.is_string()) return fault(place_, fmt::format("a text is wanted, not {}", shown(value_)));
    member = Text(value_.get_ref<const std::string&>());
    return {};
  }
  Outcome operator()(AnyMessageRef& member) const {
    auto child = newChild();
    if (auto outcome = fillObject(*child, value_, place_); !outcome) return outcome;
    member = AnyMessageRef(std::move(child));
    return {};
  }
  Outcome operator()(AnyMessageArray& member) const {
    return forEachElement([&](const Json& element, const std::string& place) -> Outcome {
      auto child = newChild();
      if (auto outcome = fillObject(*child, element, place); !outcome) return outcome;
      member.addElement(AnyMessageRef(std::move(child)));
      return {};
    });
  }
  template <typename T>
  Outcome operator()(ListRecord<T>& member) const {
    return forEachElement([&](const Json& element, const std::string& place) -> Outcome {
      const auto number = integer<T>(element);
      if (!number) return noInteger<T>(place, element);
      member.add(*number);
      return {};
    });
  }

 private:
  template <typename T>
  Outcome fillInteger(T& member) const {
    const auto number = integer<T>(value_);
    if (!number) return noInteger<T>(place_, value_);
    member = *number;
    fields::setFlag(message_, field_);
    return {};
  }

  std::unique_ptr<MetricCodable> newChild() const { return std::unique_ptr<MetricCodable>(field_.message->make()); }

  template <typename Fill>
  Outcome forEachElement(const Fill& fill) const {
    if (!value_.is_array()) return fault(place_, "a list is wanted");
    for (std::size_t index = 0; index < value_.size(); ++index)
      if (auto outcome = fill(value_[index], fmt::format("{}[{}]", place_, index)); !outcome) return outcome;
    return {};
  }

  MetricCodable& message_;
  const FieldEntry& field_;
  const Json& value_;
  const std::string& place_;
};

Outcome fillObject(MetricCodable& message, const Json& object, const std::string& place) {
  const MessageTable& table = message.table();
  if (!object.is_object()) return fault(place.empty() ? table.className : place, "a JSON object is wanted");
  for (const auto& [key, value] : object.items()) {
    const auto field = std::find_if(table.fields.begin(), table.fields.end(),
                                    [&key = key](const FieldEntry& candidate) { return candidate.key == key; });
    if (field == table.fields.end())
      return fault(place.empty() ? table.className : place, fmt::format("there is no field {}", shown(key)));
    const std::string inner = place.empty() ? key : place + "." + key;
    const FieldFiller fill(message, *field, value, inner);
    if (auto outcome = fields::visitMember(*field, fill, message); !outcome) return outcome;
  }
  return {};
}

/// How deep arrays and objects are in each other; of text that is no JSON some number.
std::size_t nesting(std::string_view json) {
  std::size_t depth = 0;
  std::size_t deepest = 0;
  bool isInText = false;
  for (std::size_t at = 0; at < json.size(); ++at) {
    const char c = json[at];
    if (isInText && c == '\\') {
      ++at;
    } else if (c == '"') {
      isInText = !isInText;
    } else if (!isInText && (c == '[' || c == '{')) {
      deepest = std::max(deepest, ++depth);
    } else if (!isInText && (c == ']' || c == '}') && depth > 0) {
      --depth;
    }
  }
  return deepest;
}

}  // namespace

std::string messageLine(const std::optional<MetricDictionary>& dictionary) {
  const Json object = dictionary ? toJson(*dictionary) : Json();
  return withEscapedControls(object.dump(-1, ' ', /*ensure_ascii=*/false, Json::error_handler_t::replace));
}

tl::expected<void, std::string> fillFromJson(MetricCodable& message, std::string_view json) {
  constexpr std::size_t kDeepest = 100;  // no message comes near; the JSON library writes by recursion
  if (nesting(json) > kDeepest) return tl::unexpected(fmt::format("nested deeper than {}", kDeepest));
  const Json object = Json::parse(json, nullptr, /*allow_exceptions=*/false);
  if (object.is_discarded()) return tl::unexpected(std::string("not JSON"));
  return fillObject(message, object, "");
}

}  // namespace quorl::tool
