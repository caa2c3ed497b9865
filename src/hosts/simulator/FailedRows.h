#pragma once

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <utility>

#include "base/Log.h"

namespace quorl::simulator {

/// Listens to the log for rows that could not be stored, which the product tells of nowhere else, and hands each line
/// on. Thread-safe.
class FailedRows final : public LogSink {
 public:
  /// `output` takes the lines; null when nobody wants to see them.
  explicit FailedRows(std::shared_ptr<LogSink> output = nullptr) : output_(std::move(output)) {}

  bool isEnabled(std::string_view category, LogLevel level) const override;
  void write(std::string_view category, LogLevel level, std::string_view text) override;

  std::uint64_t count() const { return count_.load(); }
  /// A line for the user, such as "3 rows could not be stored: database is locked", with the reason of the first.
  /// Empty if all could be.
  std::string report() const;

 private:
  const std::shared_ptr<LogSink> output_;
  std::atomic<std::uint64_t> count_{0};
  mutable std::mutex mutex_;
  std::string firstReason_;  // guarded by mutex_
};

}  // namespace quorl::simulator
