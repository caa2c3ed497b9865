#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/simulator/TelephonySimulator.h"
#include "support/SteppedQueue.h"

namespace quorl::simulator {
namespace {

namespace event = telephony_event;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

HVCellInfo cellOf(HVCellDictionary dictionary) {
  HVCellInfo info;
  info.legacyInfo.emplace().emplace_back(std::move(dictionary));
  return info;
}

/// Keeps what the client tells it, and whether it came on the client's queue.
struct Listener final : HorvaneClientDelegate {
  void cellMonitorUpdate(const HVServiceSubscriptionContext& context, const HVCellInfo& info) override {
    const bool hasCell = info.legacyInfo.has_value();
    told.push_back("slot " + std::to_string(context.slotID()) + (context.isSimPresent() ? " SIM" : " no SIM") +
                   (hasCell ? " cell" : " no cell"));
    EXPECT_TRUE(queue.isCurrent());
  }
  void connectionStateChanged(const HVServiceSubscriptionContext& context, HVDataConnectionType connection,
                              HVDataConnectionStatus status) override {
    const bool isImsUp = connection == HVDataConnectionType::Ims && status == HVDataConnectionStatus::Connected;
    told.push_back("slot " + std::to_string(context.slotID()) + (isImsUp ? " IMS connected" : " connection"));
    EXPECT_TRUE(queue.isCurrent());
  }

  explicit Listener(Queue& clientQueue) : queue(clientQueue) {}
  Queue& queue;
  std::vector<std::string> told;
};

/// A simulated phone whose client lives on a main queue; everything on virtual time.
class TelephonySimulatorTest : public ::testing::Test {
 protected:
  TelephonySimulatorTest() { client->setDelegate(listener); }

  void perform(const event::Event& step) { phone->perform(step); }

  /// Presence of a SIM by slot; on an error none, and its text goes to `failure`.
  std::vector<std::pair<int, bool>> subscriptions(std::string* failure = nullptr) {
    std::vector<std::pair<int, bool>> result;
    client->getSubscriptionInfo([&](const auto& info, const auto& error) {
      EXPECT_TRUE(main->isCurrent());
      if (error && failure != nullptr) *failure = error->text;
      if (!info) return;
      for (const auto& context : *info->subscriptions) result.emplace_back(context.slotID(), context.isSimPresent());
    });
    time.settle();
    return result;
  }

  /// "dictionary", "no dictionary", or the error's text.
  std::string cell(HVSubscriptionSlot slot) {
    std::string result = "no answer";
    client->copyCellInfo(HVServiceSubscriptionContext::initWithSlot(slot), [&](const auto& info, const auto& error) {
      EXPECT_FALSE(main->isCurrent());
      result = error ? error->text : info->legacyInfo ? "dictionary" : "no dictionary";
    });
    time.settle();
    return result;
  }

  /// The measurements' text, or the error's.
  std::string signal(HVSubscriptionSlot slot) {
    std::string result = "no answer";
    client->getSignalStrengthMeasurements(
        HVServiceDescriptor::descriptorWithSubscriptionContext(HVServiceSubscriptionContext::initWithSlot(slot)),
        [&](const auto& measurements, const auto& error) {
          EXPECT_FALSE(main->isCurrent());
          result = error ? error->text : measurements->description;
          if (measurements) rsrp = measurements->rsrp;
        });
    time.settle();
    return result;
  }

  test::VirtualTime time;
  std::shared_ptr<test::SteppedQueue> main = time.makeStepped("main");
  std::unique_ptr<TelephonySimulator> phone = std::make_unique<TelephonySimulator>(time);
  std::unique_ptr<HorvaneClient> client = phone->initWithQueue(*main);
  std::shared_ptr<Listener> listener = std::make_shared<Listener>(*main);
  std::optional<std::int64_t> rsrp;
};

TEST_F(TelephonySimulatorTest, BeginsWithTwoEmptySlotsAndAnEmptyCarrierMap) {
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, false), Pair(2, false)));
  EXPECT_THAT(*phone->networkInfo()->subscriberProviders(), IsEmpty());
}

TEST_F(TelephonySimulatorTest, SimsComeAndGoInEitherSlotAndTheClientTellsOfIt) {
  perform(event::SimInserted{2, "Testnet Two"});
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, false), Pair(2, true)));
  perform(event::SimInserted{1, std::nullopt});
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, true)));
  perform(event::SimRemoved{2});
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, false)));
  EXPECT_THAT(listener->told, ElementsAre("slot 2 SIM no cell", "slot 1 SIM no cell", "slot 2 no SIM no cell"));
}

