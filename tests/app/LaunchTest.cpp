#include <algorithm>
#include <chrono>
#include <cstdio>
#include <fstream>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/AppDelegate.h"
#include "app/ApplicationLoop.h"
#include "base/Log.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

using test::FakePlatform;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

using Script = std::vector<std::string>;

Script operator+(Script a, const Script& b) {
  a.insert(a.end(), b.begin(), b.end());
  return a;
}

/// Everything that can be seen of a start from outside, in one order: log lines as "category: text" ("!" before error
/// lines), calls of the baseband library, analytics events and dialogs.
class Transcript final : public LogSink {
 public:
  bool isEnabled(std::string_view, LogLevel) const override { return true; }
  void write(std::string_view category, LogLevel level, std::string_view text) override {
    lines.push_back((level == LogLevel::Error ? "!" : "") + std::string(category) + ": " + std::string(text));
  }
  Script take() { return std::exchange(lines, {}); }

  Script lines;
};

const Script kListen = {"library: RegisterEventHandler kEventTrigger", "library: RegisterEventHandler kEventMetric",
                        "library: EventsOff", "library: EventsOn"};

const Script kQuery = {
    "library: kCommandQueryMetric",
    "!: -[ZelkorWrapper querySpecificMetric:triggerRef:triggerType:triggerID:profileID:metricID:]: error=0 msg=",
    "metric-related: [QuorlInternal-4] querySpecificMetric success? TRUE errorCode if any 0"};

const Script kAdd = {"metric-related: [QuorlInternal-4] addVexilConfigForAppId begins",
                     "library: kCommandAddConfiguration",
                     "!: -[ZelkorWrapper addVexilConfigForAppId:andProtofFilePath:]: error=0 msg=",
                     "metric-related: [QuorlInternal-4] addVexilConfigForAppId success? TRUE"};

const Script kRemove = {"library: kCommandClearConfiguration",
                        "!: -[ZelkorWrapper removeVexilConfigForAppid:]: error=0 msg=",
                        "metric-related: [QuorlInternal-4] removeVexilConfigForAppid success? TRUE"};

Script hardware(const std::string& chipset, const std::string& deviceClass, bool isMav) {
  return {"general: Hardware manager - init - basebandchipset: " + chipset + " - deviceClass: " + deviceClass +
              " - isMavDevice: " + (isMav ? "1" : "0"),
          "sondrel: Base view controller - is sondrel available FALSE"};
}

const Script kObjects = Script{"library: CreateManager", "database: Successfully opened connection to database.",
                               "horvane-service: HorvaneService - init"} +
                        kListen + Script{"metric-service: MetricService -  init()"};

const Script kMissingConfiguration = {"!metric-related: Metric Log File path doesn't exist"};

Script shown(const std::string& deviceType) {
  return {"metric-related: device type: " + deviceType, "general: Appdelegate - instantiated root view controller",
          "analytics: com.ardent.quorlMenu.appLaunch"};
}

Script startedChannel(const std::string& configuration) {
  return kAdd + kListen + kQuery +
         Script{"metric-related: successfully started listening Zelkor " + configuration + " config name"};
}

const Script kActivated = Script{"general: Appdelegate - applicationDidBecomeActive"} + kAdd + kListen + kQuery +
                          Script{"metric-related: successfully started listening Zelkor applicationDidBecomeActive"};

const Script kStoreSettled = {"!database: MetricV20 table created.", "!database: Dashboard table created.",
                              "database: successfully created tables", "database: successfully deleted older rows"};

class LaunchTest : public ::testing::Test {
 protected:
  LaunchTest() : transcript_(std::make_shared<Transcript>()) {
    previous_ = installLogSink(transcript_);
    phone_.zelkor.onCall = [this](const std::string& call) { transcript_->lines.push_back("library: " + call); };
    phone_.analytics.onSend = [this](std::string_view event) {
      transcript_->lines.push_back("analytics: " + std::string(event));
    };
    phone_.alerts.onPresent = [this](const Alert& alert) {
      transcript_->lines.push_back("dialog: " + alert.title + " | " + alert.message + " | " + alert.button);
    };
  }
  ~LaunchTest() override {
    application_.reset();
    installLogSink(previous_);
  }

  void isDevice(const std::string& chipset) { phone_.properties.texts["BasebandChipset"] = chipset; }
  void hasConfiguration(const std::string& name) {
    const auto path = phone_.directory.path() / (name + ".deviceconfig");
    std::ofstream(path) << "metrics";
    phone_.resources.files[name + ".deviceconfig"] = path;
  }
  void launch() {
    application_ = std::make_unique<AppDelegate>();
    ApplicationLoop(*application_).launch();
  }
  ApplicationLoop loop() { return ApplicationLoop(*application_); }

