#include <QAbstractItemModelTester>
#include <QTest>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <filesystem>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "capture/SondrelViewController.h"
#include "capture/view/SondrelBinding.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "shell/view/Appearance.h"
#include "support/TimeZoneAndLocale.h"
#include "support/window/WindowFixture.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::SizeIs;

SondrelFileInformation file(int number) {
  return {"log" + std::to_string(number), "32 KB", Date(1767605412s)};
}

std::vector<SondrelFileInformation> files(int first, int count) {
  std::vector<SondrelFileInformation> batch;
  for (int number = first; number < first + count; ++number) batch.push_back(file(number));
  return batch;
}

TEST(FileListModelTest, KeepsTheRulesOfAModel) {
  const test::FakePlatform platform;
  const auto screen = SondrelViewController::make();
  view::SondrelBinding binding(screen);
  const QAbstractItemModelTester tester(binding.files(), QAbstractItemModelTester::FailureReportingMode::Fatal);
  screen->setMaxNumberOfLogs(6);
  int resets = 0;
  QObject::connect(binding.files(), &QAbstractItemModel::modelReset, [&] { ++resets; });
  screen->didReceiveLogs(files(1, 3));
  screen->didReceiveLogs(files(4, 3));
  EXPECT_EQ(binding.files()->rowCount(), 6);
  EXPECT_EQ(resets, 0) << "files that are added leave the others alone";
  screen->didReceiveLogs(files(7, 2));
  EXPECT_EQ(binding.files()->rowCount(), 4) << "the doubled batch of a wrap";
  screen->didReceiveLogs({});
  screen->didTapStart();
  EXPECT_EQ(binding.files()->rowCount(), 0);
}

/// The third tab of a device with log capture: a chunk each half second, four to a batch.
class CaptureWindowTest : public test::WindowTest {
 protected:
  CaptureWindowTest() {
    isInternalBuild();
    hasLogCapture();
    hasRoomFor(std::numeric_limits<std::uint64_t>::max());
  }

  /// Before `opens`.
  void hasRoomFor(std::uint64_t bytes) {
    simulator::SondrelSimulator::Options options;
    options.folder = phone.directory.path() / "Sondrel";
    options.capacity = bytes;
    library_ = std::make_unique<simulator::SondrelSimulator>(options, *phone.mainQueue, phone.time, phone.time);
    Platform::current().sondrel = library_.get();
  }
  void opens() {
    launch();
    grab();  // lays out what stands under one another
    tap("menuCell2");
    pass(1s);
    grab();
  }
  void opensChoice() {
    tap("configButton");
    pass(1s);
    grab();
  }
  /// The rows that are in sight, laid out.
  std::vector<QQuickItem*> rows() {
    grab();
    return findAll("fileRow");
  }
  std::vector<std::string> rowTexts(const QString& label) {
    std::vector<std::string> result;
    for (QQuickItem* row : rows()) result.push_back(find(label, row)->property("text").toString().toStdString());
    return result;
  }
  std::string firstRowText(const QString& label) {
    const auto texts = rowTexts(label);
    return texts.empty() ? "no row" : texts.front();
  }
  double opacity(const QString& name) { return find(name)->opacity(); }
  double value(const QString& slider) { return find(slider)->property("value").toDouble(); }
  /// Puts a finger on the thumb, moves it to `part` of the way, and lifts it.
  void drags(const QString& name, double part) {
    QQuickItem* slider = find(name);
    auto* handle = slider->property("handle").value<QQuickItem*>();
    const auto at = [&](double x) { return slider->mapToScene(QPointF(x, slider->height() / 2)).toPoint(); };
    const double travel = slider->width() - handle->width();
    const double from = handle->x() + handle->width() / 2;
    const double to = handle->width() / 2 + part * travel;
    QTest::mousePress(&window(), Qt::LeftButton, Qt::NoModifier, at(from));
    for (int step = 1; step <= 8; ++step) {
      QTest::mouseMove(&window(), at(from + (to - from) * step / 8));
      settle();
    }
    QTest::mouseRelease(&window(), Qt::LeftButton, Qt::NoModifier, at(to));
    settle();
  }
  void focuses(const QString& name) { find(name)->forceActiveFocus(Qt::TabFocusReason); }

