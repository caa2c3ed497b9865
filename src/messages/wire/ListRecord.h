#pragma once

#include <concepts>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>
#include <utility>

#include "messages/MetricDictionary.h"

namespace quorl {

/// The elements of a repeated scalar field: unsigned 32, unsigned 64 or signed 32 bits each.
///
/// `list` is valid until the next change; it is null while there is no storage. Owns its storage.
template <typename T>
requires std::same_as<T, std::uint32_t> || std::same_as<T, std::uint64_t> || std::same_as<T, std::int32_t>
struct ListRecord {
  ListRecord() = default;
  ListRecord(const ListRecord&) = delete;
  ListRecord& operator=(const ListRecord&) = delete;
  ~ListRecord() { clear(); }

  void add(T value) {
    if (count == size) grow(count + 1);
    list[count++] = value;
  }
  /// Appends the elements of `other`, which may be this list.
  void addAll(const ListRecord& other) {
    const std::uint64_t added = other.count;
    if (added == 0) return;
    if (count + added > size) grow(count + added);
    std::memcpy(list + count, other.list, added * sizeof(T));
    count += added;
  }
  /// Frees the storage.
  void clear() {
    std::free(list);
    list = nullptr;
    count = 0;
    size = 0;
  }
  /// Replaces all by a copy of `valueCount` values, which may be elements of this list.
  void set(const T* values, std::uint64_t valueCount) {
    ListRecord next;
    if (valueCount > 0) {
      next.grow(valueCount);
      std::memcpy(next.list, values, valueCount * sizeof(T));
      next.count = valueCount;
    }
    std::swap(list, next.list);
    std::swap(count, next.count);
    std::swap(size, next.size);
  }
  void copyFrom(const ListRecord& source) { set(source.list, source.count); }

  bool isEqual(const ListRecord& other) const {
    return count == other.count && (count == 0 || std::memcmp(list, other.list, count * sizeof(T)) == 0);
  }
  /// Agrees for equal lists; 0 for an empty one.
  std::uint64_t hash() const {
    std::uint64_t result = 0;
    for (std::uint64_t i = 0; i < count; ++i)
      result = (result ^ static_cast<std::uint64_t>(list[i])) * 0x9E3779B97F4A7C15U + 1;
    return result;
  }

  T* list = nullptr;
  std::uint64_t count = 0;
  std::uint64_t size = 0;  // capacity

 private:
  void grow(std::uint64_t needed) {
    std::uint64_t capacity = size < 4 ? 8 : size * 2;
    if (capacity < needed) capacity = needed;
    void* grown = std::realloc(list, capacity * sizeof(T));
    if (grown == nullptr) throw std::bad_alloc();
    list = static_cast<T*>(grown);
    size = capacity;
  }
};

using UInt32List = ListRecord<std::uint32_t>;
using UInt64List = ListRecord<std::uint64_t>;
using SInt32List = ListRecord<std::int32_t>;

/// The elements as an array of numbers, in order.
template <typename T>
NumberList numbers(const ListRecord<T>& record) {
  NumberList result;
  result.isSigned = std::same_as<T, std::int32_t>;
  result.bits.assign(record.list, record.list + record.count);
  return result;
}

/// Throws std::out_of_range with the text of a list's range error, index and count filled in.
[[noreturn]] void throwListRangeError(std::size_t index, std::uint64_t count);

/// The element; an index at or past the count throws std::out_of_range.
template <typename T>
T elementAtIndex(const ListRecord<T>& record, std::size_t index) {
  if (index >= record.count) throwListRangeError(index, record.count);
  return record.list[index];
}

}  // namespace quorl
