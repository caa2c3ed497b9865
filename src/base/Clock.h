#pragma once

#include <chrono>

namespace quorl {

/// A point of wall-clock time. Microseconds are finer than anything stored or shown.
using Date = std::chrono::time_point<std::chrono::system_clock, std::chrono::microseconds>;

/// Where "now" comes from. Thread-safe. Tests install one that they advance by hand.
class Clock {
 public:
  virtual ~Clock() = default;
  /// Wall-clock time; may jump when the system's clock is set.
  virtual Date now() const = 0;
};

class SystemClock final : public Clock {
 public:
  Date now() const override {
    return std::chrono::time_point_cast<std::chrono::microseconds>(std::chrono::system_clock::now());
  }
};

}  // namespace quorl
