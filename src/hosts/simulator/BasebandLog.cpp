#include "hosts/simulator/BasebandLog.h"

#include <utility>

namespace quorl::simulator {

void BasebandLog::open() {
  const std::lock_guard lock(mutex_);
  lines_.clear();
  bytes_ = 0;
  isOpen_.store(true, std::memory_order_relaxed);
}

void BasebandLog::close() {
  isOpen_.store(false, std::memory_order_relaxed);
}

void BasebandLog::add(std::string line) {
  if (!isOpen()) return;
  line.push_back('\n');
  const std::lock_guard lock(mutex_);
  bytes_ += line.size();
  lines_.push_back(std::move(line));
  while (bytes_ > kCapacity) {
    bytes_ -= lines_.front().size();
    lines_.pop_front();
  }
}

std::string BasebandLog::take(std::size_t bytes) {
  std::string taken;
  const std::lock_guard lock(mutex_);
  while (!lines_.empty()) {
    std::string& line = lines_.front();
    if (taken.size() + line.size() > bytes) {
      if (line.size() <= bytes || !taken.empty()) break;
      bytes_ -= line.size() - bytes;
      line.resize(bytes);
    }
    bytes_ -= line.size();
    taken += line;
    lines_.pop_front();
  }
  return taken;
}

}  // namespace quorl::simulator
