#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/NotificationCenter.h"
#include "capture/FakeSondrel.h"
#include "capture/SondrelService.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"

namespace quorl::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

/// Writes down what the service does to it.
class RecordingScreen final : public SondrelServiceProtocol {
 public:
  void didReceiveLogs(const std::vector<SondrelFileInformation>& batch) override {
    events.emplace_back("didReceiveLogs");
    batches.push_back(batch);
  }
  void showConfigOption(const std::vector<std::string>& list) override {
    events.emplace_back("showConfigOption");
    shown.push_back(list);
  }
  void setMaxNumberOfLogs(double count) override { limits.push_back(count); }
  void setSondrelConfigurations(std::vector<std::string> list) override {
    events.emplace_back("setSondrelConfigurations");
    configurations = std::move(list);
  }
  void present(Alert alert) override { alerts.push_back(std::move(alert)); }

  std::vector<std::string> events;
  std::vector<std::vector<SondrelFileInformation>> batches;
  std::vector<std::vector<std::string>> shown;
  std::vector<std::string> configurations;
  std::vector<double> limits;
  std::vector<Alert> alerts;
};

LogLine line(std::string text, LogLevel level = LogLevel::Default) {
  return {"sondrel", level, std::move(text)};
}

class SondrelServiceTest : public ::testing::Test {
 protected:
  void launch() {
    platform.platform.sondrel = &library;
    service = SondrelService::make();
    service->setDelegate(screen);
  }
  void loseScreen() { screen.reset(); }
  void terminate() { NotificationCenter::defaultCenter().post(notification::kWillTerminate); }

  FakePlatform platform;
  FakeSondrelFactory library;
  LogRecorder log;
  std::shared_ptr<RecordingScreen> screen = std::make_shared<RecordingScreen>();
  std::shared_ptr<SondrelService> service;
  const SondrelError error{"Capture is busy"};
};

TEST_F(SondrelServiceTest, MakesTheLibraryObjectAndBecomesItsDelegate) {
  launch();
  EXPECT_THAT(library.calls, ElementsAre("construct", "setDelegate"));
  EXPECT_EQ(library.delegate.lock(), service);
  EXPECT_NE(service->sondrel(), nullptr);
  EXPECT_EQ(service->timer(), nullptr) << "declared, and never started";
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, HoldsItsScreenWeakly) {
  launch();
  EXPECT_EQ(service->delegate(), screen);
  loseScreen();
  EXPECT_EQ(service->delegate(), nullptr);
}

TEST_F(SondrelServiceTest, StopsTheLibraryWhenTheProcessEndsAlsoWithoutACapture) {
  launch();
  terminate();
  EXPECT_EQ(library.calls.back(), "stop");
  EXPECT_THAT(log.lines(), ElementsAre(line("SondrelService - appwillTerminateNotification")));
}

TEST_F(SondrelServiceTest, SaysThatTheLibraryIsMissingOnlyWhenTheProcessEnds) {
  library.isAvailable = false;
  launch();
  EXPECT_EQ(service->sondrel(), nullptr);
  EXPECT_THAT(log.lines(), IsEmpty());
  terminate();
  EXPECT_THAT(log.lines(),
              ElementsAre(line("SondrelService - appwillTerminateNotification"), line("sondrel is not available")));
}

TEST_F(SondrelServiceTest, ADeviceWithoutTheLibraryIsLikeOneWhoseObjectIsMissing) {
  service = SondrelService::make();
  EXPECT_EQ(service->sondrel(), nullptr);
  terminate();
  EXPECT_TRUE(log.has("sondrel is not available"));
}

TEST_F(SondrelServiceTest, GoneItHearsNoEndOfTheProcess) {
  launch();
  service.reset();
  terminate();
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AStopIsOnlyLoggedAndAtErrorLevelAsMeant) {
  launch();
  service->didStateChanged(sondrel_state::kStopped, error, std::nullopt);
  EXPECT_THAT(log.lines(), ElementsAre(line("didStop", LogLevel::Error)));
  EXPECT_THAT(screen->alerts, IsEmpty());
}

TEST_F(SondrelServiceTest, AStopWithoutAScreenIsSilent) {
  launch();
  loseScreen();
  service->didStateChanged(sondrel_state::kStopped, std::nullopt, std::nullopt);
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AStartGivesTheScreenTheConfirmedLimit) {
  launch();
  SondrelConfiguration configuration;
  configuration.setMaxNumberOfLogs(300);
  service->didStateChanged(sondrel_state::kStarted, std::nullopt, configuration);
  EXPECT_THAT(screen->limits, ElementsAre(300.0));
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AStartWithoutAConfigurationLeavesTheLimit) {
  launch();
  service->didStateChanged(sondrel_state::kStarted, std::nullopt, std::nullopt);
  service->didStateChanged(sondrel_state::kStarted, std::nullopt, SondrelConfiguration());
  EXPECT_THAT(screen->limits, IsEmpty());
}

TEST_F(SondrelServiceTest, AStartWithoutAScreenDoesNothing) {
  launch();
  loseScreen();
  SondrelConfiguration configuration;
  configuration.setMaxNumberOfLogs(300);
  service->didStateChanged(sondrel_state::kStarted, std::nullopt, configuration);
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AnErrorStateShowsItsTextAsTheTitleAndTheMisspeltMessageAsMeant) {
  launch();
  service->didStateChanged(sondrel_state::kError, error, std::nullopt);
  EXPECT_THAT(log.lines(), ElementsAre(line("SondrelService - didStateChanged Capture is busy", LogLevel::Error)));
  ASSERT_THAT(screen->alerts, SizeIs(1));
  EXPECT_EQ(screen->alerts[0].title, "Capture is busy");
  EXPECT_EQ(screen->alerts[0].message, "Error Occured");
  EXPECT_EQ(screen->alerts[0].button, "Ok");
  EXPECT_FALSE(screen->alerts[0].onPress) << "the button only closes";
}

