#pragma once

#include <atomic>
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
struct FieldEntry;
struct MessageTable;

/// Base class of all message classes: one engine reads, writes, copies, merges, compares, hashes and represents any
/// message from its constant field table. Generated classes add members and typed accessors, nothing else.
///
/// A message is used by one thread at a time. It owns its lists; child messages, byte strings and texts are shared by
/// reference and are immutable in practice. It never refers to its parent.
class MetricCodable {
 public:
  MetricCodable(const MetricCodable&) = delete;
  MetricCodable& operator=(const MetricCodable&) = delete;
  virtual ~MetricCodable() = default;

  virtual const MessageTable& table() const = 0;

  /// Fills this new message from a payload; none reads like an empty one. A message whose reading failed keeps what it
  /// has read and answers no dictionary, so that no damaged payload is ever stored in part.
  void initWithData(const std::optional<ByteString>& payload);
  /// False when a payload could not be read whole.
  bool isReadWhole() const { return isReadWhole_; }
  /// Reads up to the reader's `length` into what the message already holds. False if it cannot be read whole; what
  /// was read before stays. Only the tag decides the field: the wire type is not compared with the field's.
  bool readFrom(WireReader& reader);
  /// Appends all present fields in the order of the table.
  void writeTo(WireWriter& writer) const;

  /// An entry for each present field and for each repeated scalar, even an empty one, in the order of the table and
  /// keyed as the table says; nothing for a message whose reading failed.
  std::optional<MetricDictionary> dictionaryRepresentation() const;
  /// The class and the dictionary, for log lines and debuggers.
  std::string description() const;

  /// Copies each present field over that of `target`, and removes nothing there; children are shared. The target must
  /// be of the same class, else std::invalid_argument.
  void copyTo(MetricCodable& target) const;
  /// A deep copy of the object's own class.
  std::unique_ptr<MetricCodable> copyWithZone() const;
  /// Folds `other` into this message: scalars, byte strings and texts of `other` replace, a child is merged with a
  /// child, an absent one is adopted by reference, and lists and arrays are concatenated. `other` must be of the same
  /// class, else std::invalid_argument.
  void mergeFrom(const MetricCodable& other);

  /// Exactly the same class, the same fields present and equal.
  bool isEqual(const MetricCodable& other) const;
  /// Agrees for equal messages.
  std::uint64_t hash() const;

 protected:
  MetricCodable() = default;

 private:
  friend class AnyMessageRef;

  bool readFields(WireReader& reader, const MessageTable& table);
  bool readField(WireReader& reader, const FieldEntry& field, std::uint64_t wireType);
  static bool readChild(WireReader& reader, MetricCodable& child, const MessageTable& table);
  void represent(MetricDictionary& dictionary, const MessageTable& table) const;
  void checkSameClass(const MetricCodable& other) const;

  std::atomic<std::uint32_t> references_ = 0;  // of message references; 0 while a unique_ptr owns the message
  bool isReadWhole_ = true;
};

/// Makes an empty message of the class of exactly this name; null when there is no such class. Thread-safe.
std::unique_ptr<MetricCodable> makeMessage(std::string_view className);

}  // namespace quorl
