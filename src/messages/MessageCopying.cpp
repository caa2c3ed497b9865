#include <functional>
#include <stdexcept>
#include <type_traits>

#include "messages/MessageFields.h"

namespace quorl {

using fields::hasFlag;
using fields::member;
using fields::setFlag;
using fields::visitMember;

namespace {

template <typename T>
constexpr bool kIsReference = std::is_same_v<T, std::optional<ByteString>> || std::is_same_v<T, std::optional<Text>>;
template <typename T>
constexpr bool kIsList =
    std::is_same_v<T, UInt32List> || std::is_same_v<T, UInt64List> || std::is_same_v<T, SInt32List>;

AnyMessageRef deepCopy(const AnyMessageRef& message) {
  return AnyMessageRef(message.message()->copyWithZone());
}

void addAll(AnyMessageArray& target, const AnyMessageArray& source) {
  // The count is taken first: both may be the same array.
  const std::size_t count = source.count();
  for (std::size_t i = 0; i < count; ++i) target.addElement(AnyMessageRef(source.elementAtIndex(i)));
}

/// Byte strings and texts count by their bytes.
std::uint64_t textHash(std::string_view bytes) {
  return std::hash<std::string_view>{}(bytes);
}

}  // namespace

void MetricCodable::checkSameClass(const MetricCodable& other) const {
  if (&table() != &other.table()) throw std::invalid_argument("messages of different classes");
}

void MetricCodable::copyTo(MetricCodable& target) const {
  checkSameClass(target);
  if (&target == this) return;
  for (const FieldEntry& field : table().fields) {
    visitMember(
        field,
        [&]<typename T>(const T& own) {
          auto& theirs = member<T>(target, field.offset);
          if constexpr (std::is_scalar_v<T>) {
            if (!hasFlag(*this, field)) return;
            theirs = own;
            setFlag(target, field);
          } else if constexpr (kIsReference<T> || std::is_same_v<T, AnyMessageRef>) {
            if (own) theirs = own;
          } else if constexpr (kIsList<T>) {
            if (own.count > 0) theirs.copyFrom(own);
          } else {
            if (own.count() == 0) return;
            theirs.clear();
            addAll(theirs, own);
          }
        },
        *this);
  }
}

std::unique_ptr<MetricCodable> MetricCodable::copyWithZone() const {
  std::unique_ptr<MetricCodable> copy(table().make());
  copy->isReadWhole_ = isReadWhole_;
  for (const FieldEntry& field : table().fields) {
    visitMember(
        field,
        [&]<typename T>(const T& own) {
          auto& theirs = member<T>(*copy, field.offset);
          if constexpr (std::is_scalar_v<T>) {
            if (!hasFlag(*this, field)) return;
            theirs = own;
            setFlag(*copy, field);
          } else if constexpr (kIsReference<T>) {
            theirs = own;
          } else if constexpr (std::is_same_v<T, AnyMessageRef>) {
            if (own) theirs = deepCopy(own);
          } else if constexpr (kIsList<T>) {
            theirs.copyFrom(own);
          } else {
            for (std::size_t i = 0; i < own.count(); ++i) theirs.addElement(deepCopy(own.elementAtIndex(i)));
          }
        },
        *this);
  }
  return copy;
}

void MetricCodable::mergeFrom(const MetricCodable& other) {
  checkSameClass(other);
  for (const FieldEntry& field : table().fields) {
    visitMember(
        field,
        [&]<typename T>(const T& theirs) {
          auto& own = member<T>(*this, field.offset);
          if constexpr (std::is_scalar_v<T>) {
            if (!hasFlag(other, field)) return;
            own = theirs;
            setFlag(*this, field);
          } else if constexpr (kIsReference<T>) {
            if (theirs) own = theirs;
          } else if constexpr (std::is_same_v<T, AnyMessageRef>) {
            if (!theirs) return;
            if (own)
              own.message()->mergeFrom(*theirs.message());
            else
              own = theirs;
          } else if constexpr (kIsList<T>) {
            own.addAll(theirs);
          } else {
            addAll(own, theirs);
          }
        },
        other);
  }
}

bool MetricCodable::isEqual(const MetricCodable& other) const {
  if (&table() != &other.table()) return false;
  const auto areEqual = [&](const FieldEntry& field) {
    return visitMember(
        field,
        [&]<typename T>(const T& own, const T& theirs) -> bool {
          if constexpr (std::is_scalar_v<T>) {
            const bool isPresent = hasFlag(*this, field);
            return isPresent == hasFlag(other, field) && (!isPresent || own == theirs);
          } else if constexpr (kIsReference<T>) {
            return own == theirs;
          } else if constexpr (std::is_same_v<T, AnyMessageRef>) {
            return own && theirs ? own.message()->isEqual(*theirs.message()) : !own && !theirs;
          } else if constexpr (kIsList<T>) {
            return own.isEqual(theirs);
          } else {
            if (own.isSet() != theirs.isSet() || own.count() != theirs.count()) return false;
            for (std::size_t i = 0; i < own.count(); ++i)
              if (!own.elementAtIndex(i).message()->isEqual(*theirs.elementAtIndex(i).message())) return false;
            return true;
          }
        },
        *this, other);
  };
  for (const FieldEntry& field : table().fields)
    if (!areEqual(field)) return false;
  return true;
}

std::uint64_t MetricCodable::hash() const {
  constexpr std::uint64_t kFactor = 2654435761;
  std::uint64_t result = 0;
  for (const FieldEntry& field : table().fields) {
    result ^= visitMember(
        field,
        [&]<typename T>(const T& own) -> std::uint64_t {
          if constexpr (std::is_scalar_v<T>) {
            // Signed kinds are extended by their sign.
            return hasFlag(*this, field) ? static_cast<std::uint64_t>(own) * kFactor : 0;
          } else if constexpr (kIsReference<T>) {
            return own ? textHash(own->view()) : 0;
          } else if constexpr (std::is_same_v<T, AnyMessageRef>) {
            return own ? own.message()->hash() : 0;
          } else if constexpr (kIsList<T>) {
            return own.hash();
          } else {
            std::uint64_t array = own.count();
            for (std::size_t i = 0; i < own.count(); ++i)
              array = array * kFactor + own.elementAtIndex(i).message()->hash();
            return array;
          }
        },
        *this);
  }
  return result;
}

}  // namespace quorl
