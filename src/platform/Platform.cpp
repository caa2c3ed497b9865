#include "platform/Platform.h"

#include <atomic>

#include "base/FatalStop.h"

namespace quorl {
namespace {

std::atomic<Platform*> installed{nullptr};

}  // namespace

void Platform::install(Platform* platform) {
  installed.store(platform, std::memory_order_release);
}

Platform& Platform::current() {
  Platform* platform = installed.load(std::memory_order_acquire);
  if (platform == nullptr) fatalStop("no platform installed");
  return *platform;
}

}  // namespace quorl