  test::ScopedTimeZone zone_{"UTC"};
  test::ScopedLocale locale_{"en_US"};
  std::unique_ptr<simulator::SondrelSimulator> library_;
};

TEST_F(CaptureWindowTest, FirstShowsItsStartValues) {
  opens();
  EXPECT_EQ(text("configButton"), "Log Configuration: Default");
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 32 Mb");
  EXPECT_EQ(text("maxLogsLabel"), "Max log file: 256 files");
  EXPECT_EQ(text("loadingLabel"), "Choose log config or press start");
  EXPECT_THAT(rows(), SizeIs(0));
}

TEST_F(CaptureWindowTest, ThePartsStandAsTheyAreLaidOut) {
  opens();
  const double width = find("sondrel")->width();
  EXPECT_EQ(find("captureSettings")->height(), 200);
  EXPECT_EQ(find("configButton")->mapToItem(find("sondrel"), QPointF()).y(), 5);
  EXPECT_EQ(find("chunkSlider")->width(), width - 40);
  EXPECT_EQ(find("maxLogsSlider")->width(), width - 40);
  const QQuickItem* separator = find("captureSeparator");
  EXPECT_EQ(separator->height(), 1);
  EXPECT_EQ(separator->width(), width - 40);
  for (const char* name : {"chunkLabel", "maxLogsLabel", "chunkSlider", "maxLogsSlider"})
    EXPECT_EQ(find(name)->mapToScene(QPointF()).x(), separator->mapToScene(QPointF()).x()) << name;
  const QQuickItem* start = find("startButton");
  const QQuickItem* stop = find("stopButton");
  const QQuickItem* reset = find("resetButton");
  EXPECT_EQ(start->mapToScene(QPointF()).x(), 5);
  EXPECT_EQ(start->mapToScene(QPointF()).y() - separator->mapToScene(QPointF(0, 1)).y(), 5);
  EXPECT_EQ(stop->x() - start->x() - start->width(), 10);
  EXPECT_EQ(start->width(), reset->width());
  EXPECT_DOUBLE_EQ(reset->mapToScene(QPointF(reset->width(), 0)).x(), width - 5);
  EXPECT_EQ(find("fileList")->mapToItem(find("sondrel"), QPointF()).y(), 200);
  EXPECT_GE(start->height(), 44);
}

TEST_F(CaptureWindowTest, FilesArriveAfterAStart) {
  opens();
  tap("startButton");
  pass(400ms);
  EXPECT_TRUE(isShown("loadingLabel"));
  pass(2s);
  EXPECT_FALSE(isShown("loadingLabel"));
  EXPECT_THAT(rowTexts("titleLabel"),
              ElementsAre("File name: 000001-Default.chunk", "File name: 000002-Default.chunk",
                          "File name: 000003-Default.chunk", "File name: 000004-Default.chunk"));
  EXPECT_EQ(firstRowText("subtitleLabel"), "File Size: 32 KB");
  EXPECT_THAT(firstRowText("valueLabel"), testing::StartsWith("Jan 5, 2026, 9:30:1"));
  EXPECT_EQ(rows().at(0)->height(), 60);
}

TEST_F(CaptureWindowTest, APressedButtonBlinksTwice) {
  opens();
  tap("stopButton");
  std::vector<double> seen;
  for (int frame = 0; frame < 63; ++frame) {
    seen.push_back(opacity("stopButton"));
    EXPECT_EQ(opacity("startButton"), 1);
    pass(16ms);
  }
  EXPECT_EQ(seen.front(), 1);
  EXPECT_NEAR(seen[12], 0.1, 0.02) << "0.2 seconds down";
  EXPECT_NEAR(seen[25], 1, 0.02) << "and back";
  EXPECT_NEAR(seen[37], 0.1, 0.02);
  EXPECT_EQ(seen[51], 1);
  EXPECT_EQ(seen.back(), 1) << "twice and no more";
}

