#include "ProductRun.h"

#include "app/AppDelegate.h"
#include "base/Log.h"

namespace quorl::tool {
namespace {

AppDelegate& application() {
  static auto* delegate = new AppDelegate;
  return *delegate;
}

}  // namespace

ProductRun::ProductRun(simulator::SimulatedPhone& phone) : phone_(phone), lifecycle_(application()) {}

void ProductRun::launch(const std::function<void()>& before) {
  before();
  phone_.runUntilAtRest();
  lifecycle_.launch();
  phone_.runUntilAtRest();
}

void ProductRun::terminate(const std::function<void()>& last) {
  lifecycle_.terminate();
  if (last) last();
  phone_.runUntilAtRest();
  installLogSink(nullptr);
}

}  // namespace quorl::tool
