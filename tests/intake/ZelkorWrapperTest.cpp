#include <filesystem>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "base/SerialQueue.h"
#include "intake/ZelkorWrapper.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;
using test::LogLine;
using zelkor::KeyValueMessage;

class RecordingDelegate final : public ZelkorWrapperDelegate {
 public:
  void eventsDidUpdate(const KeyValueMessage& dictionary) override { events.push_back(dictionary); }
  void metricsDidUpdate(const KeyValueMessage& dictionary) override { metrics.push_back(dictionary); }

  std::vector<KeyValueMessage> events;
  std::vector<KeyValueMessage> metrics;
};

KeyValueMessage messageOf(std::vector<KeyValueMessage::Entry> entries) {
  KeyValueMessage message;
  for (auto& [key, value] : entries) message.set(key, std::move(value));
  return message;
}

std::vector<std::string> keysOf(const KeyValueMessage& message) {
  std::vector<std::string> keys;
  for (const auto& [key, value] : message.entries()) keys.push_back(key);
  return keys;
}

class ZelkorWrapperTest : public ::testing::Test {
 protected:
  ZelkorWrapper& wrapper() { return ZelkorWrapper::sharedInstance(); }

  std::filesystem::path fileHolding(std::string_view content) {
    const auto path = host.directory.path() / "Quorl2.deviceconfig";
    std::ofstream(path, std::ios::binary) << content;
    return path;
  }
  void basebandRefuses(std::string_view command, int code, const std::string& text) {
    host.zelkor.answers[std::string(command)] = {code, text};
  }
  std::shared_ptr<RecordingDelegate> listensWithDelegate() {
    auto delegate = std::make_shared<RecordingDelegate>();
    wrapper().listen();
    wrapper().setDelegate(delegate);
    return delegate;
  }
  bool query() { return wrapper().querySpecificMetric("quorl", 9999, 0, 5202011, 0, 0); }

  test::FakePlatform host;
  test::LogRecorder log;
};

TEST_F(ZelkorWrapperTest, RegistersOnceUnderTheClientNameWithItsOwnQueue) {
  ZelkorWrapper& first = wrapper();
  EXPECT_EQ(&first, &wrapper());
  EXPECT_EQ(host.zelkor.calls, (std::vector<std::string>{"CreateManager"}));
  EXPECT_EQ(host.zelkor.clientName, "quorl");
  EXPECT_EQ(host.zelkor.queue, ZelkorWrapper::queue());
  EXPECT_EQ(host.zelkor.queue->label(), "com.ardent.Quorlode.serialQ.queue");
}

TEST_F(ZelkorWrapperTest, AddingAConfigurationSendsTheWholeFile) {
  const std::string content("con\0fig\n\xFF", 9);
  EXPECT_TRUE(wrapper().addVexilConfigForAppId("quorl", fileHolding(content)));
  ASSERT_EQ(host.zelkor.commands.size(), 1U);
  EXPECT_EQ(host.zelkor.commands[0].name, zelkor::kCommandAddConfiguration);
  EXPECT_EQ(host.zelkor.commands[0].message.entries(), messageOf({{"kKeyAppID", std::int64_t{2}},
                                                                  {"kKeyPayload", ByteString(content)},
                                                                  {"kKeyPayloadType", std::int64_t{0}}})
                                                           .entries());
}

TEST_F(ZelkorWrapperTest, ALongFileIsSentWhole) {
  std::string content;
  for (int i = 0; i < 100000; ++i) content += static_cast<char>(i % 251);
  EXPECT_TRUE(wrapper().addVexilConfigForAppId("quorl", fileHolding(content)));
  EXPECT_EQ(host.zelkor.commands.at(0).message.bytes("kKeyPayload"), ByteString(content));
}

