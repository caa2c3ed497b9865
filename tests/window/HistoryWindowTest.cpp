#include <QFont>
#include <algorithm>

#include "ScreenWindow.h"
#include "base/DateText.h"

namespace quorl {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::SizeIs;
using namespace std::chrono_literals;

class HistoryWindowTest : public test::ScreenWindowTest {
 protected:
  HistoryWindowTest() { isInternalBuild(); }

  Metric cellId(const std::string& value, std::chrono::seconds ago = 0s) {
    Metric metric = reading("RAT", "Cell Info", "kHVCellMonitorCellId", value);
    metric.collectedOn -= ago;
    metric.graphable = true;
    return metric;
  }
  void launchOnGraph() {
    launch();
    showsAllMetrics();
    opens("Cell Info");
    tap(inRow(row("attributeRow", "kHVCellMonitorCellId"), "graphButton"));
    pass(600ms);
  }
  void selects(int segment) { tap("segment" + QString::number(segment)); }
  QQuickItem* bar() { return findAll("pageBar").back(); }  // over the uppermost screen
  std::string header() { return find("largeTitle", bar())->property("text").toString().toStdString(); }
  double height(QQuickItem* bar) { return find("barBody", bar)->height(); }
};

TEST_F(HistoryWindowTest, DrawsABarForEachReadingOfToday) {
  hasStored(cellId("100"));
  hasStored(cellId("50"));
  launchOnGraph();
  EXPECT_EQ(header(), "kHVCellMonitorCellId");
  EXPECT_EQ(text("historyCaption"), "2 readings · mean 75");
  EXPECT_THAT(column("tick", "text"), ElementsAre("100", "50", "0"));  // from the top down
  const auto bars = findAll("bar");
  ASSERT_THAT(bars, SizeIs(2));
  EXPECT_EQ(find("barBody", bars[0])->width(), 30);
  EXPECT_NEAR(height(bars[0]), 2 * height(bars[1]), 1e-6);
  EXPECT_EQ(place(find("barBody", bars[0])).bottom(), place(find("barBody", bars[1])).bottom());
}

TEST_F(HistoryWindowTest, TheLargestBarLeavesFortyOfThePlotAndADaysBarIsLabelledWithTheDay) {
  const Metric largest = cellId("100");
  hasStored(largest);
  hasStored(cellId("50"));
  launchOnGraph();
  EXPECT_NEAR(place(find("barBody", findAll("bar").at(0))).top(), place(find("bars")).top() + 40, 1e-6);
  EXPECT_EQ(text("barLabel"), patternText(largest.collectedOn, "HH:mm zz"));
  selects(1);
  pass(500ms);
  ASSERT_THAT(findAll("bar"), SizeIs(1));
  EXPECT_EQ(text("barLabel"), patternText(largest.collectedOn, "EE, MM/dd"));
}

TEST_F(HistoryWindowTest, TheAttributeIsNamedOnce) {
  hasStored(cellId("100"));
  launchOnGraph();
  QQuickItem* page = bar()->parentItem();
  EXPECT_EQ(std::ranges::count(texts(page), "kHVCellMonitorCellId"), 1);
  selects(1);
  EXPECT_EQ(std::ranges::count(texts(page), "kHVCellMonitorCellId average"), 1);
  EXPECT_EQ(std::ranges::count(texts(page), "kHVCellMonitorCellId"), 0);
  EXPECT_EQ(find("largeTitle", bar())->property("font").value<QFont>().pixelSize(), 34);
}

TEST_F(HistoryWindowTest, ATapSelectsABarAndTellsItsValueAndTime) {
  hasStored(cellId("100"));
  hasStored(cellId("50"));
  launchOnGraph();
  EXPECT_FALSE(isShown("selectedBubble"));
  tap(findAll("bar").at(1));
  EXPECT_EQ(text("selectedValue"), "50");
  EXPECT_THAT(text("selectedTime"), HasSubstr("UTC"));
  EXPECT_LE(place(find("selectedBubble")).bottom(), place(find("barBody", findAll("bar")[1])).top());
  tap(findAll("bar").at(0));
  EXPECT_EQ(text("selectedValue"), "100");
}

TEST_F(HistoryWindowTest, TheArrowKeysMoveTheSelection) {
  for (const char* value : {"10", "20", "30"}) hasStored(cellId(value));
  launchOnGraph();
  tap(findAll("bar").at(0));
  find("bars")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_Right);
  EXPECT_EQ(text("selectedValue"), "20");
  key(Qt::Key_Right);
  EXPECT_EQ(text("selectedValue"), "30");
}

