#include "base/SharedBytes.h"

#include <cstring>
#include <limits>
#include <new>
#include <stdexcept>

namespace quorl {

SharedBytes::SharedBytes(std::string_view bytes) {
  if (bytes.empty()) return;
  if (bytes.size() > std::numeric_limits<std::uint32_t>::max()) throw std::length_error("SharedBytes: over 4 GiB");
  void* block = ::operator new(sizeof(Header) + bytes.size());
  new (block) Header{1};
  char* data = static_cast<char*>(block) + sizeof(Header);
  std::memcpy(data, bytes.data(), bytes.size());
  data_ = data;
  size_ = static_cast<std::uint32_t>(bytes.size());
  owned_ = true;
}

SharedBytes::Header* SharedBytes::header() const noexcept {
  return reinterpret_cast<Header*>(const_cast<char*>(data_) - sizeof(Header));
}

void SharedBytes::destroy() noexcept {
  Header* block = header();
  block->~Header();
  ::operator delete(block);
}

}  // namespace quorl
