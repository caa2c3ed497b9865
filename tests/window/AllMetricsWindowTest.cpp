#include <algorithm>

#include "ScreenWindow.h"

namespace quorl {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using namespace std::chrono_literals;

class AllMetricsWindowTest : public test::ScreenWindowTest {
 protected:
  void launchOnList() {
    launch();
    showsAllMetrics();
  }
  std::vector<std::string> names() { return column("metricRow", "name"); }
  std::ptrdiff_t queries() {
    return std::count(phone.zelkor.calls.begin(), phone.zelkor.calls.end(), "kCommandQueryMetric");
  }
};

TEST_F(AllMetricsWindowTest, ListsMetricsUnderTheirTechnologies) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  hasStored(reading("5G", "NR Cell", "pci", "7"));
  launchOnList();
  EXPECT_THAT(column("techHeader", "text"), ElementsAre("RAT", "5G", "LTE"));
  EXPECT_THAT(names(), ElementsAre("Cell Info", "NR Cell", "Tx Power"));
  EXPECT_THAT(text("refreshedLine"), HasSubstr("Last refreshed: "));
}

TEST_F(AllMetricsWindowTest, WithoutStoredRowsTheTelephonyRowsAreThere) {
  isInternalBuild();
  launchOnList();
  EXPECT_THAT(names(), ElementsAre("Cell Info", "Active Bands", "Supported Bands"));
}

TEST_F(AllMetricsWindowTest, APullAsksForFreshMetricsAndSpinsForASecond) {
  launchOnList();
  const auto before = queries();
  swipe(find("metricsList"), 0, 40);  // too short
  pass(500ms);
  EXPECT_EQ(queries(), before);
  swipe(find("metricsList"), 0, 260);
  EXPECT_EQ(queries(), before + 1);
  EXPECT_TRUE(isShown("refreshSpinner"));
  pass(900ms);
  EXPECT_TRUE(isShown("refreshSpinner"));
  pass(200ms);
  EXPECT_FALSE(isShown("refreshSpinner"));
  EXPECT_EQ(find("metricsList")->property("contentY").toDouble(), find("metricsList")->property("originY").toDouble());
}

TEST_F(AllMetricsWindowTest, APullShowsItsHint) {
  launchOnList();
  QQuickItem* const list = find("metricsList");
  list->setProperty("contentY", list->property("originY").toDouble() - 70);
  EXPECT_EQ(text("pullHint"), "Pull to refresh");
  list->setProperty("contentY", list->property("originY").toDouble());
  EXPECT_FALSE(isShown("pullHint"));
}

TEST_F(AllMetricsWindowTest, TheButtonAndTheKeyRefreshToo) {
  launchOnList();
  const auto before = queries();
  tap("refreshButton");
  EXPECT_EQ(queries(), before + 1);
  tap("refreshButton");  // still at it
  EXPECT_EQ(queries(), before + 1);
  pass(1100ms);
  key(Qt::Key_F5);
  EXPECT_EQ(queries(), before + 2);
  pass(1100ms);
}

TEST_F(AllMetricsWindowTest, AMetricThatArrivesComesInAtItsPlaceAndNothingElseMoves) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOnList();
  QQuickItem* const cellInfo = row("metricRow", "Cell Info");
  QQuickItem* const power = row("metricRow", "Tx Power");
  const QRectF before = place(cellInfo);
  pass(2s);
  arrives(reading("LTE", "RRC State", "state", "1"));
  EXPECT_THAT(names(), ElementsAre("Cell Info", "RRC State", "Tx Power"));
  EXPECT_EQ(row("metricRow", "Cell Info"), cellInfo);
  EXPECT_EQ(row("metricRow", "Tx Power"), power);
  EXPECT_EQ(place(cellInfo), before);
}

TEST_F(AllMetricsWindowTest, ANewerReadingChangesTheTimeInItsPlace) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOnList();
  QQuickItem* const power = row("metricRow", "Tx Power");
  const QString before = power->property("time").toString();
  const QRectF where = place(power);
  pass(2s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(row("metricRow", "Tx Power"), power);
  EXPECT_NE(power->property("time").toString(), before);
  EXPECT_EQ(place(power), where);
}

