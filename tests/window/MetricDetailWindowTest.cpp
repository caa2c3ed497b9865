#include "ScreenWindow.h"

namespace quorl {
namespace {

using test::value;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using namespace std::chrono_literals;

class MetricDetailWindowTest : public test::ScreenWindowTest {
 protected:
  void launchOn(const std::string& metricName) {
    launch();
    showsAllMetrics();
    opens(metricName);
  }
  QQuickItem* attribute(const std::string& name) { return row("attributeRow", name); }
  QString bookmark(const std::string& name) {
    return inRow(attribute(name), "bookmarkButton")->property("symbol").toString();
  }
};

TEST_F(MetricDetailWindowTest, ShowsEachAttributeWithItsLatestValue) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  hasStored(reading("LTE", "Tx Power", "band", "3"));
  launchOn("Tx Power");
  EXPECT_THAT(column("attributeRow", "name"), ElementsAre("band", "power"));
  EXPECT_THAT(column("attributeRow", "value"), ElementsAre("3", "11"));
  EXPECT_THAT(texts(), Contains(HasSubstr("Last seen on: ")));
}

TEST_F(MetricDetailWindowTest, ABandwidthIsShownInMegahertz) {
  hasStored(reading("LTE", "Serving Cell Info", "dl_bw", "50"));
  launchOn("Serving Cell Info");
  EXPECT_EQ(value(attribute("dl_bw")), "10\u2009MHz");
}

TEST_F(MetricDetailWindowTest, SpinsInPlaceOfTheRowsOnceAReadTakesLong) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launch();
  showsAllMetrics();
  databaseQueue().setHanging(true);
  tap(row("metricRow", "Tx Power"));
  EXPECT_FALSE(isShown("detailSpinner"));
  pass(250ms);
  EXPECT_TRUE(isShown("detailSpinner"));
  EXPECT_THAT(texts(), Contains("Loading..."));
  databaseQueue().setHanging(false);
  settle();
  EXPECT_FALSE(isShown("detailSpinner"));
  EXPECT_NE(attribute("power"), nullptr);
}

TEST_F(MetricDetailWindowTest, AReadThatReturnsAtOnceNeverSpins) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launch();
  showsAllMetrics();
  tap(row("metricRow", "Tx Power"));
  for (int i = 0; i < 20; ++i) {
    pass(16ms);
    EXPECT_FALSE(isShown("detailSpinner"));
  }
}

TEST_F(MetricDetailWindowTest, ANewReadingChangesTheValueInItsPlaceAndTintsItForAMoment) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  hasStored(reading("LTE", "Tx Power", "band", "3"));
  launchOn("Tx Power");
  QQuickItem* const power = attribute("power");
  const QRectF before = place(power);
  const QImage calm = grab();
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(attribute("power"), power);
  EXPECT_EQ(value(power), "12");
  EXPECT_EQ(place(power), before);
  EXPECT_GT(find("changeTint", power)->opacity(), 0.1);
  EXPECT_EQ(find("changeTint", attribute("band"))->opacity(), 0);
  pass(700ms);
  EXPECT_EQ(find("changeTint", power)->opacity(), 0);
}

TEST_F(MetricDetailWindowTest, ATapOnTheBookmarkPinsAndAnotherUnpins) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOn("Tx Power");
  EXPECT_EQ(bookmark("power"), "bookmark");
  tap(inRow(attribute("power"), "bookmarkButton"));
  EXPECT_EQ(bookmark("power"), "bookmark.fill");
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power' AND metric_tech = 'LTE'"), 1);
  tap(inRow(attribute("power"), "bookmarkButton"));
  EXPECT_EQ(bookmark("power"), "bookmark");
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power' AND metric_tech = 'LTE'"), 0);
}

TEST_F(MetricDetailWindowTest, APinSurvivesReadingsThatArrive) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOn("Tx Power");
  tap(inRow(attribute("power"), "bookmarkButton"));
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(value(attribute("power")), "12");
  EXPECT_EQ(bookmark("power"), "bookmark.fill");
}

