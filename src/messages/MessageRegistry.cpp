#include <algorithm>
#include <memory>
#include <string_view>

#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

namespace quorl {

std::unique_ptr<MetricCodable> makeMessage(std::string_view className) {
  const auto tables = allMessageTables();
  const auto found =
      std::lower_bound(tables.begin(), tables.end(), className,
                       [](const MessageTable* table, std::string_view name) { return table->className < name; });
  if (found == tables.end() || (*found)->className != className) return nullptr;
  return std::unique_ptr<MetricCodable>((*found)->make());
}

}  // namespace quorl