TEST_F(TelephonySimulatorTest, RemovedSimTakesItsCellSignalAndNameAlong) {
  perform(event::SimInserted{1, "Testnet One"});
  perform(event::Cell{1, cellOf({}), true});
  perform(event::Signal{1, -90});
  perform(event::SimRemoved{1});
  perform(event::SimInserted{1, std::nullopt});
  EXPECT_EQ(cell(1), "no dictionary");
  EXPECT_EQ(signal(1), "no rsrp");
  EXPECT_FALSE(phone->networkInfo()->subscriberProviders()->at("0000000100000001").carrierName);
}

TEST_F(TelephonySimulatorTest, CarrierNameMayComeLateOrGoAgain) {
  perform(event::SimInserted{1, std::nullopt});
  perform(event::SimInserted{2, "Testnet Two"});
  const auto name = [&](const char* key) { return phone->networkInfo()->subscriberProviders()->at(key).carrierName; };
  EXPECT_FALSE(name("0000000100000001"));
  EXPECT_EQ(name("0000000100000002"), "Testnet Two");
  perform(event::CarrierName{1, "Testnet One"});
  EXPECT_EQ(name("0000000100000001"), "Testnet One");
  perform(event::CarrierName{1, std::nullopt});
  EXPECT_FALSE(name("0000000100000001"));
}

TEST_F(TelephonySimulatorTest, CarrierMapMayBeAbsent) {
  perform(event::CarrierMap{false});
  EXPECT_FALSE(phone->networkInfo()->subscriberProviders());
  perform(event::CarrierMap{true});
  EXPECT_TRUE(phone->networkInfo()->subscriberProviders());
}

TEST_F(TelephonySimulatorTest, CellIsToldOfUnlessItComesQuietly) {
  perform(event::Cell{1, cellOf({}), false});
  time.settle();
  EXPECT_THAT(listener->told, IsEmpty());
  EXPECT_EQ(cell(1), "dictionary");
  perform(event::Cell{2, cellOf({}), true});
  time.settle();
  EXPECT_THAT(listener->told, ElementsAre("slot 2 no SIM cell"));
}

TEST_F(TelephonySimulatorTest, MeasurementsMayLackRsrp) {
  perform(event::Signal{1, -101});
  EXPECT_EQ(signal(1), "rsrp: -101 dBm");
  EXPECT_EQ(rsrp, -101);
  perform(event::Signal{1, std::nullopt});
  EXPECT_EQ(signal(1), "no rsrp");
  EXPECT_FALSE(rsrp);
}

TEST_F(TelephonySimulatorTest, BandRecordAnswersAtOnce) {
  perform(event::Bands{2, {HVBandDictionary{{"LTE", {1}}}, std::nullopt}});
  std::optional<HVError> error;
  const auto bands = client->getBandInfo(HVServiceSubscriptionContext::initWithSlot(2), error);
  ASSERT_TRUE(bands && bands->activeBands);
  EXPECT_FALSE(bands->supportedBands);
  EXPECT_FALSE(error);
}

TEST_F(TelephonySimulatorTest, EveryServiceFailsOnItsOwnAndRecovers) {
  const auto bands = [&] {
    std::optional<HVError> error;
    return client->getBandInfo(HVServiceSubscriptionContext::initWithSlot(1), error) ? "bands" : error->text;
  };
  using event::Service;
  perform(event::Cell{1, cellOf({}), false});
  perform(event::Failure{Service::Cell, 1, HVError{"no cell"}});
  EXPECT_EQ(cell(1), "no cell");
  EXPECT_EQ(cell(2), "no dictionary");
  EXPECT_EQ(signal(1), "no rsrp");
  perform(event::Failure{Service::Signal, 1, HVError{"deaf"}});
  EXPECT_EQ(signal(1), "deaf");
  perform(event::Failure{Service::Bands, 1, HVError{"no bands"}});
  EXPECT_EQ(bands(), "no bands");
  perform(event::Failure{Service::Subscriptions, 1, HVError{"not now"}});
  std::string failure;
  EXPECT_THAT(subscriptions(&failure), IsEmpty());
  EXPECT_EQ(failure, "not now");

  for (const Service what : {Service::Cell, Service::Signal, Service::Bands, Service::Subscriptions})
    perform(event::Failure{what, 1, std::nullopt});
  EXPECT_EQ(cell(1), "dictionary");
  EXPECT_EQ(signal(1), "no rsrp");
  EXPECT_EQ(bands(), "bands");
  EXPECT_EQ(subscriptions().size(), 2U);
}

