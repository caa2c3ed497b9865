#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "base/SharedBytes.h"
#include "messages/MetricDictionary.h"

namespace quorl {

class WireReader;
class WireWriter;
struct MessageTable;

/// Base class of all message classes: one engine reads, writes, copies, merges, compares, hashes and represents any
/// message from its constant field table. Generated classes add members and typed accessors, nothing else.
///
/// A message is used by one thread at a time. It owns its lists; child messages, byte strings and texts are shared by
/// reference and are immutable in practice.
class MetricCodable {
 public:
  virtual ~MetricCodable() = default;

  virtual const MessageTable& table() const = 0;

  /// Fills this new message from a payload; none reads like an empty one. A message whose reading failed keeps what it
  /// has read and answers no dictionary, so that no damaged payload is ever stored in part.
  void initWithData(const std::optional<ByteString>& payload);
  /// False when the payload of `initWithData` could not be read whole.
  bool isReadWhole() const { return isReadWhole_; }
  /// An entry for each present field, keyed as the tables say; nothing for a message whose reading failed.
  std::optional<MetricDictionary> dictionaryRepresentation() const;

  // ... the rest of the operations

 private:
  bool isReadWhole_ = true;
};

/// Makes an empty message of the class of exactly this name; null when there is no such class. Thread-safe.
std::unique_ptr<MetricCodable> makeMessage(std::string_view className);

}  // namespace quorl
