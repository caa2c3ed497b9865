#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

namespace quorl {

/// An immutable run of bytes, shared by reference: copying costs one atomic increment, or nothing for literals.
///
/// Owned bytes live in one heap block with their reference count; `fromLiteral` refers to storage of static duration
/// and never allocates. Holds at most 4 GiB - 1. Copies may be used on several threads at once; one object may not.
class SharedBytes {
 public:
  SharedBytes() noexcept = default;
  /// Copies `bytes` into a new block; an empty view allocates nothing.
  explicit SharedBytes(std::string_view bytes);
  SharedBytes(const SharedBytes& other) noexcept : data_(other.data_), size_(other.size_), owned_(other.owned_) {
    if (owned_) header()->references.fetch_add(1, std::memory_order_relaxed);
  }
  SharedBytes(SharedBytes&& other) noexcept
      : data_(std::exchange(other.data_, "")),
        size_(std::exchange(other.size_, 0)),
        owned_(std::exchange(other.owned_, false)) {}
  SharedBytes& operator=(SharedBytes other) noexcept {
    swap(other);
    return *this;
  }
  ~SharedBytes() { release(); }

  /// `literal` must outlive every copy: string literals and generated constant tables.
  static SharedBytes fromLiteral(std::string_view literal) noexcept {
    SharedBytes result;
    result.data_ = literal.data();
    result.size_ = static_cast<std::uint32_t>(literal.size());
    return result;
  }

  const char* data() const noexcept { return data_; }
  std::size_t size() const noexcept { return size_; }
  bool empty() const noexcept { return size_ == 0; }
  std::string_view view() const noexcept { return {data_, size_}; }

  void swap(SharedBytes& other) noexcept {
    std::swap(data_, other.data_);
    std::swap(size_, other.size_);
    std::swap(owned_, other.owned_);
  }

  friend bool operator==(const SharedBytes& a, const SharedBytes& b) noexcept { return a.view() == b.view(); }

 private:
  struct Header {
    std::atomic<std::uint32_t> references;
  };

  Header* header() const noexcept;
  void release() noexcept {
    if (owned_ && header()->references.fetch_sub(1, std::memory_order_acq_rel) == 1) destroy();
  }
  void destroy() noexcept;

  const char* data_ = "";
  std::uint32_t size_ = 0;
  bool owned_ = false;
};

/// UTF-8 text with the sharing of `SharedBytes`.
class Text : public SharedBytes {
 public:
  Text() noexcept = default;
  explicit Text(std::string_view text) : SharedBytes(text) {}
  static Text fromLiteral(std::string_view literal) noexcept { return Text(SharedBytes::fromLiteral(literal)); }
  std::string string() const { return std::string(view()); }
  friend bool operator==(const Text& a, const Text& b) noexcept { return a.view() == b.view(); }
  friend bool operator==(const Text& a, std::string_view b) noexcept { return a.view() == b; }

 private:
  explicit Text(SharedBytes bytes) noexcept : SharedBytes(std::move(bytes)) {}
};

/// Uninterpreted bytes, such as a payload, with the sharing of `SharedBytes`.
class ByteString : public SharedBytes {
 public:
  ByteString() noexcept = default;
  explicit ByteString(std::string_view bytes) : SharedBytes(bytes) {}
  friend bool operator==(const ByteString& a, const ByteString& b) noexcept { return a.view() == b.view(); }
};

}  // namespace quorl
