#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <random>

#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include "faults/BreakablePhone.h"
#include "support/FileSizeLimit.h"

namespace quorl::test {
namespace {

/// The disk under SQLite: files cannot grow by more than its room. What is written over what is there goes through, and
/// a write that has room for a part is cut, as the system does it.
class Disk {
 public:
  Disk() { replace(reinterpret_cast<sqlite3_syscall_ptr>(&write)); }
  ~Disk() { replace(nullptr); }
  Disk(const Disk&) = delete;
  Disk& operator=(const Disk&) = delete;

  static void hasRoom(off_t bytes) { room = bytes; }
  static void isWide() { room = kWide; }

 private:
  static constexpr off_t kWide = off_t{1} << 50;

  static void replace(sqlite3_syscall_ptr call) {
    sqlite3_vfs* const vfs = sqlite3_vfs_find("unix");
    for (const char* name : {"pwrite", "pwrite64"}) vfs->xSetSystemCall(vfs, name, call);
    isWide();
  }

  static ssize_t write(int file, const void* data, std::size_t count, off_t at) {
    struct stat status {};
    if (fstat(file, &status) != 0) return -1;
    const off_t growth = std::max<off_t>(0, at + static_cast<off_t>(count) - status.st_size);
    if (growth > room) {
      const off_t part = static_cast<off_t>(count) - (growth - room);
      if (part <= 0) {
        errno = ENOSPC;
        return -1;
      }
      count = static_cast<std::size_t>(part);
    }
    room -= std::min(growth, room);
    return ::pwrite(file, data, count, at);
  }

  static inline off_t room = kWide;
};

TEST(FullDisk, CostsTheRowsOfThatTimeAloneAndIsTold) {
  Disk disk;
  BreakablePhone phone;
  phone.launch();
  phone.metricsArrive(10);
  std::mt19937 random(20260105);
  for (int round = 0; round < 40; ++round) {
    const std::size_t reported = phone.reportedRows;
    const std::size_t lost = phone.lostRows();
    Disk::hasRoom(static_cast<off_t>(random() % 40'000));
    phone.metricsArrive(20);
    EXPECT_EQ(phone.reportedRows - reported + phone.lostRows() - lost, 20 * kRowsOfNasEvent) << "no row is kept quiet";

    Disk::isWide();
    const std::size_t lostOfFullDisk = phone.lostRows();
    phone.metricsArrive(3);
    EXPECT_EQ(phone.lostRows(), lostOfFullDisk) << "after room was made in round " << round;
    EXPECT_EQ(phone.storedRows(), phone.reportedRows);
  }
  EXPECT_GT(phone.lostRows(), 0U);
  EXPECT_EQ(phone.errors->count("error occurred while inserting  ---> Optional(Prepare(message: \"database or disk is "
                                "full\"))"),
            phone.lostRows());
  EXPECT_EQ(phone.integrity(), "ok");
  figure("rows stored", phone.reportedRows);
  figure("rows lost, each told", phone.lostRows());
  phone.ends();
  phone.launch();
  EXPECT_EQ(phone.storedRows(), phone.reportedRows) << "after a restart";
}

TEST(FullDisk, ScreensGoOnReading) {
  Disk disk;
  BreakablePhone phone;
  phone.launch();
  phone.metricsArrive(3);
  phone.screens().menuBarDidSelectItemAt(1);
  Disk::hasRoom(0);
  phone.metricsArrive(60);
  EXPECT_EQ(phone.storedRows(), phone.reportedRows);
  const auto& list = phone.screens().firstLevelViewController();
  ASSERT_EQ(list->table().size(), 2U);
  EXPECT_EQ(list->table()[1].metricTech, "LTE");
}

TEST(FullDisk, AtTheFirstStartLeavesAProgramThatRunsOnAndAFileThatTheNextStartCanUse) {
  Disk disk;
  BreakablePhone phone;
  Disk::hasRoom(0);
  phone.launch();
  EXPECT_EQ(phone.errors->countContaining("error ocurred while creating a table"), 2U);
  phone.metricsArrive(20);
  EXPECT_EQ(phone.lostRows(), 20 * kRowsOfNasEvent);
  Disk::isWide();
  phone.ends();

  phone.errors->clear();
  phone.launch();
  phone.metricsArrive(20);
  EXPECT_EQ(phone.lostRows(), 0U);
  EXPECT_EQ(phone.storedRows(), 20 * kRowsOfNasEvent);
}

/// The system's own limit, for which no write is looked at.
TEST(FullDisk, FilesThatMayNotGrowAnyMoreCostRowsAndNothingElse) {
  BreakablePhone phone;
  phone.launch();
  phone.metricsArrive(10);
  {
    const FileSizeLimit limit(200'000);
    phone.metricsArrive(40);
  }
  EXPECT_GT(phone.lostRows(), 0U);
  EXPECT_EQ(phone.errors->countContaining("disk I/O error"), phone.lostRows());
  const std::size_t lost = phone.lostRows();
  phone.metricsArrive(10);
  EXPECT_EQ(phone.lostRows(), lost);
  EXPECT_EQ(phone.storedRows(), phone.reportedRows);
  EXPECT_EQ(phone.integrity(), "ok");
}

}  // namespace
}  // namespace quorl::test