  FakePlatform phone_;
  std::shared_ptr<Transcript> transcript_;
  std::shared_ptr<LogSink> previous_;
  std::unique_ptr<AppDelegate> application_;
};

TEST_F(LaunchTest, AMavDeviceMakesItsObjectsAndAsksForMetricsInOrder) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  launch();
  EXPECT_THAT(transcript_->take(), ElementsAreArray(hardware("mav20", "Quillo", true) + kObjects +
                                                    startedChannel("Quorl2") + shown("mav") + kActivated));
  phone_.time.settle();
  EXPECT_THAT(transcript_->take(), ElementsAreArray(kStoreSettled));
}

TEST_F(LaunchTest, AnIceDeviceUsesItsOwnConfigurationAndTrigger) {
  isDevice("ice15");
  phone_.properties.texts["DeviceClass"] = "Tabrin";
  hasConfiguration("Quorl1");
  launch();
  EXPECT_THAT(transcript_->take(), ElementsAreArray(hardware("ice15", "Tabrin", false) + kObjects +
                                                    startedChannel("Quorl1") + shown("ice") + kActivated));
  EXPECT_EQ(phone_.zelkor.commands.back().message.integer(zelkor::kKeyTriggerID), 8323091);
}

TEST_F(LaunchTest, ADeviceThatIsNeitherRunsWithTheMavConstantsAndWithoutADialog) {
  isDevice("other");
  hasConfiguration("Quorl2");
  launch();
  EXPECT_THAT(transcript_->take(), ElementsAreArray(hardware("other", "Quillo", false) + kObjects +
                                                    startedChannel("Quorl2") + shown("mav") + kActivated));
  EXPECT_EQ(phone_.zelkor.commands.back().message.integer(zelkor::kKeyTriggerID), 5202011);
  EXPECT_THAT(phone_.alerts.shown, IsEmpty());
}

TEST_F(LaunchTest, AnUnknownDeviceShowsTheDialogOverTheRunningProgram) {
  hasConfiguration("Quorl2");
  launch();
  const Script dialog = {
      "general: Hardware manager - init - unknown chipset: unknown - deviceClass: Quillo throwing error",
      "dialog: Error Occured | Unable to get baseband information. Please try again or file a bug report. | Done"};
  EXPECT_THAT(transcript_->take(), ElementsAreArray(hardware("unknown", "Quillo", false) + kObjects +
                                                    startedChannel("Quorl2") + shown("mav") + dialog + kActivated));
  phone_.time.settle();
  EXPECT_THAT(transcript_->take(), ElementsAreArray(kStoreSettled));
}

TEST_F(LaunchTest, DoneEndsTheProcessOfAnUnknownDevice) {
  hasConfiguration("Quorl2");
  launch();
  ASSERT_THAT(phone_.alerts.shown, SizeIs(1));
  installLogSink(nullptr);
  EXPECT_DEATH(phone_.alerts.shown.front().onPress(), "Fatal error: unknown baseband");
}

TEST_F(LaunchTest, TheDialogsLineIsLoggedBeforeTheProcessEnds) {
  launch();
  ASSERT_THAT(phone_.alerts.shown, SizeIs(1));
  struct Printer final : LogSink {
    bool isEnabled(std::string_view, LogLevel) const override { return true; }
    void write(std::string_view category, LogLevel, std::string_view text) override {
      std::fprintf(stderr, "%s: %s\n", std::string(category).c_str(), std::string(text).c_str());
    }
  };
  installLogSink(std::make_shared<Printer>());
  EXPECT_DEATH(phone_.alerts.shown.front().onPress(), "general: Appdelegate - error dialog - unknown baseband");
}

TEST_F(LaunchTest, WithoutTheResourceTwoLinesAreLoggedAndOnlyTheDelayedRefreshAsks) {
  isDevice("mav20");
  launch();
  const Script activation = Script{"general: Appdelegate - applicationDidBecomeActive"} + kMissingConfiguration;
  EXPECT_THAT(transcript_->take(), ElementsAreArray(hardware("mav20", "Quillo", true) + kObjects +
                                                    kMissingConfiguration + shown("mav") + activation));
  phone_.time.advance(9999ms);
  EXPECT_THAT(phone_.zelkor.commands, IsEmpty());
  transcript_->take();
  phone_.time.advance(1ms);
  EXPECT_THAT(transcript_->take(), ElementsAreArray(kQuery));
}

