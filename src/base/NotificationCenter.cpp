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
  auto found = observers_.find(name);
  if (found == observers_.end()) found = observers_.emplace(std::string(name), std::make_shared<Observers>()).first;
  return found->second->connect(std::move(handler));
}

void NotificationCenter::post(std::string_view name, Notification::UserInfo userInfo) {
  post(Notification{std::string(name), std::make_shared<const Notification::UserInfo>(std::move(userInfo))});
}

void NotificationCenter::post(const Notification& notification) {
  std::shared_ptr<Observers> observers;
  {
    const std::lock_guard lock(mutex_);
    const auto found = observers_.find(notification.name);
    if (found == observers_.end()) return;
    observers = found->second;
  }
  (*observers)(notification);
}

}  // namespace quorl
