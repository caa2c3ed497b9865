#include "app/ApplicationLoop.h"

#include "base/NotificationCenter.h"
#include "shell/NotificationNames.h"

namespace quorl {

void ApplicationLoop::launch() {
  application_.onLaunch();
  becomeActive();
}

void ApplicationLoop::becomeActive() {
  application_.onBecomeActive();
  NotificationCenter::defaultCenter().post(notification::kDidBecomeActive);
}

void ApplicationLoop::terminate() {
  application_.onTerminate();
  NotificationCenter::defaultCenter().post(notification::kWillTerminate);
}

}  // namespace quorl
