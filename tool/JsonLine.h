#pragma once

#include <concepts>
#include <cstdint>
#include <initializer_list>
#include <string>
#include <string_view>
#include <variant>

// What subcommands print as JSON, one object a line. The JSON library stays behind this face, as it takes seconds to
// compile wherever it is included.

namespace quorl::tool {

/// One value, or none.
class JsonValue {
 public:
  using Variant = std::variant<std::monostate, bool, std::int64_t, std::uint64_t, double, std::string>;

  JsonValue() = default;
  JsonValue(bool value) : value_(value) {}
  JsonValue(double value) : value_(value) {}
  template <std::signed_integral T>
  JsonValue(T value) : value_(std::int64_t{value}) {}
  template <std::unsigned_integral T>
  requires(!std::same_as<T, bool>) JsonValue(T value) : value_(std::uint64_t{value}) {}
  template <typename T>
  requires std::convertible_to<const T&, std::string_view> JsonValue(const T& text)
      : value_(std::string(std::string_view(text))) {}

  const Variant& variant() const { return value_; }

 private:
  Variant value_;
};

struct JsonMember {
  const char* key;
  JsonValue value;
};

/// JSON text with DEL and the C1 control characters, which JSON lets stand, as escapes: a terminal obeys them.
std::string withEscapedControls(std::string json);

/// An object with its members in this order, on one line without its line break. A member without a value is left out.
std::string jsonLine(std::initializer_list<JsonMember> members);

}  // namespace quorl::tool