TEST_F(AllMetricsWindowTest, TheHeaderOfATechnologySticks) {
  for (int i = 0; i < 40; ++i) hasStored(reading("LTE", "Metric " + std::to_string(100 + i), "a", "1"));
  launchOnList();
  QQuickItem* const list = find("metricsList");
  list->setProperty("contentY", list->property("originY").toDouble() + 600);
  pass(100ms);
  const auto headers = findAll("techHeader");
  EXPECT_TRUE(std::any_of(headers.begin(), headers.end(), [&](QQuickItem* header) {
    return header->property("text").toString() == "LTE" && place(header).top() == place(list).top();
  }));
}

TEST_F(AllMetricsWindowTest, NothingIsLeftBehindOnTheScreenByScrolling) {
  for (const char* tech : {"5G", "LTE", "MISC"})
    for (int i = 0; i < 14; ++i) hasStored(reading(tech, tech + (" metric " + std::to_string(i)), "a", "1"));
  setSize(1024, 767);
  launchOnList();
  QQuickItem* const list = find("metricsList");
  for (const double to : {264.5, 529.0, 793.5, 300.3, 1058.0, 20.7}) {
    list->setProperty("contentY", list->property("originY").toDouble() + to);
    settle();
    pass(300ms);  // the large title goes
    EXPECT_TRUE(grab() == drawnAnew()) << to;
  }
  for (const int distance : {-217, -133, -301, 251}) {
    swipe(list, 0, distance);
    for (int frames = 0; frames < 20; ++frames) {
      WindowTest::pass(48ms);
      EXPECT_TRUE(grab() == drawnAnew()) << distance << ", frame " << frames;
    }
  }
  opens(names().at(3));
  EXPECT_TRUE(grab() == drawnAnew());
}

TEST_F(AllMetricsWindowTest, TheFilterFindsNamesAndTechnologiesWhateverTheCase) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  hasStored(reading("5G", "NR Cell", "pci", "7"));
  launchOnList();
  key(Qt::Key_F, Qt::ControlModifier);
  types("tx p");
  EXPECT_THAT(names(), ElementsAre("Tx Power"));
  key(Qt::Key_A, Qt::ControlModifier);
  types("5g");
  EXPECT_THAT(names(), ElementsAre("NR Cell"));
  key(Qt::Key_Escape);
  EXPECT_FALSE(isShown("filterField"));
  EXPECT_THAT(names(), ElementsAre("Cell Info", "NR Cell", "Tx Power"));
}

TEST_F(AllMetricsWindowTest, AFilterThatFindsNothingSaysWhatWasSearched) {
  launchOnList();
  tap("filterButton");
  types("xyz");
  pass(500ms);
  EXPECT_THAT(names(), IsEmpty());
  EXPECT_THAT(texts(), Contains("No metric matches “xyz”."));
  tap("closeFilterButton");
  EXPECT_THAT(names(), ElementsAre("Cell Info"));
}

TEST_F(AllMetricsWindowTest, AFilteredRowOpensItself) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  hasStored(reading("LTE", "RRC State", "state", "1"));
  launchOnList();
  tap("filterButton");
  types("tx");
  opens("Tx Power");
  EXPECT_NE(row("attributeRow", "power"), nullptr);
}

TEST_F(AllMetricsWindowTest, TheKeyboardOpensARowAndEscapeComesBack) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOnList();
  find("metricsList")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_Down);
  key(Qt::Key_Return);
  pass(600ms);
  EXPECT_NE(row("attributeRow", "power"), nullptr);
  key(Qt::Key_Escape);
  pass(600ms);
  EXPECT_EQ(row("attributeRow", "power"), nullptr);
}

TEST_F(AllMetricsWindowTest, BesideItsDetailTheOpenRowIsMarked) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  setSize(1280, 800);
  launchOnList();
  EXPECT_FALSE(row("metricRow", "Tx Power")->property("isSelected").toBool());
  opens("Tx Power");
  EXPECT_TRUE(row("metricRow", "Tx Power")->property("isSelected").toBool());
  EXPECT_FALSE(row("metricRow", "Cell Info")->property("isSelected").toBool());
  opens("Cell Info");
  EXPECT_FALSE(row("metricRow", "Tx Power")->property("isSelected").toBool());
  EXPECT_TRUE(row("metricRow", "Cell Info")->property("isSelected").toBool());
}

}  // namespace
}  // namespace quorl