TEST_F(SondrelServiceTest, AnErrorStateWithoutAnErrorShowsNothing) {
  launch();
  service->didStateChanged(sondrel_state::kError, std::nullopt, std::nullopt);
  EXPECT_THAT(screen->alerts, IsEmpty());
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AnErrorStateWithoutAScreenIsLogged) {
  launch();
  loseScreen();
  service->didStateChanged(sondrel_state::kError, error, std::nullopt);
  EXPECT_TRUE(log.has(line("SondrelService - didStateChanged Capture is busy", LogLevel::Error)));
}

TEST_F(SondrelServiceTest, AnyOtherStateIsUnexpected) {
  launch();
  service->didStateChanged(3, error, std::nullopt);
  service->didStateChanged(-1, std::nullopt, std::nullopt);
  EXPECT_THAT(log.lines(),
              ElementsAre(line("didStateChanged - state: unexpected"), line("didStateChanged - state: unexpected")));
  EXPECT_THAT(screen->alerts, IsEmpty());
}

TEST_F(SondrelServiceTest, FilesGoToTheScreen) {
  launch();
  service->didCollectLogs({{logFile("a"), logFile("b")}}, std::nullopt);
  ASSERT_THAT(screen->batches, SizeIs(1));
  EXPECT_THAT(screen->batches[0], ElementsAre(logFile("a"), logFile("b")));
}

TEST_F(SondrelServiceTest, ABatchThatComesWithAnErrorIsDeliveredAndTheErrorDropped) {
  launch();
  service->didCollectLogs({{logFile("a")}}, error);
  EXPECT_THAT(screen->batches, SizeIs(1));
  EXPECT_THAT(screen->alerts, IsEmpty());
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AnEmptyBatchIsDelivered) {
  launch();
  service->didCollectLogs(std::vector<SondrelObject>{}, std::nullopt);
  EXPECT_THAT(screen->batches, ElementsAre(IsEmpty()));
}

TEST_F(SondrelServiceTest, ABatchWithOneForeignElementCountsAsNone) {
  launch();
  service->didCollectLogs({{logFile("a"), SondrelUnknownObject()}}, std::nullopt);
  service->didCollectLogs({{std::string("a"), logFile("b")}}, std::nullopt);
  EXPECT_THAT(screen->events, IsEmpty());
  service->didCollectLogs({{logFile("a"), SondrelUnknownObject()}}, error);
  EXPECT_THAT(screen->events, IsEmpty());
  EXPECT_THAT(screen->alerts, SizeIs(1));
}

TEST_F(SondrelServiceTest, AnErrorInPlaceOfABatchIsShownAndLoggedWithABlankBehindItAsMeant) {
  launch();
  service->didCollectLogs(std::nullopt, error);
  EXPECT_THAT(log.lines(), ElementsAre(line("SondrelService - didCollectLogs: Capture is busy ", LogLevel::Error)));
  ASSERT_THAT(screen->alerts, SizeIs(1));
  EXPECT_EQ(screen->alerts[0].title, "Capture is busy");
  EXPECT_EQ(screen->alerts[0].message, "Error Occured");
}

TEST_F(SondrelServiceTest, AnErrorInPlaceOfABatchIsLoggedWithoutAScreenToo) {
  launch();
  loseScreen();
  service->didCollectLogs(std::nullopt, error);
  EXPECT_THAT(log.lines(), ElementsAre(line("SondrelService - didCollectLogs: Capture is busy ", LogLevel::Error)));
}

TEST_F(SondrelServiceTest, NeitherBatchNorErrorIsNothing) {
  launch();
  service->didCollectLogs(std::nullopt, std::nullopt);
  EXPECT_THAT(screen->events, IsEmpty());
  EXPECT_THAT(screen->alerts, IsEmpty());
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AListOfConfigurationsIsKeptByTheScreenAndThenOffered) {
  launch();
  service->configurationListAvailable({{std::string("Default"), std::string("Voice")}});
  EXPECT_THAT(screen->events, ElementsAre("setSondrelConfigurations", "showConfigOption"));
  EXPECT_THAT(screen->configurations, ElementsAre("Default", "Voice"));
  EXPECT_THAT(screen->shown, ElementsAre(ElementsAre("Default", "Voice")));
  EXPECT_THAT(log.lines(), ElementsAre(line("configurationListAvailable")));
}

TEST_F(SondrelServiceTest, AnEmptyListOfConfigurationsIsOfferedToo) {
  launch();
  service->configurationListAvailable(std::vector<SondrelObject>{});
  EXPECT_THAT(screen->shown, ElementsAre(IsEmpty()));
}

TEST_F(SondrelServiceTest, AListThatIsNoListOfTextsIsNothing) {
  launch();
  service->configurationListAvailable(std::nullopt);
  service->configurationListAvailable({{std::string("Default"), logFile("a")}});
  EXPECT_THAT(screen->events, IsEmpty());
  EXPECT_THAT(log.lines(), IsEmpty());
}

TEST_F(SondrelServiceTest, AListWithoutAScreenIsOnlyLogged) {
  launch();
  loseScreen();
  service->configurationListAvailable({{std::string("Default")}});
  EXPECT_THAT(log.lines(), ElementsAre(line("configurationListAvailable")));
}

}  // namespace
}  // namespace quorl::test