TEST_F(TelephonySimulatorTest, SlotThatThePhoneDoesNotHaveFails) {
  perform(event::SimInserted{3, "Testnet Three"});
  EXPECT_EQ(cell(3), "no such slot");
  EXPECT_EQ(signal(0), "no such slot");
  std::optional<HVError> error;
  EXPECT_FALSE(client->getBandInfo(HVServiceSubscriptionContext::initWithSlot(-1), error));
  EXPECT_EQ(error->text, "no such slot");
  EXPECT_THAT(listener->told, IsEmpty());
}

TEST_F(TelephonySimulatorTest, ConnectionIsToldOf) {
  perform(event::Connection{2, HVDataConnectionType::Ims, HVDataConnectionStatus::Connected});
  time.settle();
  EXPECT_THAT(listener->told, ElementsAre("slot 2 IMS connected"));
}

TEST_F(TelephonySimulatorTest, NothingAnswersInsideTheAskingCall) {
  int answers = 0;
  const auto context = HVServiceSubscriptionContext::initWithSlot(1);
  client->getSubscriptionInfo([&](const auto&, const auto&) { ++answers; });
  client->copyCellInfo(context, [&](const auto&, const auto&) { ++answers; });
  client->getSignalStrengthMeasurements(HVServiceDescriptor::descriptorWithSubscriptionContext(context),
                                        [&](const auto&, const auto&) { ++answers; });
  perform(event::SimInserted{1, std::nullopt});
  EXPECT_EQ(answers, 0);
  EXPECT_THAT(listener->told, IsEmpty());
  time.settle();
  EXPECT_EQ(answers, 3);
}

TEST_F(TelephonySimulatorTest, SlowAnswersComeAfterTheirDelayAndTellWhatWasSoWhenAsked) {
  phone->setAnswerDelay(250ms);
  std::string answer;
  client->copyCellInfo(HVServiceSubscriptionContext::initWithSlot(1),
                       [&](const auto& info, const auto&) { answer = info->legacyInfo ? "dictionary" : "none"; });
  perform(event::Cell{1, cellOf({}), false});
  time.advance(249ms);
  EXPECT_EQ(answer, "");
  time.advance(1ms);
  EXPECT_EQ(answer, "none");
}

TEST_F(TelephonySimulatorTest, AnswersOnTheirWayOutliveTheClientAndDelegateCallsDoNot) {
  int answers = 0;
  client->getSubscriptionInfo([&](const auto&, const auto&) { ++answers; });
  perform(event::SimInserted{1, std::nullopt});
  client.reset();
  time.settle();
  EXPECT_EQ(answers, 1);
  EXPECT_THAT(listener->told, IsEmpty());
}

TEST_F(TelephonySimulatorTest, DelegateThatIsGoneIsNotMissed) {
  perform(event::SimInserted{1, std::nullopt});
  listener.reset();
  EXPECT_GT(time.settle(), 0U);
}

TEST_F(TelephonySimulatorTest, ScriptHappensAtItsTimesAndItsBeginningAtOnce) {
  phone->play({{100ms, event::SimInserted{2, std::nullopt}},
               {0ms, event::SimInserted{1, std::nullopt}},
               {100ms, event::SimRemoved{1}}},
              *main);
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, false)));
  time.advance(99ms);
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, false)));
  time.advance(1ms);
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, false), Pair(2, true)));
  EXPECT_THAT(listener->told, ElementsAre("slot 1 SIM no cell", "slot 2 SIM no cell", "slot 1 no SIM no cell"));
}

TEST_F(TelephonySimulatorTest, StepsToComeAreDroppedWithTheSimulatorThoughItsClientLivesOn) {
  phone->play({{0ms, event::SimInserted{2, std::nullopt}}, {100ms, event::SimInserted{1, std::nullopt}}}, *main);
  time.settle();
  listener->told.clear();
  phone.reset();
  time.advance(1s);
  EXPECT_THAT(listener->told, IsEmpty());
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, false), Pair(2, true)));
}

TEST_F(TelephonySimulatorTest, ShippedScriptRunsToItsEnd) {
  phone->play(readTelephonyScript(std::filesystem::path(QUORL_SOURCE_DIR) / "resources/telephony/two-sims.jsonl").steps,
              *main);
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, true)));
  listener->told.clear();
  time.advance(75s);
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, false)));
  time.advance(75s);
  EXPECT_THAT(subscriptions(), ElementsAre(Pair(1, true), Pair(2, true)));
  EXPECT_EQ(listener->told.back(), "slot 2 SIM cell");
}

}  // namespace
}  // namespace quorl::simulator
