#include <array>
#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/simulator/TelephonyFeed.h"
#include "hosts/simulator/network/Modem.h"
#include "simulator/network/TestScenarios.h"
#include "support/SteppedQueue.h"

namespace quorl::simulator {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;

/// A modem on a shipped scenario whose telephony service is asked as the product does.
class TelephonyFeedTest : public ::testing::Test {
 protected:
  explicit TelephonyFeedTest(const char* scenario = "city") : modem(network::shippedScenario(scenario), 4) {}

  void drive(std::chrono::milliseconds duration) {
    modem.advance(duration, [this](const network::ModemEvent& event, const network::SubscriptionState& state) {
      feed.happened(event, state);
    });
    time.settle();
  }

  /// A number of the slot's cell dictionary.
  std::optional<std::int64_t> cellNumber(HVSubscriptionSlot slot, const std::string& key) {
    std::optional<std::int64_t> result;
    client->copyCellInfo(HVServiceSubscriptionContext::initWithSlot(slot), [&](const auto& info, const auto&) {
      if (!info || !info->legacyInfo) return;
      for (const auto& [name, value] : *info->legacyInfo->front())
        if (name == key && std::holds_alternative<std::int64_t>(value)) result = std::get<std::int64_t>(value);
    });
    time.settle();
    return result;
  }

  std::optional<std::int64_t> rsrp(HVSubscriptionSlot slot) {
    std::optional<std::int64_t> result;
    const auto context = HVServiceSubscriptionContext::initWithSlot(slot);
    client->getSignalStrengthMeasurements(
        HVServiceDescriptor::descriptorWithSubscriptionContext(context),
        [&](const auto& measurements, const auto&) { result = measurements ? measurements->rsrp : std::nullopt; });
    time.settle();
    return result;
  }

  test::VirtualTime time;
  std::shared_ptr<test::SteppedQueue> main = time.makeStepped("main");
  TelephonySimulator telephony{time};
  std::unique_ptr<HorvaneClient> client = telephony.initWithQueue(*main);
  network::Modem modem;
  TelephonyFeed feed{telephony};
};

TEST_F(TelephonyFeedTest, TellsOfTheCellThatTheModemIsOn) {
  int served = 0;
  for (int i = 0; i < 40; ++i) {
    drive(30s);
    for (const std::uint8_t subscription : {std::uint8_t{0}, std::uint8_t{1}}) {
      const auto& state = modem.state(subscription);
      const HVSubscriptionSlot slot = subscription + 1;
      if (!state.serving) {
        EXPECT_FALSE(rsrp(slot));
        continue;
      }
      ++served;
      const network::Cell& cell = *state.serving->best.cell;
      EXPECT_EQ(cellNumber(slot, "kHVCellMonitorCellId"), static_cast<std::int64_t>(cell.cellId));
      EXPECT_EQ(cellNumber(slot, "kHVCellMonitorMNC"), std::int64_t{cell.plmn.mnc});
      EXPECT_EQ(cellNumber(slot, "kHVCellMonitorBandInfo"), std::int64_t{cell.band});
      EXPECT_EQ(cellNumber(slot, "kHVCellMonitorUARFCN"), std::int64_t{cell.downlinkChannel});
      EXPECT_EQ(cellNumber(slot, "kHVCellMonitorDeploymentType"), std::int64_t{state.nr ? 3 : 0});
      EXPECT_NEAR(static_cast<double>(rsrp(slot).value_or(0)), state.serving->best.power / 100.0, 0.51);
    }
  }
  EXPECT_GT(served, 0);
}

TEST_F(TelephonyFeedTest, TheCarriersBearTheNamesOfTheScenario) {
  drive(5s);
  const auto providers = telephony.networkInfo()->subscriberProviders();
  ASSERT_TRUE(providers);
  EXPECT_EQ(providers->at("0000000100000001").carrierName, "Testnet North");
  EXPECT_EQ(providers->at("0000000100000002").carrierName, "Testnet South");
}

TEST_F(TelephonyFeedTest, BandsInUseAreThoseOfTheCarriersInUse) {
  bool hasSeenAggregation = false;
  for (int i = 0; i < 300; ++i) {
    drive(1s);
    const auto& state = modem.state(0);
    std::optional<HVError> error;
    const auto bands = client->getBandInfo(HVServiceSubscriptionContext::initWithSlot(1), error);
    ASSERT_TRUE(bands && bands->supportedBands);
    if (!state.serving) continue;
    ASSERT_TRUE(bands->activeBands);
    EXPECT_EQ(bands->activeBands->front().second.size(), state.carriers.size() + 1);
    EXPECT_EQ(bands->activeBands->front().second.front(), state.serving->best.cell->band);
    EXPECT_EQ(bands->activeBands->size(), state.nr ? 2U : 1U);
    hasSeenAggregation = hasSeenAggregation || (!state.carriers.empty() && state.nr);
  }
  EXPECT_TRUE(hasSeenAggregation);
}

/// Keeps what the client tells of, the first two by SIM.
struct Heard final : HorvaneClientDelegate {
  void cellMonitorUpdate(const HVServiceSubscriptionContext& context, const HVCellInfo&) override {
    ++updates[static_cast<std::size_t>(context.slotID() - 1)];
    isPresent[static_cast<std::size_t>(context.slotID() - 1)] = context.isSimPresent();
  }
  void connectionStateChanged(const HVServiceSubscriptionContext& context, HVDataConnectionType connection,
                              HVDataConnectionStatus status) override {
    if (context.slotID() == 1 && connection == HVDataConnectionType::Internet) internet.push_back(status);
  }
  std::array<int, 2> updates{};
  std::array<bool, 2> isPresent{};
  std::vector<HVDataConnectionStatus> internet;
};

class WalkWithTwoSimsTest : public TelephonyFeedTest {
 protected:
  WalkWithTwoSimsTest() : TelephonyFeedTest("dual-sim") { client->setDelegate(heard); }
  std::shared_ptr<Heard> heard = std::make_shared<Heard>();
};

TEST_F(WalkWithTwoSimsTest, ASimThatGoesIsToldOf) {
  drive(7min);
  EXPECT_THAT(heard->isPresent, ElementsAre(true, true));
  drive(90s);  // out at 8:00
  EXPECT_THAT(heard->isPresent, ElementsAre(true, false));
  EXPECT_FALSE(rsrp(2));
  drive(2min);  // in again at 10:00
  EXPECT_THAT(heard->isPresent, ElementsAre(true, true));
  EXPECT_TRUE(rsrp(2));
}

TEST_F(WalkWithTwoSimsTest, TheDataConnectionIsToldOf) {
  drive(1min);
  EXPECT_THAT(heard->internet, ElementsAre(HVDataConnectionStatus::Connected));
}

TEST_F(WalkWithTwoSimsTest, TheCellIsToldAgainWhileItStaysTheSame) {
  drive(5min);
  EXPECT_GE(heard->updates[0], 10);
}

}  // namespace
}  // namespace quorl::simulator
