#include <atomic>
#include <memory>
#include <string>
#include <thread>
#include <utility>
#include <variant>
#include <vector>

#include <gtest/gtest.h>

#include "base/SerialQueue.h"
#include "hosts/simulator/BasebandManager.h"
#include "simulator/ManagerCommands.h"
#include "support/SteppedQueue.h"

namespace quorl::simulator {
namespace {

using test::clearConfiguration;
using test::configurationOf;
using test::queryMetric;
using zelkor::KeyValueMessage;

const std::string kConfiguration = configurationOf("[806915, 803010, 827648]");

KeyValueMessage addConfiguration(std::string_view content = kConfiguration) {
  return test::addConfiguration(content);
}

KeyValueMessage without(const KeyValueMessage& message, std::string_view key) {
  KeyValueMessage rest;
  for (const auto& [name, value] : message.entries())
    if (name != key) rest.set(name, value);
  return rest;
}

KeyValueMessage with(KeyValueMessage message, std::string_view key, zelkor::KeyValue value) {
  message.set(key, std::move(value));
  return message;
}

KeyValueMessage metric(std::int64_t id) {
  KeyValueMessage message;
  message.set(zelkor::kKeyMetricID, id);
  return message;
}

class SimulatedBaseband : public testing::Test {
 protected:
  ~SimulatedBaseband() override {
    time.settle();  // what waits for delivery holds the client, and with it its queue
  }
  zelkor::client::Result perform(std::string_view command, const KeyValueMessage& message) {
    KeyValueMessage response;
    return library.PerformCommand(manager, command, message, response);
  }
  CommandCode code(std::string_view command, const KeyValueMessage& message) {
    return static_cast<CommandCode>(perform(command, message).code);
  }
  void listen() {
    library.RegisterEventHandler(manager, zelkor::kEventMetric, [this](const KeyValueMessage& message, const auto&) {
      received.push_back(message.integer(zelkor::kKeyMetricID).value_or(-1));
    });
    library.EventsOff(manager);
    library.EventsOn(manager);
  }
  void subscribe() { ASSERT_EQ(perform(zelkor::kCommandAddConfiguration, addConfiguration()).code, 0); }
  void withdraw() { ASSERT_EQ(perform(zelkor::kCommandClearConfiguration, clearConfiguration()).code, 0); }
  bool deliver(std::int64_t id) { return library.deliver(zelkor::kEventMetric, metric(id)); }

