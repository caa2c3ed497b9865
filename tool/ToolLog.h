#pragma once

#include <atomic>
#include <cstdint>
#include <memory>

#include "base/Log.h"

namespace quorl::tool {

/// Where the log of a tool run goes: to standard error when the user wants to see it, else nowhere. Beside that it
/// counts the inserts that failed, which the product tells of nowhere but here.
class ToolLog final : public LogSink {
 public:
  /// Installs a new one. `isVerbose` shows all lines.
  static std::shared_ptr<ToolLog> install(bool isVerbose);

  explicit ToolLog(std::shared_ptr<LogSink> output) : output_(std::move(output)) {}

  bool isEnabled(std::string_view category, LogLevel level) const override;
  void write(std::string_view category, LogLevel level, std::string_view text) override;

  std::uint64_t failedInserts() const { return failedInserts_.load(); }

 private:
  const std::shared_ptr<LogSink> output_;  // null when nobody wants to see the log
  std::atomic<std::uint64_t> failedInserts_{0};
};

}  // namespace quorl::tool
