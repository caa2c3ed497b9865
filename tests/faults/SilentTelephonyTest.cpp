#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "faults/BreakablePhone.h"
#include "store/PersistanceStore.h"
#include "telephony/FakeTelephony.h"

namespace quorl::test {
namespace {

using std::chrono::minutes;
using std::chrono::seconds;

/// A telephony service whose answers wait until a test lets them go.
class SilentTelephonyTest : public testing::Test {
 protected:
  SilentTelephonyTest() {
    worker = phone.host.time.makeStepped("telephony");
    telephony.worker = worker;
    telephony.subscriptions.emplace().subscriptions.emplace();
    telephony.subscriptions->subscriptions->emplace_back(1, true);
    telephony.providers->emplace("0000000100000001", HVCarrier{"North"});
    HVCellInfo cell;
    cell.legacyInfo.emplace().emplace_back(HVCellDictionary{{"kHVCellMonitorTAC", std::int64_t{101}}});
    telephony.slots[1].cell = std::move(cell);
    telephony.slots[1].measurements = HVSignalStrengthMeasurements{-91, "rsrp -91"};
    worker->setHanging(true);
  }

  std::size_t cellRows() {
    return RawDatabase(phone.file()).run("SELECT Id FROM Metric WHERE metric_name = 'Cell Info'").size();
  }

  FakeTelephony telephony;
  BreakablePhone phone{&telephony};
  std::shared_ptr<SteppedQueue> worker;
};

TEST_F(SilentTelephonyTest, AnswersThatNeverComeHoldUpNothingElse) {
  phone.launch();
  phone.showsDashboard();
  const std::size_t before = phone.storedRows();
  std::size_t ticks = 0;
  const Connection connection = phone.screens().dashboardViewController()->onLastRefreshed([&ticks] { ++ticks; });
  for (int i = 0; i < 60; ++i) {
    phone.metricsArrive(1);
    phone.becomesActive();
    phone.passes(minutes(1));
  }
  EXPECT_EQ(phone.storedRows(), before + 60 * kRowsOfNasEvent);
  EXPECT_GE(ticks, 60U * 4);
  EXPECT_EQ(cellRows(), 0U);
  EXPECT_EQ(HardwareManager::shared().currentSubsId(), 0);
}

TEST_F(SilentTelephonyTest, AnswersThatComeAnHourLateCountAsIfTheyWereNew) {
  phone.launch();
  for (int i = 0; i < 60; ++i) {
    phone.passes(minutes(1));
    phone.becomesActive();
  }
  const std::size_t asked = worker->waiting();
  EXPECT_EQ(cellRows(), 0U);
  worker->setHanging(false);
  phone.host.time.settle();
  EXPECT_GT(cellRows(), 0U);
  EXPECT_EQ(worker->waiting(), 0U);
  // The start and sixty activations ask for a cell and for its signal each; nothing asks twice.
  EXPECT_EQ(asked, 61U * 2);
}

TEST_F(SilentTelephonyTest, AnswersThatComeWhenTheProductIsGoneComeToNothing) {
  phone.launch();
  phone.ends();
  worker->setHanging(false);
  phone.host.time.settle();
  EXPECT_EQ(cellRows(), 0U);
}

TEST(NoTelephony, AServiceThatAnswersNothingAtAllLeavesTheMetricsAlone) {
  BreakablePhone phone;
  phone.launch();
  for (int i = 0; i < 20; ++i) {
    phone.metricsArrive(2);
    phone.becomesActive();
    phone.passes(seconds(30));
  }
  EXPECT_EQ(phone.storedRows(), 40 * kRowsOfNasEvent);
  EXPECT_EQ(phone.lostRows(), 0U);
}

}  // namespace
}  // namespace quorl::test