TEST_F(HistoryWindowTest, WeekAndMonthShowOneAverageADay) {
  hasStored(cellId("100", 24h * 3));
  hasStored(cellId("50", 24h * 3));
  hasStored(cellId("20", 24h * 20));
  launchOnGraph();
  EXPECT_EQ(text("emptyTitle"), "havent received for today");
  selects(1);
  pass(500ms);
  EXPECT_FALSE(isShown("emptyTitle"));
  EXPECT_EQ(header(), "kHVCellMonitorCellId average");
  EXPECT_EQ(text("historyCaption"), "1 day · mean 75");
  selects(2);
  EXPECT_EQ(text("historyCaption"), "2 days · mean 47.5");
  EXPECT_THAT(findAll("bar"), SizeIs(2));
  selects(0);
  pass(500ms);
  EXPECT_EQ(text("emptyTitle"), "havent received for today");
}

TEST_F(HistoryWindowTest, ASegmentForgetsTheSelection) {
  hasStored(cellId("100"));
  launchOnGraph();
  tap(findAll("bar").at(0));
  ASSERT_TRUE(isShown("selectedBubble"));
  selects(1);
  EXPECT_FALSE(isShown("selectedBubble"));
}

TEST_F(HistoryWindowTest, NoTwoTimeLabelsOverlapAndTheLatestReadingIsInSight) {
  for (int i = 0; i < 120; ++i) hasStored(cellId(std::to_string(i + 1)));
  launchOnGraph();
  std::vector<QRectF> labels;
  for (const QQuickItem* label : findAll("barLabel")) labels.push_back(place(label));
  std::sort(labels.begin(), labels.end(), [](const QRectF& a, const QRectF& b) { return a.left() < b.left(); });
  ASSERT_GT(labels.size(), 1U);
  for (std::size_t i = 1; i < labels.size(); ++i) EXPECT_GT(labels[i].left(), labels[i - 1].right());
  EXPECT_THAT(column("bar", "value"), Contains("120"));
}

TEST_F(HistoryWindowTest, TheLatestReadingIsWhollyInSightAtFirstAndAfterAResize) {
  for (int i = 0; i < 40; ++i) hasStored(cellId(std::to_string(1000 * (i + 1))));
  launchOnGraph();
  const auto latest = [this] {
    for (QQuickItem* bar : findAll("bar"))
      if (bar->property("value") == "40000") return place(find("barBody", bar));
    return QRectF();
  };
  for (const int width : {390, 320, 700}) {
    setSize(width, 844);
    grab();
    EXPECT_GT(latest().width(), 0) << width;
    EXPECT_LE(latest().right(), place(find("bars")).right()) << width;
  }
}

TEST_F(HistoryWindowTest, ASelectedBarStaysInSightWhenTheWindowNarrows) {
  for (int i = 0; i < 40; ++i) hasStored(cellId(std::to_string(i + 1)));
  setSize(700, 844);
  launchOnGraph();
  tap(findAll("bar").front());
  ASSERT_TRUE(isShown("selectedBubble"));
  setSize(390, 844);
  grab();
  EXPECT_TRUE(isShown("selectedBubble"));
}

TEST_F(HistoryWindowTest, NegativeReadingsStandOnTheBaselineInsideThePlot) {
  for (const char* value : {"-70", "-140", "-105"}) hasStored(cellId(value));
  launchOnGraph();
  for (QQuickItem* bar : findAll("bar")) {
    EXPECT_GE(place(find("barBody", bar)).top(), place(find("bars")).top());
    EXPECT_GT(height(bar), 0);
  }
  EXPECT_THAT(column("tick", "text"), ElementsAre("-120", "-60", "0"));
}

TEST_F(HistoryWindowTest, WithoutAnyReadingItSaysSoOnAllSegments) {
  hasStored(cellId("1"));
  launch();
  showsAllMetrics();
  opens("Cell Info");
  store().executeDashboardStatement("DELETE FROM Metric", [](bool, const std::optional<SQLiteError>&) {});
  settle();
  tap(inRow(row("attributeRow", "kHVCellMonitorCellId"), "graphButton"));
  pass(600ms);
  for (int segment = 0; segment < 3; ++segment) {
    selects(segment);
    pass(500ms);
    EXPECT_EQ(text("emptyTitle"), "havent received for today");
  }
}

}  // namespace
}  // namespace quorl