TEST_F(CaptureWindowTest, NothingMovesWhereTheSystemAsksForLessMotion) {
  view::Appearance::shared().setReducedMotion(true);
  opens();
  tap("stopButton");
  pass(100ms);
  EXPECT_EQ(opacity("stopButton"), 1);
  tap("configButton");
  EXPECT_TRUE(isShown("choiceList"));
  tap("choiceDismissButton");
  EXPECT_FALSE(isShown("choiceList"));
}

TEST_F(CaptureWindowTest, TheListWrapsAtTheConfirmedLimitAndShowsTheNewestBatchTwiceAsMeant) {
  opens();
  tap("startButton");
  pass(400ms + 2s);
  phone.time.advance(126s);
  settle();
  EXPECT_EQ(find("fileList")->property("count"), 256);
  phone.time.advance(2s);
  settle();
  EXPECT_THAT(rowTexts("titleLabel"),
              ElementsAre("File name: 000257-Default.chunk", "File name: 000258-Default.chunk",
                          "File name: 000259-Default.chunk", "File name: 000260-Default.chunk",
                          "File name: 000257-Default.chunk", "File name: 000258-Default.chunk",
                          "File name: 000259-Default.chunk", "File name: 000260-Default.chunk"));
}

TEST_F(CaptureWindowTest, AResetEmptiesTheListAndBringsTheLoadingViewBack) {
  opens();
  tap("startButton");
  pass(3s);
  tap("stopButton");
  pass(1s);
  EXPECT_THAT(rows(), SizeIs(6)) << "the last two with the stop";
  tap("resetButton");
  pass(1s);
  EXPECT_THAT(rows(), SizeIs(0));
  EXPECT_EQ(text("loadingLabel"), "Choose log config or press start");
  EXPECT_TRUE(std::filesystem::is_empty(phone.directory.path() / "Sondrel"));
}

TEST_F(CaptureWindowTest, TheSlidersObeyAFinger) {
  opens();
  drags("chunkSlider", 0.52);
  EXPECT_EQ(value("chunkSlider"), 544);
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 544 Kb");
  drags("chunkSlider", 1.05);
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 1024 Kb");
  drags("maxLogsSlider", 0.25);
  EXPECT_NEAR(value("maxLogsSlider"), 2240, 30);
  EXPECT_EQ(value("maxLogsSlider"), std::round(value("maxLogsSlider")));
  EXPECT_EQ(text("maxLogsLabel"), "Max log file: " + std::to_string(std::lround(value("maxLogsSlider"))) + " files");
}

TEST_F(CaptureWindowTest, TheSlidersObeyTheKeyboard) {
  opens();
  focuses("chunkSlider");
  key(Qt::Key_Right);
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 64 Kb");
  key(Qt::Key_PageUp);
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 320 Kb");
  key(Qt::Key_PageDown);
  key(Qt::Key_Left);
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 32 Kb");
  key(Qt::Key_End);
  EXPECT_EQ(text("chunkLabel"), "Chunk file size: 1024 Kb");
  focuses("maxLogsSlider");
  key(Qt::Key_Right);
  EXPECT_EQ(text("maxLogsLabel"), "Max log file: 257 files");
  key(Qt::Key_PageUp);
  EXPECT_EQ(text("maxLogsLabel"), "Max log file: 513 files");
  key(Qt::Key_Home);
  EXPECT_EQ(text("maxLogsLabel"), "Max log file: 256 files");
}

TEST_F(CaptureWindowTest, TheCaptureTakesWhatTheSlidersSay) {
  opens();
  focuses("chunkSlider");
  key(Qt::Key_Right);
  tap("startButton");
  pass(2500ms);
  EXPECT_EQ(firstRowText("subtitleLabel"), "File Size: 64 KB");
}

TEST_F(CaptureWindowTest, TheChoiceGrowsOutOfTheStartButtonAndFillsTheWindow) {
  opens();
  const QQuickItem* start = find("startButton");
  const QPointF middle = start->mapToScene(QPointF(start->width() / 2, start->height() / 2));
  tap("configButton");
  pass(160ms);
  const QQuickItem* circle = find("transitionCircle");
  ASSERT_NE(circle, nullptr);
  EXPECT_EQ(circle->x() + circle->width() / 2, middle.x());
  EXPECT_EQ(circle->y() + circle->height() / 2, middle.y());
  EXPECT_NEAR(circle->scale(), 0.5, 0.1);
  pass(500ms);
  EXPECT_EQ(circle->scale(), 1);
  EXPECT_DOUBLE_EQ(circle->width(), 2 * std::hypot(window().width() - middle.x(), middle.y()))
      << "it covers the upper right corner, the farthest";
  EXPECT_EQ(find("choiceList")->width(), window().width());
}

