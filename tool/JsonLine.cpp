#include "JsonLine.h"

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

std::string jsonLine(std::initializer_list<JsonMember> members) {
  Json object = Json::object();
  for (const JsonMember& member : members)
    if (!std::holds_alternative<std::monostate>(member.value.variant()))
      object[member.key] = std::visit(ToJson{}, member.value.variant());
  return object.dump(-1, ' ', /*ensure_ascii=*/false, Json::error_handler_t::replace);
}

}  // namespace quorl::tool