TEST_F(ZelkorWrapperTest, AnEmptyFileIsSentAndTheBasebandDecides) {
  basebandRefuses(zelkor::kCommandAddConfiguration, 22, "empty configuration");
  EXPECT_FALSE(wrapper().addVexilConfigForAppId("quorl", fileHolding("")));
  EXPECT_EQ(host.zelkor.commands.at(0).message.bytes("kKeyPayload"), ByteString());
}

TEST_F(ZelkorWrapperTest, AFileThatCannotBeReadAnswersFalseAndSendsNothing) {
  EXPECT_FALSE(wrapper().addVexilConfigForAppId("quorl", host.directory.path() / "missing"));
  EXPECT_FALSE(wrapper().addVexilConfigForAppId("quorl", host.directory.path())) << "a directory";
  EXPECT_TRUE(host.zelkor.commands.empty());
  EXPECT_EQ(log.texts(), (std::vector<std::string>{"[QuorlInternal-4] addVexilConfigForAppId begins",
                                                   "[QuorlInternal-4] addVexilConfigForAppId begins"}));
}

TEST_F(ZelkorWrapperTest, RemovingTheConfigurationSendsTheAppIdAlone) {
  EXPECT_TRUE(wrapper().removeVexilConfigForAppid("quorl"));
  ASSERT_EQ(host.zelkor.commands.size(), 1U);
  EXPECT_EQ(host.zelkor.commands[0].name, zelkor::kCommandClearConfiguration);
  EXPECT_EQ(host.zelkor.commands[0].message, messageOf({{"kKeyAppID", std::int64_t{2}}}));
}

TEST_F(ZelkorWrapperTest, AQuerySendsItsArgumentsSignExtendedInOrder) {
  EXPECT_TRUE(wrapper().querySpecificMetric("quorl", 9999, 0, 8323091, -1, -2147483647 - 1));
  ASSERT_EQ(host.zelkor.commands.size(), 1U);
  EXPECT_EQ(host.zelkor.commands[0].name, zelkor::kCommandQueryMetric);
  EXPECT_EQ(host.zelkor.commands[0].message.entries(), messageOf({{"kKeyAppID", std::int64_t{2}},
                                                                  {"kKeyPayloadType", std::int64_t{0}},
                                                                  {"kKeyTriggerRef", std::int64_t{9999}},
                                                                  {"kKeyTriggerType", std::int64_t{0}},
                                                                  {"kKeyTriggerID", std::int64_t{8323091}},
                                                                  {"kKeyProfileID", std::int64_t{-1}},
                                                                  {"kKeyMetricID", std::int64_t{-2147483648}}})
                                                           .entries());
}

TEST_F(ZelkorWrapperTest, AnAppIdOtherThanTheOneSendsNothing) {
  const auto path = fileHolding("config");
  for (const char* appId : {"", "Quorl", "quorl ", "2"}) {
    EXPECT_FALSE(wrapper().addVexilConfigForAppId(appId, path)) << appId;
    EXPECT_FALSE(wrapper().removeVexilConfigForAppid(appId)) << appId;
    EXPECT_FALSE(wrapper().querySpecificMetric(appId, 9999, 0, 5202011, 0, 0)) << appId;
  }
  EXPECT_TRUE(host.zelkor.commands.empty());
  EXPECT_EQ(log.lines(), std::vector<LogLine>(4, {"metric-related", LogLevel::Default,
                                                  "[QuorlInternal-4] addVexilConfigForAppId begins"}));
}

