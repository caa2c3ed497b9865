#pragma once

#include <map>
#include <memory>
#include <mutex>
#include <string>

#include <spdlog/logger.h>
#include <spdlog/sinks/sink.h>

#include "base/Log.h"

namespace quorl {

/// Carries the log through spdlog: one spdlog logger for each category, made on the category's first line, once.
class SpdlogSink final : public LogSink {
 public:
  /// `subsystem` begins every logger's name. `minimum` silences what is below it.
  SpdlogSink(std::string subsystem, std::shared_ptr<spdlog::sinks::sink> output, LogLevel minimum = LogLevel::Default);

  bool isEnabled(std::string_view category, LogLevel level) const override;
  void write(std::string_view category, LogLevel level, std::string_view text) override;

 private:
  std::shared_ptr<spdlog::logger> loggerFor(std::string_view category);

  const std::string subsystem_;
  const std::shared_ptr<spdlog::sinks::sink> output_;
  const LogLevel minimum_;
  std::mutex mutex_;
  std::map<std::string, std::shared_ptr<spdlog::logger>, std::less<>> loggers_;  // guarded by mutex_
};

}  // namespace quorl
