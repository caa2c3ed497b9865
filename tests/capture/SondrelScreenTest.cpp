#include <chrono>
#include <cmath>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "capture/FakeSondrel.h"
#include "capture/SondrelViewController.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using Action = SondrelViewController::Action;

LogLine uiLine(std::string text) {
  return {"app-ui", LogLevel::Default, std::move(text)};
}

std::vector<SondrelFileInformation> files(std::size_t count, const std::string& prefix = "log") {
  std::vector<SondrelFileInformation> batch;
  for (std::size_t index = 0; index < count; ++index) batch.push_back(logFile(prefix + std::to_string(index)));
  return batch;
}

class SondrelScreenTest : public ::testing::Test {
 protected:
  SondrelScreenTest() {
    platform.platform.sondrel = &library;
    connections.push_back(screen->onReload([this] { events.push_back("reload " + std::to_string(rows())); }));
    connections.push_back(screen->onBlink([this](Action action) {
      const char* const names[] = {"start", "stop", "reset"};
      events.push_back(std::string("blink ") + names[static_cast<std::size_t>(action)]);
    }));
    connections.push_back(screen->onPresentModal(
        [this](std::shared_ptr<MultiChoiceSelectionModal> presented) { modal = std::move(presented); }));
  }

  void opens() {
    screen->viewDidLoad();
    library.calls.clear();
    library.onCall = [this](const std::string& call) { events.push_back(call); };
  }
  void libraryConfirms(double limit) {
    SondrelConfiguration configuration;
    configuration.setMaxNumberOfLogs(limit);
    screen->sondrelService()->didStateChanged(sondrel_state::kStarted, std::nullopt, configuration);
  }
  void receives(const std::vector<SondrelFileInformation>& batch) { screen->didReceiveLogs(batch); }
  void libraryOffers(std::vector<SondrelObject> list) {
    screen->sondrelService()->configurationListAvailable(std::move(list));
  }
  void passes(std::chrono::milliseconds duration) { platform.time.advance(duration); }

  std::size_t rows() const { return screen->numberOfRows(); }
  std::vector<std::string> names() const {
    std::vector<std::string> result;
    for (std::size_t index = 0; index < rows(); ++index) result.push_back(screen->sondrelData()->at(index).fileName);
    return result;
  }

  FakePlatform platform;
  FakeSondrelFactory library;
  LogRecorder log;
  std::shared_ptr<SondrelViewController> screen = SondrelViewController::make();
  std::vector<std::string> events;
  std::shared_ptr<MultiChoiceSelectionModal> modal;
  std::vector<Connection> connections;
};

TEST_F(SondrelScreenTest, FirstShowsItsStartValues) {
  EXPECT_EQ(screen->sondrelService(), nullptr);
  opens();
  EXPECT_NE(screen->sondrelService(), nullptr);
  EXPECT_EQ(screen->sondrelService()->delegate(), screen);
  EXPECT_EQ(screen->sondrelData(), std::nullopt);
  EXPECT_THAT(screen->sondrelConfigurations(), IsEmpty());
  EXPECT_EQ(screen->currentLogConfiguration(), "Default");
  EXPECT_EQ(screen->loadingViewContext(), "");
  EXPECT_EQ(screen->maxNumberOfLogs(), 0);
  EXPECT_EQ(screen->configButtonTitle(), (HighlightedText{"Log Configuration: ", "Default", ""}));
  EXPECT_EQ(screen->maxLogsLabel(), (HighlightedText{"Max log file: 256 files", "", ""}));
  EXPECT_FALSE(screen->loadingView().isHidden());
  EXPECT_FALSE(screen->loadingView().isAnimating());
  EXPECT_EQ(screen->loadingView().loadingLabelText(), "Choose log config or press start");
}

TEST_F(SondrelScreenTest, ItsServiceIsMadeOnce) {
  screen->viewDidLoad();
  screen->viewDidLoad();
  EXPECT_THAT(library.calls, ElementsAre("construct", "setDelegate"));
}

TEST_F(SondrelScreenTest, TheTransitionOfTheChoiceHasTheColourOfTheScreen) {
  EXPECT_EQ(screen->transition().circleColor(), "Background");
}

// Sliders.

