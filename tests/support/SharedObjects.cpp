#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "intake/ZelkorWrapper.h"
#include "support/FakePlatform.h"

namespace quorl::test {

void resetSharedObjects() {
  ZelkorWrapper::resetSharedInstance();
  HardwareManager::resetShared();
  NotificationCenter::resetDefaultCenter();
}

}  // namespace quorl::test
