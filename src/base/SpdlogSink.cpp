#include "base/SpdlogSink.h"

#include <utility>

namespace quorl {

SpdlogSink::SpdlogSink(std::string subsystem, std::shared_ptr<spdlog::sinks::sink> output, LogLevel minimum)
    : subsystem_(std::move(subsystem)), output_(std::move(output)), minimum_(minimum) {}

bool SpdlogSink::isEnabled(std::string_view /*category*/, LogLevel level) const {
  return level >= minimum_;
}

void SpdlogSink::write(std::string_view category, LogLevel level, std::string_view text) {
  loggerFor(category)->log(level == LogLevel::Error ? spdlog::level::err : spdlog::level::info,
                           spdlog::string_view_t(text.data(), text.size()));
}

std::shared_ptr<spdlog::logger> SpdlogSink::loggerFor(std::string_view category) {
  const std::lock_guard lock(mutex_);
  const auto found = loggers_.find(category);
  if (found != loggers_.end()) return found->second;
  std::string name = category.empty() ? subsystem_ : subsystem_ + ":" + std::string(category);
  auto logger = std::make_shared<spdlog::logger>(std::move(name), output_);
  loggers_.emplace(std::string(category), logger);
  return logger;
}

}  // namespace quorl
