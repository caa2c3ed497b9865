#pragma once

#include <functional>

#include "app/ApplicationLoop.h"
#include "hosts/simulator/SimulatedPhone.h"

namespace quorl::tool {

/// One run of the product on a simulated phone, from launch to end. The product has no tear-down: a process has one run
/// at most, and what it makes lives until the process ends. Main thread.
class ProductRun {
 public:
  /// Makes the product. `phone` must live until the process ends.
  explicit ProductRun(simulator::SimulatedPhone& phone);

  /// Launches it, and waits until it is at rest. `before` makes the phone what it is found as.
  void launch(const std::function<void()>& before);
  /// Terminates it, waits until it is at rest, and ends its log. `last` is asked for behind the termination.
  void terminate(const std::function<void()>& last = {});

 private:
  simulator::SimulatedPhone& phone_;
  ApplicationLoop lifecycle_;
};

}  // namespace quorl::tool
