#include "base/Log.h"

#include <mutex>
#include <utility>

namespace quorl {
namespace log_detail {

std::atomic<bool> anySink{false};

namespace {

std::mutex& sinkMutex() {
  static std::mutex mutex;
  return mutex;
}

std::shared_ptr<LogSink>& sinkSlot() {
  static std::shared_ptr<LogSink> slot;
  return slot;
}

}  // namespace

std::shared_ptr<LogSink> currentSink() {
  const std::lock_guard lock(sinkMutex());
  return sinkSlot();
}

std::string renderLine(std::string_view format, const Argument* arguments, std::size_t count) {
  std::string line;
  std::size_t at = 0;
  std::size_t used = 0;
  while (const auto placeholder = nextPlaceholder(format, at)) {
    line.append(format, at, placeholder->begin - at);
    if (used < count) {
      line += arguments[used].render(arguments[used].value, placeholder->hexadecimal);
      ++used;
    }
    at = placeholder->end;
  }
  line.append(format, at);
  return line;
}

}  // namespace log_detail

std::shared_ptr<LogSink> installLogSink(std::shared_ptr<LogSink> sink) {
  const std::lock_guard lock(log_detail::sinkMutex());
  log_detail::anySink.store(sink != nullptr, std::memory_order_release);
  return std::exchange(log_detail::sinkSlot(), std::move(sink));
}

}  // namespace quorl
