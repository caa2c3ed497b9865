#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "messages/MetricCodable.h"

namespace quorl {

/// A shared reference to a message, or none. The class-blind base of `MessageRef`, which the engine works with.
class AnyMessageRef {
 public:
  AnyMessageRef() noexcept = default;
  AnyMessageRef(const AnyMessageRef& other) noexcept : message_(other.message_) {
    if (message_ != nullptr) message_->references_.fetch_add(1, std::memory_order_relaxed);
  }
  AnyMessageRef(AnyMessageRef&& other) noexcept : message_(std::exchange(other.message_, nullptr)) {}
  AnyMessageRef& operator=(AnyMessageRef other) noexcept {
    std::swap(message_, other.message_);
    return *this;
  }
  ~AnyMessageRef() {
    if (message_ != nullptr) release();
  }

  /// Takes over a message that nobody refers to.
  explicit AnyMessageRef(std::unique_ptr<MetricCodable> message) noexcept : message_(message.release()) {
    if (message_ != nullptr) message_->references_.store(1, std::memory_order_relaxed);
  }

  MetricCodable* message() const { return message_; }
  explicit operator bool() const { return message_ != nullptr; }
  friend bool operator==(const AnyMessageRef&, const AnyMessageRef&) = default;  // the same object

 private:
  void release() noexcept {
    // The last reference needs no atomic decrement: nobody else can see the message any more.
    if (message_->references_.load(std::memory_order_acquire) == 1 ||
        message_->references_.fetch_sub(1, std::memory_order_acq_rel) == 1)
      delete message_;
  }

  MetricCodable* message_ = nullptr;
};

/// A shared reference to a message of class `T`, or none. Copies share the message.
template <typename T>
class MessageRef : public AnyMessageRef {
 public:
  MessageRef() noexcept = default;
  MessageRef(std::nullptr_t) noexcept {}
  explicit MessageRef(std::unique_ptr<T> message) noexcept : AnyMessageRef(std::move(message)) {}

  /// Null if there is none.
  T* get() const { return static_cast<T*>(message()); }
  T& operator*() const { return *get(); }
  T* operator->() const { return get(); }

 private:
  template <typename>
  friend class MessageArray;
  explicit MessageRef(AnyMessageRef element) noexcept : AnyMessageRef(std::move(element)) {}
};

/// A new empty message of class `T`.
template <typename T>
MessageRef<T> makeMessageRef() {
  return MessageRef<T>(std::make_unique<T>());
}

/// A growable array of shared messages, or none until the first `add`. The class-blind base of `MessageArray`.
class AnyMessageArray {
 public:
  /// Whether there is an array, be it empty.
  bool isSet() const { return elements_.has_value(); }
  std::size_t count() const { return elements_ ? elements_->size() : 0; }
  const AnyMessageRef& elementAtIndex(std::size_t index) const;
  /// Answers the message that was added. A null reference throws std::invalid_argument.
  MetricCodable& addElement(AnyMessageRef element);
  /// Removes all elements; the array stays.
  void clear() {
    if (elements_) elements_->clear();
  }

 private:
  std::optional<std::vector<AnyMessageRef>> elements_;
};

/// The array of a repeated message field of class `T`. Copies share the messages.
template <typename T>
class MessageArray : public AnyMessageArray {
 public:
  void add(MessageRef<T> element) { addElement(std::move(element)); }
  /// An index past the end throws std::out_of_range.
  MessageRef<T> atIndex(std::size_t index) const { return MessageRef<T>(elementAtIndex(index)); }
};

}  // namespace quorl
