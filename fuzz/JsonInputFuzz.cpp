#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <string_view>

#include "MessageJson.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

// The first byte chooses the class, the rest is JSON as the tool's `encode` reads it. A message that was filled must
// print and fill again to the same message.

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const auto tables = quorl::allMessageTables();
  const quorl::MessageTable& table = *tables[data[0] % tables.size()];
  const std::string_view text(reinterpret_cast<const char*>(data) + 1, size - 1);
  const std::unique_ptr<quorl::MetricCodable> message(table.make());
  if (!quorl::tool::fillFromJson(*message, text)) return 0;
  const auto dictionary = message->dictionaryRepresentation();
  if (!dictionary) std::abort();
  const std::unique_ptr<quorl::MetricCodable> again(table.make());
  if (!quorl::tool::fillFromJson(*again, quorl::tool::messageLine(dictionary))) std::abort();
  if (again->dictionaryRepresentation() != dictionary) std::abort();
  return 0;
}