TEST_F(MetricDetailWindowTest, ALongPressCopiesTheValueAndSaysSo) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOn("Tx Power");
  longPress(attribute("power"));
  EXPECT_EQ(phone.pasteboard.text, "11");
  pass(300ms);
  EXPECT_EQ(text("toastText"), "copied");
  pass(1s);
  EXPECT_FALSE(isShown("toast"));
}

TEST_F(MetricDetailWindowTest, TheKeyboardCopiesAndReachesTheBookmark) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOn("Tx Power");
  find("attributeList")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_C, Qt::ControlModifier);
  EXPECT_EQ(phone.pasteboard.text, "11");
  inRow(attribute("power"), "bookmarkButton")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_Return);
  EXPECT_EQ(bookmark("power"), "bookmark.fill");
  key(Qt::Key_Space);
  EXPECT_EQ(bookmark("power"), "bookmark");
}

TEST_F(MetricDetailWindowTest, CaStatusStandsInItsSections) {
  hasStored(reading("LTE", "CA Status", "0-section-rsrp", "-90"));
  hasStored(reading("LTE", "CA Status", "1-section-rsrp", "-95"));
  hasStored(reading("LTE", "CA Status", "2-section-rsrp", "-99"));
  launchOn("CA Status");
  EXPECT_THAT(column("sectionHeader", "text"), ElementsAre("CA Status 0", "CA Status 1"));
  EXPECT_THAT(column("attributeRow", "name"), ElementsAre("rsrp", "rsrp"));
  EXPECT_THAT(column("attributeRow", "value"), ElementsAre("-90", "-95"));
}

TEST_F(MetricDetailWindowTest, APinOfASectionSurvivesReadingsThatArrive) {
  hasStored(reading("LTE", "CA Status", "0-section-rsrp", "-90"));
  hasStored(reading("LTE", "CA Status", "1-section-rsrp", "-95"));
  launchOn("CA Status");
  tap(inRow(attribute("rsrp"), "bookmarkButton"));
  pass(1s);
  arrives(reading("LTE", "CA Status", "0-section-rsrp", "-70"));
  EXPECT_EQ(value(attribute("rsrp")), "-70");
  EXPECT_EQ(bookmark("rsrp"), "bookmark.fill");
  tap(inRow(attribute("rsrp"), "bookmarkButton"));
  EXPECT_EQ(bookmark("rsrp"), "bookmark");
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = '0-section-rsrp'"), 0);
}

TEST_F(MetricDetailWindowTest, ALongValueTakesSeveralLinesInsideItsRow) {
  std::string bands = "1";
  for (int band = 2; band < 72; ++band) bands += "," + std::to_string(band);
  hasStored(reading("LTE", "Bands", "bands", bands));
  setSize(320, 640);
  launchOn("Bands");
  EXPECT_GT(attribute("bands")->height(), 100);
  longPress(attribute("bands"));
  EXPECT_EQ(phone.pasteboard.text, bands);
}

TEST_F(MetricDetailWindowTest, OnlyBuildsForEngineersShowTheGraphSymbol) {
  Metric graphable = reading("RAT", "Cell Info", "kHVCellMonitorCellId", "77");
  graphable.graphable = true;
  hasStored(graphable);
  launchOn("Cell Info");
  EXPECT_EQ(inRow(attribute("kHVCellMonitorCellId"), "graphButton"), nullptr);
}

TEST_F(MetricDetailWindowTest, AMetricWithoutReadingsSaysWhatBringsThem) {
  launchOn("Cell Info");
  pass(500ms);
  EXPECT_EQ(text("emptyTitle"), "No readings yet.");
  EXPECT_THAT(texts(), Contains("Attributes appear when the device sends “Cell Info”."));
  EXPECT_THAT(column("attributeRow", "name"), IsEmpty());
}

TEST_F(MetricDetailWindowTest, LeavingItFreesTheStoresSlot) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  launchOn("Tx Power");
  EXPECT_NE(store().storeDelegate(), nullptr);
  tap("backButton");
  pass(1s);
  EXPECT_EQ(store().storeDelegate(), nullptr);
}

}  // namespace
}  // namespace quorl
