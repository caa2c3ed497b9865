#pragma once

#include <deque>
#include <string_view>
#include <vector>

#include "base/Clock.h"

namespace quorl {

/// The course of a value over today, as far as it has been on show. Asks the store for nothing. Main thread.
class ReadingTrace {
 public:
  /// More readings push out the oldest.
  static constexpr std::size_t kMostReadings = 60;

  /// Adds a reading, unless it is the one that was added last. Readings of days before it go. A value that is no
  /// number, with a unit or without, ends the trace and starts a new one.
  void add(Date time, std::string_view value);

  /// The readings in order, from 0 for the least to 1 for the greatest; 0.5 for all where these are equal. Empty for
  /// fewer than two readings.
  std::vector<double> heights() const;

 private:
  struct Reading {
    Date time;
    double value;
  };
  std::deque<Reading> readings_;
};

}  // namespace quorl
