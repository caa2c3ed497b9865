#include "base/NotificationCenter.h"
#include "support/FakePlatform.h"

namespace quorl::test {

void resetSharedObjects() {
  NotificationCenter::resetDefaultCenter();
}

}  // namespace quorl::test