  test::VirtualTime time;
  std::shared_ptr<test::SteppedQueue> queue = time.makeStepped("delivery");
  BasebandManager library;
  std::shared_ptr<zelkor::client::Manager> manager = library.CreateManager("quorl", queue);
  std::vector<std::int64_t> received;
};

TEST_F(SimulatedBaseband, TakesTheThreeCommandsOfTheProduct) {
  EXPECT_EQ(perform(zelkor::kCommandAddConfiguration, addConfiguration()).code, 0);
  EXPECT_EQ(perform(zelkor::kCommandQueryMetric, queryMetric()).code, 0);
  EXPECT_EQ(perform(zelkor::kCommandClearConfiguration, clearConfiguration()).code, 0);
}

TEST_F(SimulatedBaseband, DoesNotCareAboutTheOrderOfKeys) {
  KeyValueMessage turned;
  turned.set(zelkor::kKeyPayloadType, std::int64_t{0});
  turned.set(zelkor::kKeyPayload, ByteString(kConfiguration));
  turned.set(zelkor::kKeyAppID, std::int64_t{2});
  EXPECT_EQ(perform(zelkor::kCommandAddConfiguration, turned).code, 0);
}

TEST_F(SimulatedBaseband, NamesEveryMissingKey) {
  const auto expectAllNeeded = [this](std::string_view command, const KeyValueMessage& whole) {
    for (const auto& [key, value] : whole.entries()) {
      const auto result = perform(command, without(whole, key));
      EXPECT_EQ(result.code, static_cast<int>(CommandCode::MissingKey)) << key;
      EXPECT_EQ(result.text, key + " is missing");
    }
  };
  expectAllNeeded(zelkor::kCommandAddConfiguration, addConfiguration());
  expectAllNeeded(zelkor::kCommandClearConfiguration, clearConfiguration());
  expectAllNeeded(zelkor::kCommandQueryMetric, queryMetric());
}

TEST_F(SimulatedBaseband, NamesEveryValueOfAnotherType) {
  const auto expectTyped = [this](std::string_view command, const KeyValueMessage& whole) {
    for (const auto& [key, value] : whole.entries()) {
      const bool isInteger = std::holds_alternative<std::int64_t>(value);
      const zelkor::KeyValue wrong = isInteger ? zelkor::KeyValue(ByteString("2")) : zelkor::KeyValue(std::int64_t{2});
      const auto result = perform(command, with(whole, key, wrong));
      EXPECT_EQ(result.code, static_cast<int>(CommandCode::WrongType)) << key;
      EXPECT_EQ(result.text, key + (isInteger ? " is no integer" : " is no byte string"));
      EXPECT_EQ(code(command, with(whole, key, std::monostate{})), CommandCode::WrongType) << key;
    }
  };
  expectTyped(zelkor::kCommandAddConfiguration, addConfiguration());
  expectTyped(zelkor::kCommandClearConfiguration, clearConfiguration());
  expectTyped(zelkor::kCommandQueryMetric, queryMetric());
}

TEST_F(SimulatedBaseband, RefusesKeysThatDoNotBelongToTheCommand) {
  const auto result =
      perform(zelkor::kCommandClearConfiguration, with(clearConfiguration(), zelkor::kKeyPayloadType, std::int64_t{0}));
  EXPECT_EQ(result.code, static_cast<int>(CommandCode::UnexpectedKey));
  EXPECT_EQ(result.text, "kKeyPayloadType does not belong here");
}

TEST_F(SimulatedBaseband, RefusesForeignApplicationsPayloadTypesAndCommands) {
  EXPECT_EQ(code(zelkor::kCommandAddConfiguration, with(addConfiguration(), zelkor::kKeyAppID, std::int64_t{3})),
            CommandCode::UnknownApplication);
  EXPECT_EQ(code(zelkor::kCommandAddConfiguration, with(addConfiguration(), zelkor::kKeyPayloadType, std::int64_t{1})),
            CommandCode::UnknownPayloadType);
  EXPECT_EQ(code("kCommandRestart", clearConfiguration()), CommandCode::UnknownCommand);
  EXPECT_EQ(code(zelkor::kCommandAddConfiguration, addConfiguration("")), CommandCode::EmptyConfiguration);
}

TEST_F(SimulatedBaseband, RefusesAQueryWithoutConfiguration) {
  EXPECT_EQ(code(zelkor::kCommandQueryMetric, queryMetric()), CommandCode::MissingConfiguration);
  subscribe();
  EXPECT_EQ(code(zelkor::kCommandQueryMetric, queryMetric()), CommandCode::Success);
  withdraw();
  EXPECT_EQ(code(zelkor::kCommandQueryMetric, queryMetric()), CommandCode::MissingConfiguration);
}

TEST_F(SimulatedBaseband, ClearingTwiceIsNoError) {
  withdraw();
  subscribe();
  withdraw();
  withdraw();
}

TEST_F(SimulatedBaseband, RefusesHandlesOfAnotherLibrary) {
  KeyValueMessage response;
  for (const auto& foreign :
       {std::shared_ptr<zelkor::client::Manager>(), std::make_shared<zelkor::client::Manager>()}) {
    EXPECT_EQ(library.PerformCommand(foreign, zelkor::kCommandClearConfiguration, clearConfiguration(), response).code,
              static_cast<int>(CommandCode::ForeignManager));
    library.RegisterEventHandler(foreign, zelkor::kEventMetric, nullptr);
    library.EventsOn(foreign);
    library.EventsOff(foreign);
  }
}

TEST_F(SimulatedBaseband, DeliversOnTheQueueInOrderAndNeverInsideTheCall) {
  subscribe();
  listen();
  EXPECT_TRUE(deliver(1));
  EXPECT_TRUE(deliver(2));
  EXPECT_TRUE(deliver(3));
  EXPECT_TRUE(received.empty());
  time.settle();
  EXPECT_EQ(received, (std::vector<std::int64_t>{1, 2, 3}));
}

TEST_F(SimulatedBaseband, DeliversNothingBeforeAConfigurationIsAdded) {
  listen();
  EXPECT_FALSE(deliver(1));
  subscribe();
  EXPECT_TRUE(deliver(2));
  time.settle();
  EXPECT_EQ(received, std::vector<std::int64_t>{2});
}

TEST_F(SimulatedBaseband, DeliversNothingWhileEventsAreOff) {
  subscribe();
  EXPECT_FALSE(deliver(1));
  listen();
  library.EventsOff(manager);
  EXPECT_FALSE(deliver(2));
  library.EventsOn(manager);
  EXPECT_TRUE(deliver(3));
  library.EventsOff(manager);
  time.settle();
  EXPECT_TRUE(received.empty()) << "an event that waits when events go off";
}

TEST_F(SimulatedBaseband, ListeningAgainLosesNothingThatWaits) {
  subscribe();
  listen();
  EXPECT_TRUE(deliver(1));
  listen();
  time.settle();
  EXPECT_EQ(received, std::vector<std::int64_t>{1});
}

TEST_F(SimulatedBaseband, DeliversNothingAfterTheConfigurationIsCleared) {
  subscribe();
  listen();
  EXPECT_TRUE(deliver(1));
  withdraw();
  EXPECT_FALSE(deliver(2));
  subscribe();
  EXPECT_TRUE(deliver(3));
  time.settle();
  EXPECT_EQ(received, std::vector<std::int64_t>{3});
}

TEST_F(SimulatedBaseband, LaterHandlerReplacesTheEarlierOne) {
  subscribe();
  listen();
  int later = 0;
  library.RegisterEventHandler(manager, zelkor::kEventMetric, [&later](const auto&, const auto&) { ++later; });
  deliver(1);
  time.settle();
  EXPECT_TRUE(received.empty());
  EXPECT_EQ(later, 1);
}

TEST_F(SimulatedBaseband, KeepsTriggerEventsApartFromMetrics) {
  subscribe();
  listen();
  EXPECT_FALSE(library.deliver(zelkor::kEventTrigger, metric(1))) << "nobody handles it";
  int triggers = 0;
  library.RegisterEventHandler(manager, zelkor::kEventTrigger, [&triggers](const auto&, const auto&) { ++triggers; });
  EXPECT_TRUE(library.deliver(zelkor::kEventTrigger, metric(1)));
  time.settle();
  EXPECT_TRUE(received.empty());
  EXPECT_EQ(triggers, 1);
}

TEST_F(SimulatedBaseband, HandlerMayCallTheLibrary) {
  subscribe();
  int calls = 0;
  library.RegisterEventHandler(manager, zelkor::kEventMetric, [&](const auto&, const auto&) {
    ++calls;
    library.RegisterEventHandler(manager, zelkor::kEventMetric, nullptr);
    withdraw();
  });
  library.EventsOn(manager);
  deliver(1);
  deliver(2);
  time.settle();
  EXPECT_EQ(calls, 1);
}

TEST_F(SimulatedBaseband, DeliversOfWhatComesUpByItselfOnlyWhatTheConfigurationLists) {
  listen();
  EXPECT_FALSE(library.deliverSelected(metric(806915))) << "there is no configuration yet";
  subscribe();
  EXPECT_TRUE(library.deliverSelected(metric(806915)));
  EXPECT_FALSE(library.deliverSelected(metric(806914)));
  EXPECT_FALSE(library.deliverSelected(KeyValueMessage())) << "no id at all";
  EXPECT_TRUE(library.deliverSelected(metric(827648)));
  time.settle();
  EXPECT_EQ(received, (std::vector<std::int64_t>{806915, 827648}));
}

TEST_F(SimulatedBaseband, ALaterConfigurationTakesThePlaceOfTheEarlierOne) {
  subscribe();
  listen();
  ASSERT_EQ(code(zelkor::kCommandAddConfiguration, addConfiguration(configurationOf("[806914]"))),
            CommandCode::Success);
  EXPECT_FALSE(library.deliverSelected(metric(806915)));
  EXPECT_TRUE(library.deliverSelected(metric(806914)));
}

TEST_F(SimulatedBaseband, ARefusedConfigurationLeavesTheEarlierOne) {
  subscribe();
  listen();
  ASSERT_EQ(code(zelkor::kCommandAddConfiguration, addConfiguration(configurationOf("[]"))),
            CommandCode::ConfigurationValue);
  EXPECT_TRUE(library.deliverSelected(metric(806915)));
}

TEST_F(SimulatedBaseband, PlaysARecordingAsItIs) {
  subscribe();
  listen();
  EXPECT_TRUE(deliver(4711)) << "not in the configuration";
  time.settle();
  EXPECT_EQ(received, std::vector<std::int64_t>{4711});
}

TEST_F(SimulatedBaseband, AQueryAsksTheHostForAllThatIsConfigured) {
  std::vector<std::int64_t> asked;
  library.setSnapshotSource([&asked](const SnapshotRequest& request) {
    asked = request.metrics;
    EXPECT_EQ(request.triggerRef, 9999);
    for (const std::int64_t id : request.metrics) EXPECT_TRUE(request.deliver(metric(id)));
  });
  subscribe();
  listen();
  EXPECT_EQ(code(zelkor::kCommandQueryMetric, queryMetric()), CommandCode::Success);
  EXPECT_EQ(asked, (std::vector<std::int64_t>{806915, 803010, 827648}));
  time.settle();
  EXPECT_EQ(received, asked);
  EXPECT_EQ(code(zelkor::kCommandQueryMetric, with(queryMetric(), zelkor::kKeyMetricID, std::int64_t{803010})),
            CommandCode::Success);
  EXPECT_EQ(asked, std::vector<std::int64_t>{803010}) << "one of them";
}

TEST_F(SimulatedBaseband, ASnapshotGoesToTheClientThatAsked) {
  library.setSnapshotSource([](const SnapshotRequest& request) { request.deliver(metric(803010)); });
  const auto other = library.CreateManager("other", queue);
  int ofTheOther = 0;
  library.RegisterEventHandler(other, zelkor::kEventMetric, [&](const auto&, const auto&) { ++ofTheOther; });
  library.EventsOn(other);
  KeyValueMessage response;
  library.PerformCommand(other, zelkor::kCommandAddConfiguration, addConfiguration(), response);
  subscribe();
  listen();
  perform(zelkor::kCommandQueryMetric, queryMetric());
  time.settle();
  EXPECT_EQ(received, std::vector<std::int64_t>{803010});
  EXPECT_EQ(ofTheOther, 0);
}

TEST_F(SimulatedBaseband, ASnapshotThatIsLateForItsConfigurationIsDropped) {
  std::vector<SnapshotRequest> open;
  library.setSnapshotSource([&open](SnapshotRequest request) { open.push_back(std::move(request)); });
  subscribe();
  listen();
  perform(zelkor::kCommandQueryMetric, queryMetric());
  ASSERT_EQ(open.size(), 1U);
  EXPECT_TRUE(open[0].deliver(metric(803010)));
  withdraw();
  EXPECT_FALSE(open[0].deliver(metric(803010)));
  subscribe();
  EXPECT_FALSE(open[0].deliver(metric(803010))) << "another configuration";
  manager.reset();
  EXPECT_FALSE(open[0].deliver(metric(803010)));
  time.settle();
  EXPECT_TRUE(received.empty());
}

TEST_F(SimulatedBaseband, RefusesQueriesThatTheConfigurationDoesNotProvideFor) {
  subscribe();
  const auto refusal = [this](std::string_view key, std::int64_t value) {
    const auto result = perform(zelkor::kCommandQueryMetric, with(queryMetric(), key, value));
    return std::pair(static_cast<CommandCode>(result.code), result.text);
  };
  EXPECT_EQ(refusal(zelkor::kKeyTriggerID, 7),
            std::pair(CommandCode::UnknownTrigger,
                      std::string("the configuration lists no trigger 7 of type 0 and reference 9999")));
  EXPECT_EQ(refusal(zelkor::kKeyTriggerType, 1).first, CommandCode::UnknownTrigger);
  EXPECT_EQ(refusal(zelkor::kKeyTriggerRef, 1).first, CommandCode::UnknownTrigger);
  EXPECT_EQ(refusal(zelkor::kKeyProfileID, 3),
            std::pair(CommandCode::UnknownTrigger, std::string("the configuration is not for profile 3")));
  EXPECT_EQ(refusal(zelkor::kKeyMetricID, 806914),
            std::pair(CommandCode::UnselectedMetric, std::string("the configuration lists no metric 806914")));
}

TEST_F(SimulatedBaseband, ForgetsClientsThatAreGone) {
  subscribe();
  listen();
  manager.reset();
  EXPECT_FALSE(deliver(1));
}

TEST(SimulatedBasebandOnThreads, NothingComesAfterTheClearHasReturned) {
  BasebandManager library;
  const auto manager = library.CreateManager("quorl", std::make_shared<SerialQueue>("delivery"));
  std::atomic<bool> isWithdrawn{true};
  std::atomic<int> late{0};
  std::atomic<int> inTime{0};
  library.RegisterEventHandler(manager, zelkor::kEventMetric,
                               [&](const auto&, const auto&) { (isWithdrawn.load() ? late : inTime).fetch_add(1); });
  library.EventsOn(manager);
  std::atomic<bool> isOver{false};
  std::thread source([&] {
    while (!isOver.load()) library.deliver(zelkor::kEventMetric, metric(1));
  });
  KeyValueMessage response;
  for (int round = 0; round < 200 || inTime.load() == 0; ++round) {
    isWithdrawn = false;
    library.PerformCommand(manager, zelkor::kCommandAddConfiguration, addConfiguration(), response);
    std::this_thread::yield();
    library.PerformCommand(manager, zelkor::kCommandClearConfiguration, clearConfiguration(), response);
    isWithdrawn = true;
  }
  isOver = true;
  source.join();
  EXPECT_EQ(late.load(), 0);
}

}  // namespace
}  // namespace quorl::simulator
