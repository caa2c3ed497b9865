#include "ScreenWindow.h"

namespace quorl {
namespace {

using test::value;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;
using namespace std::chrono_literals;

class DashboardWindowTest : public test::ScreenWindowTest {
 protected:
  QQuickItem* attribute(const std::string& name) { return row("dashboardRow", name); }
  void opensManaging() {
    tap("manageButton");
    pass(500ms);
  }
  QQuickItem* managed(const std::string& name) { return row("managedRow", name); }
  void tick() { pass(15s); }
};

TEST_F(DashboardWindowTest, ShowsWhatIsPinnedWithItsMetricAndItsValue) {
  hasADashboard();
  launch();
  EXPECT_THAT(column("dashboardRow", "name"), UnorderedElementsAre("power", "dl_freq"));
  EXPECT_EQ(value(attribute("power")), "11");
  EXPECT_EQ(attribute("power")->property("context").toString(), QStringLiteral("LTE · Tx Power"));
  EXPECT_THAT(texts(), Contains("2 attributes"));
}

TEST_F(DashboardWindowTest, ABandwidthHasAThinSpaceBeforeItsUnitAndIsCopiedWithABlank) {
  hasADashboard();
  const Metric bandwidth = reading("LTE", "Serving Cell Info", "dl_bw", "50");
  hasStored(bandwidth);
  hasPinned(bandwidth);
  launch();
  EXPECT_EQ(value(attribute("dl_bw")), "10\u2009MHz");
  longPress(attribute("dl_bw"));
  EXPECT_EQ(phone.pasteboard.text, "10 MHz");
}

TEST_F(DashboardWindowTest, AnAttributeOfASectionIsNamedWithItHereAndWhereItIsManaged) {
  hasADashboard();
  const Metric signal = reading("LTE", "CA Status", "1-section-rsrp", "-95");
  hasStored(signal);
  hasPinned(signal);
  launch();
  EXPECT_EQ(value(attribute("rsrp (CA 1)")), "-95");
  opensManaging();
  EXPECT_NE(managed("rsrp (CA 1)"), nullptr);
}

TEST_F(DashboardWindowTest, AValueChangesInItsPlaceAtTheNextTick) {
  hasADashboard();
  launch();
  QQuickItem* const power = attribute("power");
  const QRectF before = place(power);
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(value(power), "11");
  tick();
  EXPECT_EQ(attribute("power"), power);
  EXPECT_EQ(value(power), "12");
  EXPECT_EQ(place(power), before);
  EXPECT_THAT(text("refreshedLine"), HasSubstr("Last refreshed: "));
}

TEST_F(DashboardWindowTest, AGraphableAttributeDrawsItsTraceAndOthersDoNot) {
  const Metric cell = reading("RAT", "Cell Info", "kHVCellMonitorCellId", "77");
  hasADashboard();
  hasStored(cell);
  hasPinned(cell);
  launch();
  pass(1s);
  arrives(reading("RAT", "Cell Info", "kHVCellMonitorCellId", "78"));
  arrives(reading("LTE", "Tx Power", "power", "12"));
  tick();
  const auto trace = [this](const std::string& name) {
    return attribute(name)->property("trace").value<QList<qreal>>();
  };
  EXPECT_THAT(trace("kHVCellMonitorCellId"), ElementsAre(0, 1));
  EXPECT_THAT(trace("power"), IsEmpty());
}

TEST_F(DashboardWindowTest, ALongPressCopiesTheValueAndSaysSoForASecond) {
  hasADashboard();
  launch();
  longPress(attribute("power"));
  EXPECT_EQ(phone.pasteboard.text, "11");
  pass(300ms);
  EXPECT_EQ(text("toastText"), "copied");
  pass(1s);
  EXPECT_FALSE(isShown("toast"));
}

TEST_F(DashboardWindowTest, TheKeyboardCopiesTheValueInFocus) {
  hasADashboard();
  launch();
  find("dashboardList")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_C, Qt::ControlModifier);
  const auto first = phone.pasteboard.text;
  EXPECT_THAT((std::vector<std::string>{"11", "5230"}), Contains(first.value_or("")));
  key(Qt::Key_Down);
  key(Qt::Key_Return);
  EXPECT_NE(phone.pasteboard.text, first);
}

TEST_F(DashboardWindowTest, WithoutReadingsItSaysWhatBringsThem) {
  launch();
  pass(1s);
  EXPECT_EQ(text("emptyTitle"), "No readings yet.");
  EXPECT_THAT(texts(), Contains("Metrics appear when the baseband sends them."));
  EXPECT_THAT(column("dashboardRow", "name"), IsEmpty());
}

TEST_F(DashboardWindowTest, AnAttributePinnedInItsDetailAppearsAtTheNextTickAndIsSwipedAway) {
  hasADashboard();
  hasStored(reading("LTE", "RRC State", "state", "3"));
  launch();
  showsAllMetrics();
  opens("RRC State");
  tap(inRow(row("attributeRow", "state"), "bookmarkButton"));
  tap("backButton");
  pass(600ms);
  showsDashboard();
  EXPECT_EQ(attribute("state"), nullptr);
  tick();
  ASSERT_NE(attribute("state"), nullptr);
  EXPECT_EQ(value(attribute("state")), "3");

  opensManaging();
  EXPECT_EQ(text("swipeHint"), "Swipe to delete");
  ASSERT_NE(managed("state"), nullptr);
  swipe(managed("state"), -250, 0);
  pass(2s);
  EXPECT_EQ(managed("state"), nullptr);
  EXPECT_EQ(find("managedList")->property("count").toInt(), 2);
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'state'"), 0);
  tap("closeButton");
  pass(500ms);
  EXPECT_FALSE(isShown("managedList"));
  EXPECT_EQ(attribute("state"), nullptr);
  EXPECT_NE(attribute("power"), nullptr);
}

TEST_F(DashboardWindowTest, TheDeleteKeyTakesTheRowInFocusAway) {
  hasADashboard();
  launch();
  opensManaging();
  const std::vector<std::string> before = column("managedRow", "name");
  ASSERT_EQ(before.size(), 2U);
  find("managedList")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_Delete);
  pass(1s);
  EXPECT_THAT(column("managedRow", "name"), ElementsAre(before[1]));
  key(Qt::Key_Escape);
  pass(500ms);
  EXPECT_FALSE(isShown("managedList"));
}

TEST_F(DashboardWindowTest, ARowThatCannotBeDeletedComesBackUnderAnAlert) {
  hasADashboard();
  launch();
  opensManaging();
  const auto lock = lockDatabase();
  swipe(managed("power"), -250, 0);
  pass(2s);
  EXPECT_THAT(texts(), Contains("unable to delete metric from dashboard please try again later"));
  EXPECT_EQ(text("alertButton"), "Ok");
  ASSERT_NE(managed("power"), nullptr);
  EXPECT_EQ(managed("power")->property("swipe").value<QObject*>()->property("position").toDouble(), 0);
  tap("alertButton");
}

TEST_F(DashboardWindowTest, AManagingScreenWithoutRowsSaysHowToPin) {
  launch();
  store().executeDashboardStatement("DELETE FROM Dashboard", [](bool, const std::optional<SQLiteError>&) {});
  settle();
  opensManaging();
  pass(1s);
  EXPECT_THAT(texts(), Contains("Nothing is pinned."));
}

}  // namespace
}  // namespace quorl
