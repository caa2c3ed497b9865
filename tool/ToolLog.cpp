#include "ToolLog.h"

#include <string_view>

#include <spdlog/sinks/ansicolor_sink.h>

#include "base/SpdlogSink.h"
#include "shell/LogCategories.h"

namespace quorl::tool {
namespace {

constexpr std::string_view kFailedInsert = "error occurred while inserting";

bool tellsOfInserts(std::string_view category, LogLevel level) {
  return level == LogLevel::Error &&
         (category == log_category::kMetricService || category == log_category::kHorvaneService);
}

}  // namespace

std::shared_ptr<ToolLog> ToolLog::install(bool isVerbose) {
  std::shared_ptr<LogSink> output;
  if (isVerbose) {
    output = std::make_shared<SpdlogSink>(log_category::kFallbackSubsystem,
                                          std::make_shared<spdlog::sinks::ansicolor_stderr_sink_mt>());
  }
  auto log = std::make_shared<ToolLog>(std::move(output));
  installLogSink(log);
  return log;
}

bool ToolLog::isEnabled(std::string_view category, LogLevel level) const {
  return tellsOfInserts(category, level) || (output_ && output_->isEnabled(category, level));
}

void ToolLog::write(std::string_view category, LogLevel level, std::string_view text) {
  if (tellsOfInserts(category, level) && text.starts_with(kFailedInsert)) ++failedInserts_;
  if (output_) output_->write(category, level, text);
}

}  // namespace quorl::tool
