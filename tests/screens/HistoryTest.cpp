#include <cmath>

#include "ScreenTest.h"
#include "app/HardwareManager.h"
#include "screens/history/AttributeContentDetailsViewController.h"

namespace quorl {
namespace {

using test::line;
using ::testing::DoubleEq;
using ::testing::Each;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

std::vector<std::string> values(const std::vector<Metric>& rows) {
  std::vector<std::string> texts;
  for (const Metric& row : rows) texts.push_back(row.attributeValue);
  return texts;
}

/// What a statement counts as now is the machine's time.
class HistoryTest : public test::ScreenTest {
 protected:
  HistoryTest() { livesNow(); }

  Metric cellId(const std::string& value, std::chrono::hours ago = 0h, std::int32_t subsId = 0) {
    Metric metric = reading("RAT", "Cell Info", "kHVCellMonitorCellId", value, subsId);
    metric.collectedOn = now() + 1min - ago;  // so that midnight may pass during the test
    return metric;
  }
  void open() {
    log.clear();
    screen = AttributeContentDetailsViewController::make(store, cellId("0"));
    screen->viewDidLoad();
    EXPECT_EQ(screen->view(), nullptr);
    settle();
    ASSERT_NE(screen->view(), nullptr);
  }
  AttributeDetailsViewModel& model() { return screen->view()->model(); }

