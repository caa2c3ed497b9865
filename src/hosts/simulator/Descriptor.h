#pragma once

#include <utility>

#include <unistd.h>

namespace quorl::simulator {

/// An open file of the system, closed when this goes away; or none.
class Descriptor {
 public:
  /// Below 0 for none.
  explicit Descriptor(int number = -1) : number_(number) {}
  Descriptor(Descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(number_, other.number_);
    return *this;
  }
  ~Descriptor() {
    if (isOpen()) ::close(number_);
  }

  bool isOpen() const { return number_ >= 0; }
  int number() const { return number_; }

 private:
  int number_;
};

}  // namespace quorl::simulator
