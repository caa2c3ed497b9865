#pragma once

#include <any>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>

#include "base/Signal.h"

namespace quorl {

/// What an observer receives. A notification without user info differs from one with an empty one.
struct Notification {
  using UserInfo = std::map<std::string, std::any, std::less<>>;

  std::string name;
  std::shared_ptr<const UserInfo> userInfo;  // null: none

  /// The user info's entry `key` as a `T`, or null when there is no user info, no entry, or one of another type.
  template <typename T>
  const T* entry(std::string_view key) const {
    if (!userInfo) return nullptr;
    const auto found = userInfo->find(key);
    return found == userInfo->end() ? nullptr : std::any_cast<T>(&found->second);
  }
};

/// Delivers notifications by name to whoever observes. Thread-safe.
class NotificationCenter {
 public:
  using Handler = std::function<void(const Notification&)>;
  using Observation = Connection;

  /// The process-wide centre.
  static NotificationCenter& defaultCenter();
  /// Forgets all observers of the process-wide centre; for tests, between cases.
  static void resetDefaultCenter();

  /// `handler` runs on the poster's thread, inside `post`, in the order of observation.
  [[nodiscard]] Observation observe(std::string_view name, Handler handler);
  void post(std::string_view name) { post(Notification{std::string(name), nullptr}); }
  void post(std::string_view name, Notification::UserInfo userInfo);
  void post(const Notification& notification);

 private:
  using Observers = Signal<const Notification&>;
  std::mutex mutex_;
  std::map<std::string, std::shared_ptr<Observers>, std::less<>> observers_;  // guarded by mutex_
};

}  // namespace quorl
