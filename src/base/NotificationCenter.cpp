#include "base/NotificationCenter.h"

#include <utility>

namespace quorl {
namespace {

std::unique_ptr<NotificationCenter>& defaultSlot() {
  static auto slot = std::make_unique<NotificationCenter>();
  return slot;
}

}  // namespace

NotificationCenter& NotificationCenter::defaultCenter() {
  return *defaultSlot();
}

void NotificationCenter::resetDefaultCenter() {
  defaultSlot() = std::make_unique<NotificationCenter>();
}

NotificationCenter::Observation NotificationCenter::observe(std::string_view name, Handler handler) {
  const std::lock_guard lock(mutex_);
  auto found = signals_.find(name);
  if (found == signals_.end()) found = signals_.emplace(std::string(name), std::make_shared<Signal>()).first;
  return found->second->connect(std::move(handler));
}

void NotificationCenter::post(std::string_view name, Notification::UserInfo userInfo) {
  post(Notification{std::string(name), std::make_shared<const Notification::UserInfo>(std::move(userInfo))});
}

void NotificationCenter::post(const Notification& notification) {
  std::shared_ptr<Signal> signal;
  {
    const std::lock_guard lock(mutex_);
    const auto found = signals_.find(notification.name);
    if (found == signals_.end()) return;
    signal = found->second;
  }
  (*signal)(notification);
}

}  // namespace quorl
