#include <memory>
#include <string_view>
#include <unordered_map>

#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

namespace quorl {

std::unique_ptr<MetricCodable> makeMessage(std::string_view className) {
  static const auto tables = [] {
    std::unordered_map<std::string_view, const MessageTable*> byName;
    for (const MessageTable* table : allMessageTables()) byName.emplace(table->className, table);
    return byName;
  }();
  const auto found = tables.find(className);
  return std::unique_ptr<MetricCodable>(found == tables.end() ? nullptr : found->second->make());
}

}  // namespace quorl