TEST_F(ZelkorWrapperTest, EachCommandLogsItsResultInThePlainErrorLogEvenWhenItSucceeds) {
  const auto path = fileHolding("config");
  wrapper().addVexilConfigForAppId("quorl", path);
  wrapper().removeVexilConfigForAppid("quorl");
  query();
  EXPECT_EQ(
      log.lines(),
      (std::vector<LogLine>{
          {"metric-related", LogLevel::Default, "[QuorlInternal-4] addVexilConfigForAppId begins"},
          {"", LogLevel::Error, "-[ZelkorWrapper addVexilConfigForAppId:andProtofFilePath:]: error=0 msg="},
          {"metric-related", LogLevel::Default, "[QuorlInternal-4] addVexilConfigForAppId success? TRUE"},
          {"", LogLevel::Error, "-[ZelkorWrapper removeVexilConfigForAppid:]: error=0 msg="},
          {"metric-related", LogLevel::Default, "[QuorlInternal-4] removeVexilConfigForAppid success? TRUE"},
          {"", LogLevel::Error,
           "-[ZelkorWrapper querySpecificMetric:triggerRef:triggerType:triggerID:profileID:metricID:]: error=0 msg="},
          {"metric-related", LogLevel::Default,
           "[QuorlInternal-4] querySpecificMetric success? TRUE errorCode if any 0"}}));
}

TEST_F(ZelkorWrapperTest, ARefusedCommandAnswersFalseAndLogsCodeAndText) {
  basebandRefuses(zelkor::kCommandAddConfiguration, 5, "bad configuration");
  basebandRefuses(zelkor::kCommandClearConfiguration, -7, "nothing to clear");
  basebandRefuses(zelkor::kCommandQueryMetric, 11, "no such trigger");
  const auto path = fileHolding("config");
  EXPECT_FALSE(wrapper().addVexilConfigForAppId("quorl", path));
  EXPECT_FALSE(wrapper().removeVexilConfigForAppid("quorl"));
  EXPECT_FALSE(query());
  EXPECT_EQ(log.lines(),
            (std::vector<LogLine>{
                {"metric-related", LogLevel::Default, "[QuorlInternal-4] addVexilConfigForAppId begins"},
                {"", LogLevel::Error,
                 "-[ZelkorWrapper addVexilConfigForAppId:andProtofFilePath:]: error=5 msg=bad configuration"},
                {"metric-related", LogLevel::Default, "[QuorlInternal-4] addVexilConfigForAppId success? FALSE"},
                {"", LogLevel::Error, "-[ZelkorWrapper removeVexilConfigForAppid:]: error=-7 msg=nothing to clear"},
                {"metric-related", LogLevel::Default, "[QuorlInternal-4] removeVexilConfigForAppid success? FALSE"},
                {"", LogLevel::Error,
                 "-[ZelkorWrapper querySpecificMetric:triggerRef:triggerType:triggerID:profileID:metricID:]: error=11 "
                 "msg=no such trigger"},
                {"metric-related", LogLevel::Default,
                 "[QuorlInternal-4] querySpecificMetric success? FALSE errorCode if any 11"}}));
}

TEST_F(ZelkorWrapperTest, EachListenRegistersAnewAndRestartsDelivery) {
  wrapper().listen();
  wrapper().listen();
  const std::vector<std::string> once{"RegisterEventHandler kEventTrigger", "RegisterEventHandler kEventMetric",
                                      "EventsOff", "EventsOn"};
  std::vector<std::string> expected{"CreateManager"};
  expected.insert(expected.end(), once.begin(), once.end());
  expected.insert(expected.end(), once.begin(), once.end());
  EXPECT_EQ(host.zelkor.calls, expected);
}

TEST_F(ZelkorWrapperTest, ATriggerEventReachesTheDelegateWhole) {
  const auto delegate = listensWithDelegate();
  const KeyValueMessage message = messageOf({{"kKeyTriggerRef", std::int64_t{9999}}, {"other", ByteString("x")}});
  host.zelkor.deliver(zelkor::kEventTrigger, message);
  host.time.settle();
  EXPECT_EQ(delegate->events, (std::vector<KeyValueMessage>{message}));
  EXPECT_TRUE(delegate->metrics.empty());
  EXPECT_TRUE(log.texts().empty());
}

