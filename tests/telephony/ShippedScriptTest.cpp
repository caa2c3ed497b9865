#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "hosts/simulator/TelephonySimulator.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "telephony/CarrierNameSegmentView.h"
#include "telephony/FakeStore.h"
#include "telephony/HorvaneService.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::Not;
using ::testing::Pair;

/// Stands for a phone that is made once the platform, and its virtual time, are there.
struct LatePhone final : HorvaneClientFactory {
  std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) override { return phone->initWithQueue(queue); }
  std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() override { return phone->networkInfo(); }
  std::unique_ptr<simulator::TelephonySimulator> phone;
};

/// The script that ships on a simulated phone, with the service and the carrier bar on it.
class ShippedScriptTest : public ::testing::Test {
 protected:
  ShippedScriptTest() {
    platform.properties.booleans["InternalBuild"] = true;
    late.phone = std::make_unique<simulator::TelephonySimulator>(platform.time);
    const auto script = std::filesystem::path(QUORL_SOURCE_DIR) / "resources" / "telephony" / "two-sims.jsonl";
    late.phone->play(simulator::readTelephonyScript(script).steps, *platform.mainQueue);
    service = HorvaneService::make(store);
    platform.time.settle();
  }
  ~ShippedScriptTest() override { service.reset(); }

  std::vector<std::string> titles() const {
    std::vector<std::string> result;
    for (const TabButton& tab : bar.tabButtons()) result.push_back(tab.title());
    return result;
  }

  LatePhone late;
  FakePlatform platform{&late};
  LogRecorder log;
  FakeStore store{*platform.mainQueue};
  std::shared_ptr<HorvaneViewModel> root = std::make_shared<HorvaneViewModel>();
  CarrierNameSegmentView bar{root};
  NotificationCenter::Observation updates = NotificationCenter::defaultCenter().observe(
      notification::kCarrierUpdate,
      [this](const Notification& posted) { updateFromCarrierNotification(posted, root.get()); });
  std::shared_ptr<HorvaneService> service;
};

TEST_F(ShippedScriptTest, StartFindsBothSimsTheSecondStillWithoutAName) {
  EXPECT_THAT(titles(), ElementsAre("Testnet North", ""));
  EXPECT_THAT(store.values("Cell Info"), Contains(Pair("PLMN", "1 1")));
  EXPECT_THAT(store.values("Cell Info"), Contains(Pair("kHVCellMonitorRSRP", "-104")));
  EXPECT_THAT(store.values("Active Bands"), Contains(Pair("LTE", "1,3,7,20")));
}

TEST_F(ShippedScriptTest, LateNameAppearsWithTheNextCellAndCanBeChosen) {
  platform.time.advance(5s);
  EXPECT_THAT(titles(), ElementsAre("Testnet North", "Testnet South"));
  bar.tabButtons()[1].press();
  EXPECT_EQ(HardwareManager::shared().currentSubsId(), 1);
  // The choice holds through later updates of the other slot.
  platform.time.advance(6s);
  EXPECT_EQ(HardwareManager::shared().currentSubsId(), 1);
}

TEST_F(ShippedScriptTest, RemovedSimLeavesTheBarAndComesBackAsTheFirstTab) {
  platform.time.advance(61s);
  EXPECT_THAT(titles(), ElementsAre("Testnet North"));
  platform.time.advance(30s);
  EXPECT_THAT(titles(), ElementsAre("Testnet South", "Testnet North"));
}

TEST_F(ShippedScriptTest, RunShowsEveryFailureOfTheClient) {
  platform.time.advance(100s);
  EXPECT_THAT(platform.console.lines, Contains("error occurred radio is asleep"));
  EXPECT_THAT(platform.console.lines, Contains("measurements no rsrp"));
  EXPECT_TRUE(log.has("unknown type  ---> number"));
  EXPECT_THAT(store.values("Cell Info"), Contains(Pair("PLMN", "0 0")));
  for (const auto& [attribute, value] : store.values("Cell Info"))
    EXPECT_THAT(attribute, Not(testing::AnyOf("kHVCellMonitorRSRQ", "kHVCellMonitorSectorLat",
                                              "kHVCellMonitorSectorLong", "kHVCellMonitorMCC")));
}

}  // namespace
}  // namespace quorl::test
