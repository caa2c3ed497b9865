#include "JsonLine.h"

#include <cstddef>
#include <utility>

#include <fmt/format.h>
#include <nlohmann/json.hpp>

namespace quorl::tool {
namespace {

using Json = nlohmann::ordered_json;

struct ToJson {
  Json operator()(std::monostate) const { return nullptr; }
  template <typename Single>
  Json operator()(const Single& value) const {
    return value;
  }
};

}  // namespace

std::string withEscapedControls(std::string json) {
  constexpr char kDelete = 0x7F;
  constexpr char kLead = static_cast<char>(0xC2);  // of U+0080 to U+00BF
  if (json.find(kDelete) == std::string::npos && json.find(kLead) == std::string::npos) return json;
  std::string escaped;
  for (std::size_t at = 0; at < json.size(); ++at) {
    const auto next = static_cast<unsigned char>(at + 1 < json.size() ? json[at + 1] : 0);
    if (json[at] == kDelete) {
      escaped += "\\u007f";
    } else if (json[at] == kLead && next >= 0x80 && next < 0xA0) {
      escaped += fmt::format("\\u{:04x}", next);
      ++at;
    } else {
      escaped.push_back(json[at]);
    }
  }
  return escaped;
}

std::string jsonLine(std::initializer_list<JsonMember> members) {
  Json object = Json::object();
  for (const JsonMember& member : members)
    if (!std::holds_alternative<std::monostate>(member.value.variant()))
      object[member.key] = std::visit(ToJson{}, member.value.variant());
  return withEscapedControls(object.dump(-1, ' ', /*ensure_ascii=*/false, Json::error_handler_t::replace));
}

}  // namespace quorl::tool
