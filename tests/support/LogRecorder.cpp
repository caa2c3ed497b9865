#include "support/LogRecorder.h"

#include <algorithm>
#include <mutex>
#include <utility>

namespace quorl::test {

void PrintTo(const LogLine& line, std::ostream* out) {
  *out << (line.level == LogLevel::Error ? "error " : "default ") << line.category << ": \"" << line.text << '"';
}

struct LogRecorder::Sink final : LogSink {
  bool isEnabled(std::string_view, LogLevel) const override { return true; }
  void write(std::string_view category, LogLevel level, std::string_view text) override {
    const std::lock_guard lock(mutex);
    lines.push_back({std::string(category), level, std::string(text)});
  }

  std::mutex mutex;
  std::vector<LogLine> lines;  // guarded by mutex
};

LogRecorder::LogRecorder() : sink_(std::make_shared<Sink>()) {
  previous_ = installLogSink(sink_);
}

LogRecorder::~LogRecorder() {
  installLogSink(std::move(previous_));
}

std::vector<LogLine> LogRecorder::lines() const {
  const std::lock_guard lock(sink_->mutex);
  return sink_->lines;
}

std::vector<std::string> LogRecorder::texts() const {
  std::vector<std::string> result;
  for (LogLine& line : lines()) result.push_back(std::move(line.text));
  return result;
}

std::vector<std::string> LogRecorder::texts(std::string_view category) const {
  std::vector<std::string> result;
  for (LogLine& line : lines())
    if (line.category == category) result.push_back(std::move(line.text));
  return result;
}

std::size_t LogRecorder::count(std::string_view text) const {
  const auto all = lines();
  return static_cast<std::size_t>(
      std::count_if(all.begin(), all.end(), [&](const LogLine& line) { return line.text == text; }));
}

bool LogRecorder::has(const LogLine& line) const {
  const auto all = lines();
  return std::find(all.begin(), all.end(), line) != all.end();
}

void LogRecorder::clear() {
  const std::lock_guard lock(sink_->mutex);
  sink_->lines.clear();
}

}  // namespace quorl::test
