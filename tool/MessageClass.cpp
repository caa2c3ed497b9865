#include "MessageClass.h"

#include <vector>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "Commands.h"
#include "NearestNames.h"

namespace quorl::tool {

const MessageTable* messageClass(std::string_view name) {
  std::vector<std::string_view> names;
  for (const MessageTable* table : allMessageTables()) {
    if (table->className == name) return table;
    names.push_back(table->className);
  }
  constexpr std::size_t kNamesTold = 3;
  complain(fmt::format("there is no message class \"{}\"; the nearest are {}", name,
                       fmt::join(nearestNames(name, std::move(names), kNamesTold), ", ")));
  return nullptr;
}

}  // namespace quorl::tool