  std::shared_ptr<AttributeContentDetailsViewController> screen;
};

TEST_F(HistoryTest, GathersTheThreeTimeFramesAndShowsToday) {
  launch();
  stored(cellId("10", 24h * 20));
  stored(cellId("20", 24h * 3));
  stored(cellId("30"));
  open();
  EXPECT_THAT(values(model().daily()), ElementsAre("30"));
  EXPECT_THAT(values(model().weekly()), ElementsAre("20.0", "30.0"));
  EXPECT_THAT(values(model().monthly()), ElementsAre("10.0", "20.0", "30.0"));
  EXPECT_EQ(model().currentSegmentIndex(), 0);
  EXPECT_THAT(values(model().dataSource()), ElementsAre("30"));
}

TEST_F(HistoryTest, TheDailyFrameIsOfOneSubscriptionAndTheOthersMixBoth) {
  launch();
  stored(cellId("10", 0h, 0));
  stored(cellId("20", 0h, 1));
  open();
  EXPECT_THAT(values(model().daily()), ElementsAre("10"));
  EXPECT_THAT(values(model().weekly()), ElementsAre("15.0"));
  HardwareManager::shared().setCurrentSubsId(1);
  open();
  EXPECT_THAT(values(model().daily()), ElementsAre("20"));
}

TEST_F(HistoryTest, ATextAttributeHasAveragesOfZero) {
  launch();
  stored(cellId("serving"));
  open();
  EXPECT_THAT(values(model().weekly()), ElementsAre("0.0"));
  EXPECT_THAT(values(model().monthly()), ElementsAre("0.0"));
}

TEST_F(HistoryTest, WithoutReadingsOfTodayItSaysSoWhileTheWeekStillShowsBars) {
  launch();
  stored(cellId("20", 24h * 3));
  open();
  EXPECT_EQ(screen->view()->emptyText(), "havent received for today");
  EXPECT_THAT(screen->view()->bars(), IsEmpty());
  model().selectSegment(1);
  EXPECT_EQ(screen->view()->emptyText(), "");
  EXPECT_THAT(screen->view()->bars(), SizeIs(1));
}

TEST_F(HistoryTest, WithoutAnyReadingsAllSegmentsSpeakOfTodayAsMeant) {
  launch();
  open();
  for (const int segment : {0, 1, 2}) {
    model().selectSegment(segment);
    EXPECT_EQ(screen->view()->emptyText(), "havent received for today");
  }
}

TEST_F(HistoryTest, TheTitleAndHeaderAreTheNameShown) {
  platform.strings.table = {{"kHVCellMonitorCellId", "Cell ID"}};
  launch();
  Metric metric = cellId("30");
  metric.attributeName = "Cell ID";
  screen = AttributeContentDetailsViewController::make(store, metric);
  screen->viewDidLoad();
  settle();
  EXPECT_EQ(screen->title(), "Cell ID");
  EXPECT_EQ(screen->view()->headerText(), "Cell ID");
  model().selectSegment(1);
  EXPECT_EQ(screen->view()->headerText(), "Cell ID average");
  model().selectSegment(2);
  EXPECT_EQ(screen->view()->headerText(), "Cell ID average");
}

TEST_F(HistoryTest, IsReadByTheRawNameInEachTimeFrame) {
  launch();
  Metric metric = cellId("30");
  stored(metric);
  Metric other = metric;
  other.attributeName = other.attributeNameNonLocalized = "Cell ID";
  other.attributeValue = "99";
  stored(other);
  metric.attributeName = "Cell ID";
  screen = AttributeContentDetailsViewController::make(store, metric);
  screen->viewDidLoad();
  settle();
  EXPECT_THAT(values(model().daily()), ElementsAre("30"));
  EXPECT_THAT(values(model().weekly()), ElementsAre("30.0"));
  EXPECT_THAT(values(model().monthly()), ElementsAre("30.0"));
}

TEST_F(HistoryTest, TellsWhenTheViewIsThere) {
  launch();
  screen = AttributeContentDetailsViewController::make(store, cellId("30"));
  int shown = 0;
  const Connection connection = screen->onShowView([&] { ++shown; });
  screen->viewDidLoad();
  settle();
  EXPECT_EQ(shown, 1);
}

TEST_F(HistoryTest, AFailureOfAllReadsIsLoggedAndTheViewComesAllTheSame) {
  launch();
  loses("Metric");
  open();
  EXPECT_THAT(model().dataSource(), IsEmpty());
  // Monthly does say weekly.
  EXPECT_THAT(log.lines(), ElementsAre(line("general",
                                            "error occured  fetch daily ---> Prepare(message: \"no such table: "
                                            "Metric\")"),
                                       line("general",
                                            "error occured  fetch weekly ---> Prepare(message: \"no such table: "
                                            "Metric\")"),
                                       line("general",
                                            "error occured  fetch weekly ---> Prepare(message: \"no such table: "
                                            "Metric\")")));
}

TEST_F(HistoryTest, AFailedReadCostsItsFrameOnly) {
  launch();
  Metric quoted = cellId("30");
  quoted.attributeNameNonLocalized = quoted.attributeName = "user's";  // breaks the texts in single quotes
  stored(quoted);
  log.clear();
  screen = AttributeContentDetailsViewController::make(store, quoted);
  screen->viewDidLoad();
  settle();
  EXPECT_THAT(values(model().daily()), ElementsAre("30"));
  EXPECT_THAT(model().weekly(), IsEmpty());
  EXPECT_THAT(model().monthly(), IsEmpty());
  EXPECT_THAT(log.texts("general"), SizeIs(2));
}

TEST_F(HistoryTest, ARowThatCannotBeReadCostsItsFrame) {
  launch();
  stored(cellId("30"));
  sql("UPDATE Metric SET attribute_value_type = NULL");
  open();
  EXPECT_TRUE(log.has(line("general", "error occured  fetch daily ---> EmptyQueryResult")));
}

TEST_F(HistoryTest, TheScreenMayGoWhileItLoads) {
  launch();
  stored(cellId("30"));
  screen = AttributeContentDetailsViewController::make(store, cellId("0"));
  int shown = 0;
  const Connection connection = screen->onShowView([&] { ++shown; });
  screen->viewDidLoad();
  screen.reset();
  settle();
  EXPECT_EQ(shown, 0);
}

// The graph's state.

std::vector<Metric> rowsWith(const std::vector<std::string>& texts) {
  std::vector<Metric> rows;
  for (const std::string& text : texts) rows.emplace_back().attributeValue = text;
  return rows;
}

TEST(AttributeDetailsTest, ASegmentChoosesItsRowsAndAnyOtherIndexTheMonth) {
  AttributeDetailsViewModel model(rowsWith({"1"}), rowsWith({"2"}), rowsWith({"3"}));
  model.selectSegment(1);
  EXPECT_THAT(values(model.dataSource()), ElementsAre("2"));
  for (const int index : {2, 3, -1}) {
    model.selectSegment(index);
    EXPECT_THAT(values(model.dataSource()), ElementsAre("3"));
  }
  model.selectSegment(0);
  EXPECT_THAT(values(model.dataSource()), ElementsAre("1"));
}

TEST(AttributeDetailsTest, ExtremesAreReadAsIntegersAndCutOff) {
  AttributeDetailsViewModel model(rowsWith({"5.9", "-3.9", "LTE", "4"}), {}, {});
  EXPECT_EQ(model.maxValueOfDataSource(), 5);
  EXPECT_EQ(model.minValueOfDataSource(), -3);
}

TEST(AttributeDetailsTest, ASingleReadingMakesBothExtremesEqual) {
  AttributeDetailsViewModel model(rowsWith({"42"}), {}, {});
  EXPECT_EQ(model.maxValueOfDataSource(), 42);
  EXPECT_EQ(model.minValueOfDataSource(), 42);
}

TEST(AttributeDetailsTest, WithNothingOnShowTheExtremesStayAsTheyWere) {
  AttributeDetailsViewModel model(rowsWith({"7", "3"}), {}, {});
  model.selectSegment(1);
  EXPECT_THAT(model.dataSource(), IsEmpty());
  EXPECT_EQ(model.maxValueOfDataSource(), 7);
  EXPECT_EQ(model.minValueOfDataSource(), 3);
}

TEST(AttributeDetailsTest, ATapSelectsOneBarAlone) {
  AttributeDetailsViewModel model(rowsWith({"1", "2", "3"}), {}, {});
  const auto selected = [&] {
    std::vector<bool> flags;
    for (const Metric& row : model.dataSource()) flags.push_back(row.graphable);
    return flags;
  };
  model.tapBar(1);
  EXPECT_THAT(selected(), ElementsAre(false, true, false));
  model.tapBar(2);
  EXPECT_THAT(selected(), ElementsAre(false, false, true));
  model.tapBar(2);  // cleared first, so it is selected again
  EXPECT_THAT(selected(), ElementsAre(false, false, true));
  model.tapBar(3);
  EXPECT_THAT(selected(), ElementsAre(false, false, true));
  model.selectSegment(0);
  EXPECT_THAT(selected(), Each(false));
}

TEST(AttributeDetailsTest, TellsOfTheSegmentAndOfTheRows) {
  AttributeDetailsViewModel model(rowsWith({"1"}), rowsWith({"2", "3"}), {});
  std::vector<int> segments;
  std::vector<std::size_t> sizes;
  const Connection segment = model.onSegmentIndex([&](int index) { segments.push_back(index); });
  const Connection rows = model.onDataSource([&](const std::vector<Metric>& now) { sizes.push_back(now.size()); });
  model.selectSegment(1);
  model.tapBar(0);
  EXPECT_THAT(segments, ElementsAre(0, 1));
  EXPECT_THAT(sizes, ElementsAre(1, 2, 2));
}

// Bars.

TEST(BarTest, TheLargestValueTakesTheWholeAvailableHeight) {
  EXPECT_EQ(availableBarHeight(240), 200);
  EXPECT_THAT(barHeight("50", 50, 240), DoubleEq(200));
}

TEST(BarTest, AnyOtherValueTakesItsShare) {
  EXPECT_THAT(barHeight("25", 50, 240), DoubleEq(100));
  EXPECT_THAT(barHeight("12.5", 50, 240), DoubleEq(50));
  EXPECT_THAT(barHeight("0", 50, 240), DoubleEq(0));
}

TEST(BarTest, AFractionAboveTheIntegerMaximumStandsHigherAsMeant) {
  EXPECT_THAT(barHeight("5.5", 5, 240), DoubleEq(220));
}

TEST(BarTest, ATextCountsAsZero) {
  EXPECT_THAT(barHeight("LTE", 50, 240), DoubleEq(0));
  EXPECT_THAT(barHeight("LTE", 0, 240), DoubleEq(200));  // all are zero, so it is the largest
}

TEST(BarTest, WithAMaximumOfZeroAnyOtherValueHasNoFiniteHeight) {
  EXPECT_TRUE(std::isinf(barHeight("0.5", 0, 240)));
}

TEST(BarTest, NegativeValuesStandTheHigherTheLowerTheyAre) {
  EXPECT_THAT(barHeight("-80", -80, 240), DoubleEq(200));
  EXPECT_THAT(barHeight("-100", -80, 240), DoubleEq(250));
}

TEST(BarTest, IsThirtyWide) {
  EXPECT_EQ(kBarWidth, 30.0);
}

TEST_F(HistoryTest, ABarDrawsItsRow) {
  launch();
  stored(cellId("10"));
  stored(cellId("40"));
  open();
  model().tapBar(1);
  const std::vector<GraphView> bars = screen->view()->bars();
  ASSERT_THAT(bars, SizeIs(2));
  EXPECT_THAT(bars[0].height(240), DoubleEq(50));
  EXPECT_THAT(bars[1].height(240), DoubleEq(200));
  EXPECT_FALSE(bars[0].isSelected());
  EXPECT_TRUE(bars[1].isSelected());
  EXPECT_EQ(bars[0].label(), barLabel(model().dataSource()[0].collectedOn, 0));
}

}  // namespace
}  // namespace quorl