TEST_F(ZelkorWrapperTest, AMetricIsReducedToFiveKeysInTheirOrder) {
  const auto delegate = listensWithDelegate();
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyPayload", ByteString("payload")},
                                                       {"kKeyTriggerType", std::int64_t{3}},
                                                       {"kKeyMetricID", std::int64_t{806915}},
                                                       {"kKeyAppID", std::int64_t{2}},
                                                       {"extra", std::int64_t{1}},
                                                       {"kKeyProfileID", std::int64_t{4}},
                                                       {"kKeyTriggerRef", std::int64_t{9999}}}));
  host.time.settle();
  ASSERT_EQ(delegate->metrics.size(), 1U);
  EXPECT_EQ(keysOf(delegate->metrics[0]),
            (std::vector<std::string>{"kKeyTriggerRef", "kKeyProfileID", "kKeyAppID", "kKeyMetricID", "kKeyPayload"}));
  EXPECT_EQ(delegate->metrics[0].integer("kKeyMetricID"), 806915);
  EXPECT_EQ(delegate->metrics[0].bytes("kKeyPayload"), ByteString("payload"));
}

TEST_F(ZelkorWrapperTest, AMissingKeyIsMissingInTheDictionaryToo) {
  const auto delegate = listensWithDelegate();
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", std::int64_t{806915}}}));
  host.time.settle();
  ASSERT_EQ(delegate->metrics.size(), 1U);
  EXPECT_EQ(keysOf(delegate->metrics[0]), (std::vector<std::string>{"kKeyMetricID"}));
}

TEST_F(ZelkorWrapperTest, AMetricIsLoggedWithItsIdAndTheTimeInWholeSeconds) {
  const auto delegate = listensWithDelegate();
  host.time.setNow(Date(1767605412987ms));
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", std::int64_t{806915}}}));
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyPayload", ByteString("x")}}));
  host.time.settle();
  EXPECT_EQ(log.lines(),
            (std::vector<LogLine>{
                {"metric-related", LogLevel::Default, "received - metricId 806915, initialTimestamp: 1767605412"},
                {"metric-related", LogLevel::Default, "received - metricId (null), initialTimestamp: 1767605412"}}));
}

TEST_F(ZelkorWrapperTest, EventsAreHandedToTheMainQueueInTheOrderOfTheirArrival) {
  const auto delegate = listensWithDelegate();
  for (std::int64_t id = 1; id <= 3; ++id) host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", id}}));
  const auto deliveryQueue = std::static_pointer_cast<test::SteppedQueue>(host.zelkor.queue);
  while (deliveryQueue->step()) continue;
  EXPECT_TRUE(delegate->metrics.empty());
  EXPECT_EQ(host.mainQueue->waiting(), 3U);
  host.time.settle();
  ASSERT_EQ(delegate->metrics.size(), 3U);
  for (std::size_t i = 0; i < 3; ++i)
    EXPECT_EQ(delegate->metrics[i].integer("kKeyMetricID"), static_cast<std::int64_t>(i + 1));
}

TEST_F(ZelkorWrapperTest, WithoutDelegateAnEventIsGoneAfterTheReceivedLine) {
  wrapper().listen();
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", std::int64_t{806915}}}));
  host.zelkor.deliver(zelkor::kEventTrigger, messageOf({}));
  const auto deliveryQueue = std::static_pointer_cast<test::SteppedQueue>(host.zelkor.queue);
  while (deliveryQueue->step()) continue;
  EXPECT_EQ(host.mainQueue->waiting(), 0U);
  EXPECT_EQ(log.texts(), (std::vector<std::string>{"received - metricId 806915, initialTimestamp: 1767605412"}));

  const auto delegate = std::make_shared<RecordingDelegate>();
  wrapper().setDelegate(delegate);
  host.time.settle();
  EXPECT_TRUE(delegate->metrics.empty());
  EXPECT_TRUE(delegate->events.empty());
}

