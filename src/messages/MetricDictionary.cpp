#include "messages/MetricDictionary.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <limits>
#include <utility>

#include <fmt/format.h>

namespace quorl {

MetricDictionary::MetricDictionary() = default;
MetricDictionary::MetricDictionary(const MetricDictionary&) = default;
MetricDictionary::MetricDictionary(MetricDictionary&&) noexcept = default;
MetricDictionary& MetricDictionary::operator=(const MetricDictionary&) = default;
MetricDictionary& MetricDictionary::operator=(MetricDictionary&&) noexcept = default;
MetricDictionary::~MetricDictionary() = default;

std::size_t MetricDictionary::size() const {
  return entries_.size();
}

void MetricDictionary::reserve(std::size_t count) {
  entries_.reserve(count);
}

void MetricDictionary::remove(std::string_view key) {
  std::erase_if(entries_, [&](const MetricEntry& entry) { return entry.key == key; });
}

const MetricValue* MetricDictionary::find(std::string_view key) const {
  const auto found =
      std::find_if(entries_.begin(), entries_.end(), [&](const MetricEntry& entry) { return entry.key == key; });
  return found == entries_.end() ? nullptr : &found->value;
}

MetricValue* MetricDictionary::find(std::string_view key) {
  return const_cast<MetricValue*>(std::as_const(*this).find(key));
}

std::optional<std::int64_t> MetricDictionary::integer(std::string_view key) const {
  const MetricValue* value = find(key);
  return value != nullptr ? value->integer() : std::nullopt;
}

std::optional<std::int32_t> MetricDictionary::integer32(std::string_view key) const {
  const MetricValue* value = find(key);
  return value != nullptr ? value->integer32() : std::nullopt;
}

std::optional<float> MetricDictionary::number(std::string_view key) const {
  const MetricValue* value = find(key);
  return value != nullptr ? value->number() : std::nullopt;
}

MetricValue& MetricDictionary::slot(std::string_view key, const Text* shared) {
  if (MetricValue* value = find(key)) return *value;
  entries_.push_back(MetricEntry{shared != nullptr ? *shared : Text(key), MetricValue()});
  return entries_.back().value;
}

namespace {

enum class WalkGroup : std::size_t { Row, Unwritable, Nested, Empty };

WalkGroup walkGroup(const MetricValue& value) {
  if (const auto* text = value.get<Text>()) return text->empty() ? WalkGroup::Empty : WalkGroup::Row;
  if (value.get<ByteString>() != nullptr) return WalkGroup::Unwritable;
  if (const auto* numbers = value.get<NumberList>())
    return numbers->bits.empty() ? WalkGroup::Empty : WalkGroup::Unwritable;
  if (value.get<MetricDictionary>() != nullptr) return WalkGroup::Nested;
  if (const auto* list = value.get<MetricDictionaryList>()) return list->empty() ? WalkGroup::Empty : WalkGroup::Nested;
  return WalkGroup::Row;
}

}  // namespace

std::vector<const MetricEntry*> MetricDictionary::walkOrder() const {
  std::vector<const MetricEntry*> order;
  order.reserve(entries_.size());
  for (const WalkGroup group : {WalkGroup::Row, WalkGroup::Unwritable, WalkGroup::Nested, WalkGroup::Empty}) {
    for (const MetricEntry& entry : entries_)
      if (walkGroup(entry.value) == group) order.push_back(&entry);
    if (order.size() == entries_.size()) break;
  }
  return order;
}

bool operator==(const MetricDictionary& a, const MetricDictionary& b) {
  return a.size() == b.size() && std::all_of(a.entries_.begin(), a.entries_.end(), [&](const MetricEntry& entry) {
           const MetricValue* other = b.find(entry.key.view());
           return other != nullptr && *other == entry.value;
         });
}

std::optional<std::int64_t> MetricValue::integer() const {
  if (const auto* number = get<std::int64_t>()) return *number;
  if (const auto* number = get<std::uint64_t>()) {
    if (*number > static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max())) return std::nullopt;
    return static_cast<std::int64_t>(*number);
  }
  if (const auto* flag = get<bool>()) return *flag ? 1 : 0;
  if (const auto* number = get<MetricFloat>()) {
    // 2^63 is exact as a float; every whole float below it fits.
    if (!number->isComputed && std::trunc(number->value) == number->value && std::abs(number->value) < 0x1p63F)
      return static_cast<std::int64_t>(number->value);
  }
  return std::nullopt;
}

std::optional<std::int32_t> MetricValue::integer32() const {
  const std::optional<std::int64_t> value = integer();
  if (!value || *value < std::numeric_limits<std::int32_t>::min() || *value > std::numeric_limits<std::int32_t>::max())
    return std::nullopt;
  return static_cast<std::int32_t>(*value);
}

std::optional<float> MetricValue::number() const {
  if (const auto* value = get<std::int64_t>()) return static_cast<float>(*value);
  if (const auto* value = get<std::uint64_t>()) return static_cast<float>(*value);
  if (const auto* value = get<bool>()) return *value ? 1.0F : 0.0F;
  if (const auto* value = get<MetricFloat>()) return value->value;
  return std::nullopt;
}

bool MetricValue::isInteger() const {
  return get<std::uint64_t>() != nullptr || integer().has_value();
}

std::string MetricValue::integerText() const {
  if (const auto* number = get<std::uint64_t>()) return fmt::format_int(*number).str();
  const std::optional<std::int64_t> number = integer();
  return number ? fmt::format_int(*number).str() : std::string();
}

std::string floatText(float value) {
  std::array<char, 64> buffer;
  const auto [end, error] =
      std::to_chars(buffer.data(), buffer.data() + buffer.size(), value, std::chars_format::fixed);
  std::string text(buffer.data(), error == std::errc() ? end : buffer.data());
  if (std::isfinite(value) && text.find('.') == std::string::npos) text += ".0";
  return text;
}

std::string logText(const MetricDictionary& dictionary) {
  if (dictionary.empty()) return "[:]";
  std::string text = "[";
  for (const MetricEntry& entry : dictionary.entries()) {
    if (text.size() > 1) text += ", ";
    text += entry.key.view();
    text += ": ";
    text += logText(entry.value);
  }
  return text + "]";
}

std::string logText(const MetricValue& value) {
  if (const auto* flag = value.get<bool>()) return *flag ? "true" : "false";
  if (value.isInteger()) return value.integerText();
  if (const auto* number = value.get<MetricFloat>()) return floatText(number->value);
  if (const auto* text = value.get<Text>()) return text->string();
  // Lengths only: byte strings carry identities.
  if (const auto* bytes = value.get<ByteString>()) return fmt::format("<{} bytes>", bytes->size());
  if (const auto* dictionary = value.get<MetricDictionary>()) return logText(*dictionary);
  std::string text = "[";
  if (const auto* list = value.get<MetricDictionaryList>()) {
    for (const MetricDictionary& dictionary : *list) {
      if (text.size() > 1) text += ", ";
      text += logText(dictionary);
    }
  } else if (const auto* numbers = value.get<NumberList>()) {
    for (const std::uint64_t bits : numbers->bits) {
      if (text.size() > 1) text += ", ";
      text += numbers->isSigned ? fmt::format_int(static_cast<std::int64_t>(bits)).str() : fmt::format_int(bits).str();
    }
  }
  return text + "]";
}

}  // namespace quorl