TEST_F(SondrelScreenTest, TheSlidersHaveTheirLimits) {
  EXPECT_EQ(screen->chunkFileSlider().minimum(), 32);
  EXPECT_EQ(screen->chunkFileSlider().maximum(), 1024);
  EXPECT_EQ(screen->chunkFileSlider().value(), 32);
  EXPECT_EQ(screen->maxLogsSlider().minimum(), 256);
  EXPECT_EQ(screen->maxLogsSlider().maximum(), 8192);
  EXPECT_EQ(screen->maxLogsSlider().value(), 256);
}

TEST_F(SondrelScreenTest, TheChunkLabelSaysMbUntilTheFirstMoveAndKbAfterwardsAsMeant) {
  EXPECT_EQ(screen->chunkFileLabel().text(), "Chunk file size: 32 Mb");
  screen->didChangedChunkFileSliderValue(32);
  EXPECT_EQ(screen->chunkFileLabel().text(), "Chunk file size: 32 Kb");
}

TEST_F(SondrelScreenTest, TheChunkSliderSnapsToMultiplesOf32HalvesGoingUp) {
  const std::pair<double, double> moves[] = {{32, 32},   {47.9, 32},    {48, 64},     {79.99, 64}, {80, 96},
                                             {512, 512}, {1007.9, 992}, {1008, 1024}, {1024, 1024}};
  for (const auto& [moved, taken] : moves) {
    screen->didChangedChunkFileSliderValue(moved);
    EXPECT_EQ(screen->chunkFileSlider().value(), taken) << moved;
  }
  EXPECT_EQ(screen->chunkFileLabel().text(), "Chunk file size: 1024 Kb");
}

TEST_F(SondrelScreenTest, TheMaximumSliderSnapsToIntegersHalvesGoingUp) {
  const std::pair<double, double> moves[] = {{256.5, 257}, {300.4, 300}, {1024, 1024}, {1024.4, 1024}, {8192, 8192}};
  for (const auto& [moved, taken] : moves) {
    screen->didChangedMaxLogsSlider(moved);
    EXPECT_EQ(screen->maxLogsSlider().value(), taken) << moved;
  }
  EXPECT_EQ(screen->maxLogsLabel().text(), "Max log file: 8192 files");
}

TEST_F(SondrelScreenTest, ASliderStaysWithinItsLimits) {
  screen->didChangedChunkFileSliderValue(5000);
  EXPECT_EQ(screen->chunkFileSlider().value(), 1024);
  screen->didChangedMaxLogsSlider(32);
  EXPECT_EQ(screen->maxLogsSlider().value(), 256);
  screen->didChangedMaxLogsSlider(std::nan(""));
  EXPECT_EQ(screen->maxLogsSlider().value(), 256);
}

TEST_F(SondrelScreenTest, MovesAreToldToTheView) {
  int changes = 0;
  const Connection connection = screen->onChange([&] { ++changes; });
  screen->didChangedChunkFileSliderValue(64);
  screen->didChangedMaxLogsSlider(300);
  EXPECT_EQ(changes, 2);
}

// Buttons.

TEST_F(SondrelScreenTest, StartEmptiesTheListThenBlinksAndStartsTheLibraryAfterThreeTenthsOfASecond) {
  opens();
  receives(files(2));
  events.clear();
  log.clear();
  screen->didTapStart();
  EXPECT_THAT(events, ElementsAre("reload 0", "blink start"));
  EXPECT_THAT(log.lines(), ElementsAre(uiLine("SondrelViewController - didTapStart")));
  passes(299ms);
  EXPECT_THAT(library.started, IsEmpty());
  passes(1ms);
  ASSERT_THAT(library.started, SizeIs(1));
  EXPECT_EQ(log.lines().back(), (LogLine{"sondrel", LogLevel::Default, "SondrelService - initializeLogger"}));
  EXPECT_TRUE(screen->loadingView().isHidden()) << "as it was after files";
}

TEST_F(SondrelScreenTest, StartBeforeAnyFileLeavesTheListNoneAndTheLoadingView) {
  opens();
  screen->didTapStart();
  EXPECT_EQ(screen->sondrelData(), std::nullopt);
  EXPECT_THAT(events, ElementsAre("reload 0", "blink start"));
  EXPECT_FALSE(screen->loadingView().isHidden());
}

