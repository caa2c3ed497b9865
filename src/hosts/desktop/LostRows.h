#pragma once

#include <memory>
#include <mutex>
#include <string_view>
#include <utility>

#include "base/Log.h"
#include "hosts/simulator/FailedRows.h"

namespace quorl::desktop {

/// Tells the user of rows that could not be stored: of the first at once, as the window shows nothing of it and may be
/// open for hours. Hands each line of the log on. Thread-safe.
class LostRows final : public LogSink {
 public:
  /// `output` takes the lines; null when nobody wants to see them.
  explicit LostRows(std::shared_ptr<LogSink> output) : rows_(std::move(output)) {}

  bool isEnabled(std::string_view category, LogLevel level) const override;
  void write(std::string_view category, LogLevel level, std::string_view text) override;

  /// Tells how many there were, unless that has been told with the first. Answers whether there were any.
  bool tellAll() const;

 private:
  simulator::FailedRows rows_;
  std::once_flag first_;
};

}  // namespace quorl::desktop