TEST_F(LaunchTest, ALaunchListensThreeTimes) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  launch();
  EXPECT_EQ(std::count(phone_.zelkor.calls.begin(), phone_.zelkor.calls.end(), "EventsOn"), 3);
}

TEST_F(LaunchTest, ASnapshotIsAskedForTwiceInALaunchAndOnceMoreTenSecondsAfterTheRootViewLoaded) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  launch();
  const auto queries = [this] {
    return std::count(phone_.zelkor.calls.begin(), phone_.zelkor.calls.end(), "kCommandQueryMetric");
  };
  EXPECT_EQ(queries(), 2);
  phone_.time.advance(9999ms);
  EXPECT_EQ(queries(), 2);
  phone_.time.advance(1ms);
  EXPECT_EQ(queries(), 3);
  const zelkor::KeyValueMessage& message = phone_.zelkor.commands.back().message;
  EXPECT_EQ(message.integer(zelkor::kKeyTriggerRef), 9999);
  EXPECT_EQ(message.integer(zelkor::kKeyTriggerType), 0);
  EXPECT_EQ(message.integer(zelkor::kKeyTriggerID), 5202011);
  EXPECT_EQ(message.integer(zelkor::kKeyProfileID), 0);
  EXPECT_EQ(message.integer(zelkor::kKeyMetricID), 0);
  phone_.time.advance(1h);
  EXPECT_EQ(queries(), 3);
}

TEST_F(LaunchTest, TheTimersSelectorAsksForTheSameSnapshot) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  launch();
  const zelkor::KeyValueMessage first = phone_.zelkor.commands.back().message;
  transcript_->take();
  application_->window()->rootViewController()->firstTimerMetricRefresh();
  EXPECT_THAT(transcript_->take(), ElementsAreArray(kQuery));
  EXPECT_EQ(phone_.zelkor.commands.back().message, first);
}

TEST_F(LaunchTest, BackgroundThenForegroundIsOneClearThenOneAddOneListenAndOneQuery) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  launch();
  phone_.time.settle();
  transcript_->take();
  loop().resignActive();
  loop().enterBackground();
  loop().enterForeground();
  loop().becomeActive();
  EXPECT_THAT(transcript_->take(),
              ElementsAreArray(Script{"general: Appdelegate - applicationDidEnterBackground"} + kRemove + kActivated));
}

TEST_F(LaunchTest, TerminationWithdrawsTheSubscriptionAndLeavesDeliveryOn) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  launch();
  phone_.time.settle();
  transcript_->take();
  loop().terminate();
  EXPECT_THAT(transcript_->take(),
              ElementsAreArray(Script{"general: Appdelegate - applicationWillTerminate"} + kRemove));
}

TEST_F(LaunchTest, ARefusedConfigurationEndsTheStepWithoutListeningOrAsking) {
  isDevice("mav20");
  hasConfiguration("Quorl2");
  phone_.zelkor.answers["kCommandAddConfiguration"] = {22, "no such metric"};
  launch();
  const Script refused = {"metric-related: [QuorlInternal-4] addVexilConfigForAppId begins",
                          "library: kCommandAddConfiguration",
                          "!: -[ZelkorWrapper addVexilConfigForAppId:andProtofFilePath:]: error=22 msg=no such metric",
                          "metric-related: [QuorlInternal-4] addVexilConfigForAppId success? FALSE"};
  EXPECT_THAT(transcript_->take(),
              ElementsAreArray(hardware("mav20", "Quillo", true) + kObjects + refused + shown("mav") +
                               Script{"general: Appdelegate - applicationDidBecomeActive"} + refused));
}

TEST_F(LaunchTest, LaunchAnswersTrueAndLeavesTheWrapperFieldUnassigned) {
  AppDelegate application;
  EXPECT_EQ(application.window(), nullptr);
  EXPECT_TRUE(application.onLaunch());
  ASSERT_NE(application.window(), nullptr);
  EXPECT_TRUE(application.window()->isVisible());
  EXPECT_EQ(application.zelkorManager(), nullptr);
  EXPECT_EQ(application.window()->rootViewController()->tint(), "ButtonSelected");
  EXPECT_EQ(application.window()->rootViewController()->barTint(), "Background");
}

TEST_F(LaunchTest, AnalyticsHearOfEachLaunchOnceWithAnEmptyPayload) {
  launch();
  phone_.time.advance(1h);
  ASSERT_THAT(phone_.analytics.sent, SizeIs(1));
  EXPECT_EQ(phone_.analytics.sent.front().first, "com.ardent.quorlMenu.appLaunch");
  EXPECT_THAT(phone_.analytics.sent.front().second, IsEmpty());
}

}  // namespace
}  // namespace quorl