TEST_F(SondrelScreenTest, StartWithUntouchedSlidersPasses32And256) {
  opens();
  screen->didTapStart();
  passes(300ms);
  ASSERT_THAT(library.started, SizeIs(1));
  EXPECT_EQ(library.started[0].activeConfig(), "Default");
  EXPECT_EQ(library.started[0].chunkFileSize(), 32.0);
  EXPECT_EQ(library.started[0].maxNumberOfLogs(), 256.0);
}

TEST_F(SondrelScreenTest, StartPassesWhatIsChosenWhenItsDelayEnds) {
  opens();
  screen->didTapStart();
  screen->didChangedChunkFileSliderValue(96);
  screen->didChangedMaxLogsSlider(300);
  screen->didSelectChoice("Voice");
  passes(300ms);
  ASSERT_THAT(library.started, SizeIs(1));
  EXPECT_EQ(library.started[0].activeConfig(), "Voice");
  EXPECT_EQ(library.started[0].chunkFileSize(), 96.0);
  EXPECT_EQ(library.started[0].maxNumberOfLogs(), 300.0);
}

TEST_F(SondrelScreenTest, StartWhileRunningStartsAgain) {
  opens();
  screen->didTapStart();
  passes(1s);
  screen->didTapStart();
  passes(1s);
  EXPECT_THAT(library.calls, ElementsAre("start", "start"));
}

TEST_F(SondrelScreenTest, ABlinkGoesTwiceDownToATenthAndBack) {
  EXPECT_EQ(SondrelViewController::kBlinkDurationS, 0.8);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(0), 1);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(0.125), 0.55);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(0.25), 0.1);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(0.375), 0.55);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(0.5), 1);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(0.75), 0.1);
  EXPECT_DOUBLE_EQ(SondrelViewController::opacityOfBlink(1), 1);
  EXPECT_GT(SondrelViewController::opacityOfBlink(0.01), 0.99) << "eased at its beginning";
  EXPECT_LT(SondrelViewController::opacityOfBlink(0.24), 0.11) << "and at its end";
}

TEST_F(SondrelScreenTest, StopBlinksAndStopsTheLibraryAndLeavesTheList) {
  opens();
  receives(files(2));
  events.clear();
  log.clear();
  screen->didTapStop();
  EXPECT_THAT(events, ElementsAre("blink stop"));
  EXPECT_THAT(log.lines(), ElementsAre(uiLine("SondrelViewController - didTapStop")));
  passes(299ms);
  EXPECT_THAT(library.calls, IsEmpty());
  passes(1ms);
  EXPECT_THAT(library.calls, ElementsAre("stop"));
  EXPECT_EQ(rows(), 2U);
  EXPECT_THAT(events, ElementsAre("blink stop", "stop"));
}

TEST_F(SondrelScreenTest, ResetDiscardsTheLogsThenCleansTheScreen) {
  opens();
  receives(files(2));
  screen->loadingView().setLoadingLabelText("something else");
  screen->didChangedChunkFileSliderValue(96);
  screen->didChangedMaxLogsSlider(300);
  screen->didSelectChoice("Voice");
  events.clear();
  log.clear();
  screen->didTapReset();
  EXPECT_THAT(events, ElementsAre("blink reset"));
  EXPECT_EQ(rows(), 2U);
  passes(300ms);
  EXPECT_THAT(events, ElementsAre("blink reset", "reset", "reload 0"));
  EXPECT_THAT(log.lines(), ElementsAre(uiLine("SondrelViewController - didTapReset"),
                                       uiLine("SondrelViewController - cleanupUIAfterReset")));
  ASSERT_TRUE(screen->sondrelData());
  EXPECT_THAT(*screen->sondrelData(), IsEmpty());
  EXPECT_FALSE(screen->loadingView().isHidden());
  EXPECT_FALSE(screen->loadingView().isAnimating());
  EXPECT_EQ(screen->loadingView().loadingLabelText(), "Choose log config or press start");
  EXPECT_EQ(screen->chunkFileSlider().value(), 96);
  EXPECT_EQ(screen->maxLogsSlider().value(), 300);
  EXPECT_EQ(screen->currentLogConfiguration(), "Voice");
}

TEST_F(SondrelScreenTest, ResetBeforeAnyFileLeavesTheListNone) {
  opens();
  screen->didTapReset();
  passes(300ms);
  EXPECT_EQ(screen->sondrelData(), std::nullopt);
  receives(files(300));
  EXPECT_EQ(rows(), 300U) << "still the first batch";
}

