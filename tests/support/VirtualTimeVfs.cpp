#include "support/VirtualTimeVfs.h"

#include <chrono>

#include <sqlite3.h>

namespace quorl::test {

namespace {

constexpr sqlite3_int64 kUnixEpochInJulianMs = 210866760000000;
constexpr double kMsPerDay = 86400000.0;

}  // namespace

struct VirtualTimeVfs::Shim : sqlite3_vfs {
  const Clock* clock = nullptr;
  sqlite3_vfs* previous = nullptr;

  static int currentTimeInt64(sqlite3_vfs* vfs, sqlite3_int64* time) {
    const Date now = static_cast<Shim*>(vfs)->clock->now();
    *time = kUnixEpochInJulianMs + std::chrono::floor<std::chrono::milliseconds>(now).time_since_epoch().count();
    return SQLITE_OK;
  }
  static int currentTime(sqlite3_vfs* vfs, double* days) {
    sqlite3_int64 time = 0;
    currentTimeInt64(vfs, &time);
    *days = static_cast<double>(time) / kMsPerDay;
    return SQLITE_OK;
  }
};

VirtualTimeVfs::VirtualTimeVfs(const Clock& clock) : shim_(std::make_unique<Shim>()) {
  sqlite3_vfs* const previous = sqlite3_vfs_find(nullptr);
  static_cast<sqlite3_vfs&>(*shim_) = *previous;
  shim_->pNext = nullptr;
  shim_->zName = "virtual-time";
  shim_->xCurrentTime = &Shim::currentTime;
  shim_->xCurrentTimeInt64 = &Shim::currentTimeInt64;
  shim_->clock = &clock;
  shim_->previous = previous;
  sqlite3_vfs_register(shim_.get(), 1);
}

VirtualTimeVfs::~VirtualTimeVfs() {
  sqlite3_vfs_unregister(shim_.get());
  sqlite3_vfs_register(shim_->previous, 1);
}

}  // namespace quorl::test