TEST_F(CaptureWindowTest, AChosenConfigurationIsNamedAndCaptured) {
  opens();
  opensChoice();
  const auto names = findAll("choiceRow");
  ASSERT_THAT(names, SizeIs(7));
  EXPECT_EQ(names[0]->height(), 75);
  tap(names[1]);
  pass(160ms);
  EXPECT_NEAR(find("transitionCircle")->scale(), 0.5, 0.1) << "it shrinks back";
  pass(500ms);
  EXPECT_FALSE(isShown("choiceList"));
  EXPECT_EQ(text("configTitle"), "Log Configuration: <font color=\"#b63c0b\">Voice</font>");
  tap("startButton");
  pass(2500ms);
  EXPECT_EQ(firstRowText("titleLabel"), "File name: 000001-Voice.chunk");
}

TEST_F(CaptureWindowTest, TheChoiceIsLeftByItsCrossAndByEscape) {
  opens();
  opensChoice();
  tap("choiceDismissButton");
  pass(1s);
  EXPECT_FALSE(isShown("choiceList"));
  opensChoice();
  EXPECT_TRUE(isShown("choiceList"));
  key(Qt::Key_Escape);
  pass(1s);
  EXPECT_FALSE(isShown("choiceList"));
  EXPECT_EQ(text("configButton"), "Log Configuration: Default");
}

TEST_F(CaptureWindowTest, TheChoiceIsMadeByKeyboard) {
  opens();
  focuses("configButton");
  key(Qt::Key_Return);
  pass(1s);
  key(Qt::Key_Down);
  key(Qt::Key_Down);
  key(Qt::Key_Return);
  pass(1s);
  EXPECT_EQ(text("configButton"), "Log Configuration: Data Throughput");
}

TEST_F(CaptureWindowTest, AnAnswerWhileTheChoiceStandsOpensNoSecondOne) {
  opens();
  tap("configButton");
  tap("configButton");
  pass(1s);
  EXPECT_THAT(findAll("choiceList"), SizeIs(1));
  tap("choiceDismissButton");
  pass(1s);
  EXPECT_FALSE(isShown("choiceList"));
}

TEST_F(CaptureWindowTest, AFullDiskIsToldInAnAlertAndTheFilesStay) {
  hasRoomFor(2 * 32 * 1024);
  opens();
  tap("startButton");
  pass(3s);
  EXPECT_EQ(
      text("alertTitle"),
      "A log file cannot be written: No space left on device. Earlier files are kept. Make room, then start again.");
  EXPECT_EQ(text("alertMessage"), "Error Occured");
  tap("alertButton");
  pass(1s);
  EXPECT_FALSE(isShown("alertTitle"));
  EXPECT_THAT(rows(), SizeIs(2));
}

TEST_F(CaptureWindowTest, TheTabKeepsItsStateWhenItIsLeft) {
  opens();
  tap("startButton");
  pass(2500ms);
  tap("menuCell0");
  pass(1s);
  EXPECT_FALSE(isShown("fileList"));
  tap("menuCell2");
  pass(1s);
  EXPECT_THAT(rows(), testing::Not(SizeIs(0)));
}

TEST_F(CaptureWindowTest, ALowWindowScrollsItsSettingsWithTheFiles) {
  setSize(320, 480);
  opens();
  tap("startButton");
  pass(10s);
  grab();
  const auto top = [this] { return find("captureSettings")->mapToItem(find("sondrel"), QPointF()).y(); };
  EXPECT_EQ(top(), 0);
  swipe(find("chunkLabel"), 0, -60);
  pass(1s);
  EXPECT_LT(top(), 0);
}

}  // namespace
}  // namespace quorl