TEST_F(SondrelScreenTest, WithoutTheLibraryNothingHappensButWhatTheScreenDoesItself) {
  library.isAvailable = false;
  opens();
  screen->didTapStart();
  screen->didTapStop();
  screen->didTapConfig();
  passes(1s);
  EXPECT_FALSE(log.has("SondrelService - initializeLogger"));
  screen->didTapReset();
  passes(1s);
  EXPECT_TRUE(log.has("SondrelViewController - cleanupUIAfterReset"));
  EXPECT_THAT(library.calls, IsEmpty());
}

TEST_F(SondrelScreenTest, BeforeItsServiceIsMadePressesDoNothing) {
  screen->didTapStart();
  screen->didTapStop();
  screen->didTapReset();
  screen->didTapConfig();
  passes(1s);
  EXPECT_THAT(library.calls, IsEmpty());
  EXPECT_FALSE(log.has("SondrelService - initializeLogger"));
}

TEST_F(SondrelScreenTest, AScreenThatIsGoneStartsNothing) {
  opens();
  screen->didTapStart();
  screen.reset();
  passes(1s);
  EXPECT_THAT(library.started, IsEmpty());
}

// The configuration choice.

TEST_F(SondrelScreenTest, TheConfigurationButtonAsksTheLibraryWhoseAnswerOpensTheChoice) {
  opens();
  log.clear();
  screen->didTapConfig();
  EXPECT_THAT(library.calls, ElementsAre("getConfigurationList"));
  EXPECT_EQ(modal, nullptr);
  libraryOffers({std::string("Default"), std::string("Voice")});
  ASSERT_NE(modal, nullptr);
  EXPECT_THAT(modal->tableViewData(), ElementsAre("Default", "Voice"));
  EXPECT_THAT(screen->sondrelConfigurations(), ElementsAre("Default", "Voice"));
  EXPECT_THAT(log.lines(), ElementsAre(uiLine("SondrelViewController - didTapConfig"),
                                       LogLine({"sondrel", LogLevel::Default, "configurationListAvailable"}),
                                       uiLine("SondrelViewController - showConfigOption")));
}

TEST_F(SondrelScreenTest, AnEmptyListOpensTheChoiceToo) {
  opens();
  libraryOffers({});
  ASSERT_NE(modal, nullptr);
  EXPECT_THAT(modal->tableViewData(), IsEmpty());
}

TEST_F(SondrelScreenTest, AChosenNameIsPutInTheButtonAndColoured) {
  opens();
  libraryOffers({std::string("Default"), std::string("Voice")});
  int closed = 0;
  const Connection connection = modal->onDismiss([&] { ++closed; });
  modal->didSelectRow(1);
  EXPECT_EQ(closed, 1);
  EXPECT_EQ(screen->currentLogConfiguration(), "Voice");
  EXPECT_EQ(screen->configButtonTitle(), (HighlightedText{"Log Configuration: ", "Voice", ""}));
}

TEST_F(SondrelScreenTest, TheRuleOfTheColourHoldsForTheLabelsTooAsMeant) {
  screen->didSelectChoice("FILE");
  EXPECT_EQ(screen->chunkFileLabel().highlighted, "") << "coloured with its next text";
  screen->didChangedChunkFileSliderValue(64);
  EXPECT_EQ(screen->chunkFileLabel(), (HighlightedText{"Chunk ", "file", " size: 64 Kb"}));
  screen->didChangedMaxLogsSlider(300);
  EXPECT_EQ(screen->maxLogsLabel(), (HighlightedText{"Max log ", "file", ": 300 files"}));
}

// Files.

TEST_F(SondrelScreenTest, FilesHideTheLoadingViewAndFillTheList) {
  opens();
  events.clear();
  log.clear();
  receives(files(2));
  EXPECT_THAT(names(), ElementsAre("log0", "log1"));
  EXPECT_TRUE(screen->loadingView().isHidden());
  EXPECT_THAT(events, ElementsAre("reload 2"));
  EXPECT_THAT(log.lines(), ElementsAre(uiLine("SondrelViewController - didReceiveLogs")));
}

