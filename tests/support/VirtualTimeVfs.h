#pragma once

#include <memory>

#include "base/Clock.h"

namespace quorl::test {

/// Makes SQLite's 'now' the time of a clock, for connections opened while this lives, none of which may outlive it. All
/// else is the platform's own file system.
class VirtualTimeVfs {
 public:
  explicit VirtualTimeVfs(const Clock& clock);
  ~VirtualTimeVfs();
  VirtualTimeVfs(const VirtualTimeVfs&) = delete;
  VirtualTimeVfs& operator=(const VirtualTimeVfs&) = delete;

 private:
  struct Shim;
  std::unique_ptr<Shim> shim_;
};

}  // namespace quorl::test