TEST_F(ZelkorWrapperTest, ADelegateThatGoesAwayBeforeTheCallIsNotCalled) {
  auto delegate = listensWithDelegate();
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", std::int64_t{806915}}}));
  host.zelkor.deliver(zelkor::kEventTrigger, messageOf({}));
  const auto deliveryQueue = std::static_pointer_cast<test::SteppedQueue>(host.zelkor.queue);
  while (deliveryQueue->step()) continue;
  EXPECT_EQ(host.mainQueue->waiting(), 2U);
  delegate.reset();
  EXPECT_EQ(wrapper().delegate(), nullptr);
  EXPECT_EQ(host.time.settle(), 2U);
}

TEST_F(ZelkorWrapperTest, TheCallGoesToTheDelegateOfThatMoment) {
  const auto first = listensWithDelegate();
  const auto second = std::make_shared<RecordingDelegate>();
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", std::int64_t{806915}}}));
  const auto deliveryQueue = std::static_pointer_cast<test::SteppedQueue>(host.zelkor.queue);
  while (deliveryQueue->step()) continue;
  wrapper().setDelegate(second);
  host.time.settle();
  EXPECT_TRUE(first->metrics.empty());
  EXPECT_EQ(second->metrics.size(), 1U);
  EXPECT_EQ(wrapper().delegate(), second);
}

TEST_F(ZelkorWrapperTest, TheWrapperKeepsNoDelegateAlive) {
  std::weak_ptr<RecordingDelegate> watched;
  {
    const auto delegate = listensWithDelegate();
    watched = delegate;
  }
  EXPECT_TRUE(watched.expired());
}

TEST_F(ZelkorWrapperTest, HandlersOutliveAResetInstanceHarmlessly) {
  const auto delegate = listensWithDelegate();
  ZelkorWrapper::resetSharedInstance();
  host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", std::int64_t{806915}}}));
  host.time.settle();
  EXPECT_EQ(wrapper().delegate(), nullptr);
}

/// A delegate that counts and, at the end, stops the main loop.
class CountingDelegate final : public ZelkorWrapperDelegate {
 public:
  CountingDelegate(LoopQueue& main, int last) : main_(main), last_(last) {}
  void eventsDidUpdate(const KeyValueMessage& /*dictionary*/) override {}
  void metricsDidUpdate(const KeyValueMessage& dictionary) override {
    EXPECT_TRUE(main_.isCurrent());
    EXPECT_EQ(dictionary.integer("kKeyMetricID"), count);
    if (++count == last_) main_.stop();
  }

  int count = 0;

 private:
  LoopQueue& main_;
  int last_;
};

TEST(ZelkorWrapperThreadsTest, MetricsOfTheLibrarysThreadArriveInOrderOnTheMainThread) {
  constexpr int kCount = 500;
  test::FakePlatform host;
  LoopQueue mainQueue("main");
  ThreadQueueFactory queues;
  Platform platform{mainQueue,       *host.backgroundQueue, queues,
                    host.time,       host.properties,       host.resources,
                    host.documents,  host.strings,          host.console,
                    host.alerts,     host.analytics,        host.share,
                    host.pasteboard, host.zelkor,           host.silentTelephony};
  Platform::install(&platform);
  ZelkorWrapper& wrapper = ZelkorWrapper::sharedInstance();
  const auto delegate = std::make_shared<CountingDelegate>(mainQueue, kCount);
  wrapper.setDelegate(delegate);
  wrapper.listen();
  for (std::int64_t id = 0; id < kCount; ++id)
    host.zelkor.deliver(zelkor::kEventMetric, messageOf({{"kKeyMetricID", id}}));
  mainQueue.async([&] { wrapper.setDelegate(delegate); });  // while the library's thread looks at it
  mainQueue.run();
  EXPECT_EQ(delegate->count, kCount);
  host.zelkor.queue.reset();
  ZelkorWrapper::resetSharedInstance();
}

}  // namespace
}  // namespace quorl