TEST_F(SondrelScreenTest, AFirstBatchMayExceedTheMaximum) {
  opens();
  libraryConfirms(2);
  receives(files(5));
  EXPECT_EQ(rows(), 5U);
}

TEST_F(SondrelScreenTest, BatchesBelowTheMaximumAreAppended) {
  opens();
  libraryConfirms(4);
  receives(files(2, "a"));
  receives(files(1, "b"));
  EXPECT_THAT(names(), ElementsAre("a0", "a1", "b0"));
  receives(files(3, "c"));
  EXPECT_THAT(names(), ElementsAre("a0", "a1", "b0", "c0", "c1", "c2")) << "the count before the batch decides";
}

TEST_F(SondrelScreenTest, AWrappedListShowsTheNewestBatchTwiceAsMeant) {
  opens();
  libraryConfirms(3);
  receives(files(3, "a"));
  events.clear();
  log.clear();
  receives(files(2, "b"));
  EXPECT_THAT(names(), ElementsAre("b0", "b1", "b0", "b1"));
  EXPECT_THAT(events, ElementsAre("reload 2", "reload 4"));
  EXPECT_THAT(log.lines(), ElementsAre(uiLine("SondrelViewController - didReceiveLogs"),
                                       uiLine("SondrelViewController - checkIfReachedMax - maxReached: 5")));
}

TEST_F(SondrelScreenTest, BeforeTheLibraryHasConfirmedAStartAnySecondBatchWraps) {
  opens();
  receives(files(1, "a"));
  receives(files(1, "b"));
  EXPECT_THAT(names(), ElementsAre("b0", "b0"));
}

TEST_F(SondrelScreenTest, TheSliderIsNoLimitOfTheList) {
  opens();
  libraryConfirms(2);
  screen->didChangedMaxLogsSlider(8192);
  receives(files(2, "a"));
  receives(files(1, "b"));
  EXPECT_THAT(names(), ElementsAre("b0", "b0"));
}

TEST_F(SondrelScreenTest, AnEmptiedListIsNoFirstBatch) {
  opens();
  receives(files(3));
  screen->didTapStart();
  receives(files(2, "b"));
  EXPECT_THAT(names(), ElementsAre("b0", "b1", "b0", "b1")) << "the limit is still 0";
}

TEST_F(SondrelScreenTest, AnEmptyBatchShowsTheLoadingViewOverTheListAsItWas) {
  opens();
  libraryConfirms(10);
  receives(files(2));
  receives({});
  EXPECT_THAT(names(), ElementsAre("log0", "log1"));
  EXPECT_FALSE(screen->loadingView().isHidden());
}

TEST_F(SondrelScreenTest, AnEmptyFirstBatchIsABatch) {
  opens();
  receives({});
  ASSERT_TRUE(screen->sondrelData());
  EXPECT_FALSE(screen->loadingView().isHidden());
}

TEST_F(SondrelScreenTest, ARowShowsNameSizeAndTimeWithoutASpinner) {
  const ScopedTimeZone zone("America/New_York");
  const ScopedLocale locale("en_US");
  opens();
  receives({logFile("000001-Default.chunk")});
  EXPECT_EQ(screen->rowAt(0), (FavoritesTableCellV2{"File name: 000001-Default.chunk", "File Size: 32 KB",
                                                    "Jan 5, 2026, 4:30:12\u202fAM", true}));
}

TEST_F(SondrelScreenTest, TheTimeOfARowFollowsZoneAndLocale) {
  const ScopedTimeZone zone("Asia/Tokyo");
  const ScopedLocale locale("de_DE");
  opens();
  receives({logFile("a")});
  EXPECT_EQ(screen->rowAt(0).valueLabel, "05.01.2026, 18:30:12");
}

TEST_F(SondrelScreenTest, AnErrorOfTheLibraryIsAnAlertOverTheScreen) {
  opens();
  screen->sondrelService()->didStateChanged(sondrel_state::kError, SondrelError{"Disk full"}, std::nullopt);
  ASSERT_THAT(platform.alerts.shown, SizeIs(1));
  EXPECT_EQ(platform.alerts.shown[0].title, "Disk full");
  EXPECT_EQ(platform.alerts.shown[0].message, "Error Occured");
  EXPECT_EQ(platform.alerts.shown[0].button, "Ok");
}

}  // namespace
}  // namespace quorl::test
