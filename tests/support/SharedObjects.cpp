#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "support/FakePlatform.h"

namespace quorl::test {

void resetSharedObjects() {
  HardwareManager::resetShared();
  NotificationCenter::resetDefaultCenter();
}

}  // namespace quorl::test
