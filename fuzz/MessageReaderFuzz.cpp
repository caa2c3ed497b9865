#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string_view>

#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"
#include "messages/wire/WireWriter.h"

// The first byte chooses the class, the rest is its payload. What was read whole must write and read back as the same
// message, and copies of it must be equal.

namespace {

using quorl::ByteString;
using quorl::MetricCodable;

std::unique_ptr<MetricCodable> read(const quorl::MessageTable& table, std::string_view payload) {
  std::unique_ptr<MetricCodable> message(table.make());
  message->initWithData(ByteString(payload));
  return message;
}

void require(bool holds) {
  if (!holds) std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const auto tables = quorl::allMessageTables();
  const quorl::MessageTable& table = *tables[data[0] % tables.size()];
  const auto message = read(table, {reinterpret_cast<const char*>(data) + 1, size - 1});
  const auto dictionary = message->dictionaryRepresentation();
  require(dictionary.has_value() == message->isReadWhole());
  if (!message->isReadWhole()) return 0;

  quorl::WireWriter writer;
  message->writeTo(writer);
  const auto again = read(table, writer.bytes());
  require(again->isReadWhole());
  require(again->isEqual(*message) && again->hash() == message->hash());
  require(again->dictionaryRepresentation() == dictionary);
  require(message->copyWithZone()->isEqual(*message));
  return 0;
}
