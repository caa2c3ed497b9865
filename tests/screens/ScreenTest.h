#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/NotificationCenter.h"
#include "store/PersistanceStore.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl::test {

class RawDatabase;

/// A phone in UTC and American English, 2026-01-05 09:30:12, a Monday, with the product's own store on a database file
/// of its own.
class ScreenTest : public ::testing::Test {
 protected:
  ScreenTest();
  ~ScreenTest() override;

  // The device. To be told before the launch.
  void isMav() { platform.properties.texts["BasebandChipset"] = "mav23"; }
  void isIce() { platform.properties.texts["BasebandChipset"] = "ice19"; }
  void isInternalBuild() { platform.properties.booleans["InternalBuild"] = true; }
  void isCarrierBuild() { platform.properties.booleans["CarrierInstallCapability"] = true; }
  /// The virtual clock follows SQLite's, which knows nothing of it: for limits that a statement works out itself.
  void livesNow();

  /// Makes the store, with its tables, and forgets what was logged meanwhile.
  void launch();
  /// The process ends and starts again on the same file.
  void relaunch();

  // What happens.
  void settle() { platform.time.settle(); }
  void pass(std::chrono::nanoseconds duration) { platform.time.advance(duration); }
  Date now() const { return platform.time.now(); }
  /// A reading taken now, for `subsId`.
  Metric reading(std::string metricTech, std::string metricName, std::string attributeName, std::string value,
                 std::int32_t subsId = 0) const;
  /// Writes a row, and runs everything that waits.
  void stored(const Metric& metric);
  /// The same as from the channel: the row is announced once it is written.
  void arrives(const Metric& metric);
  /// Announces a row without writing it.
  void announced(const Metric& metric);
  void pinned(const std::string& metricTech, const std::string& metricName, const std::string& attributeName,
              std::int32_t subsId = 0);
  /// Two readings on the dashboard, "power" and "band" of subscription 0: the fewest that count.
  void hasADashboard();
  /// The user chooses a subscription.
  void chooses(std::int32_t subsId);

  /// The queue on which the store's statements run.
  SteppedQueue& databaseQueue();

  /// The store's own connection drops a table: statements that name it no longer prepare.
  void loses(const std::string& table);

  // The file, through another connection.
  void sql(const std::string& text);
  std::int64_t number(const std::string& query);
  /// Every statement that writes fails in its step while the answer lives.
  std::shared_ptr<RawDatabase> lockDatabase();

  ScopedTimeZone zone_{"UTC"};
  ScopedLocale locale_{"en_US"};

 public:
  FakePlatform platform;
  LogRecorder log;
  std::shared_ptr<PersistanceStore> store;
};

/// Counts the notifications of a name that are posted while it lives.
class PostCounter {
 public:
  explicit PostCounter(std::string_view name)
      : observation_(NotificationCenter::defaultCenter().observe(name, [this](const Notification&) { ++count_; })) {}
  PostCounter(const PostCounter&) = delete;
  PostCounter& operator=(const PostCounter&) = delete;

  int count() const { return count_; }

 private:
  int count_ = 0;
  const NotificationCenter::Observation observation_;
};

inline LogLine line(std::string category, std::string text) {
  return {std::move(category), LogLevel::Default, std::move(text)};
}
inline LogLine errorLine(std::string category, std::string text) {
  return {std::move(category), LogLevel::Error, std::move(text)};
}

}  // namespace quorl::test
