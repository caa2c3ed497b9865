#include "shell/Toast.h"

#include <chrono>

#include "platform/Platform.h"

namespace quorl {

void Toast::show() {
  isShowing_->set(true);
  Platform::current().mainQueue.asyncAfter(std::chrono::seconds(1),
                                           [weak = std::weak_ptr<Published<bool>>(isShowing_)] {
                                             if (const auto isShowing = weak.lock()) isShowing->set(false);
                                           });
}

}  // namespace quorl
