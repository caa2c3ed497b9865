#include "ScreenTest.h"
#include "screens/metricdetail/MetricDetailsViewController.h"

namespace quorl {
namespace {

using test::line;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

class MetricDetailScreenTest : public test::ScreenTest {
 protected:
  void open(const std::string& tech, const std::string& name) {
    screen = MetricDetailsViewController::make(store, tech, name, 0, now());
    screen->viewDidLoad();
    settle();
    log.clear();
  }
  void openCaStatus() {
    launch();
    stored(reading("LTE", "CA Status", "0-section-rsrp", "-90"));
    stored(reading("LTE", "CA Status", "1-section-rsrp", "-95"));
    stored(reading("LTE", "CA Status", "2-section-rsrp", "-99"));
    open("LTE", "CA Status");
  }
  const std::vector<MetricDetailView::Section>& sections() { return screen->view().sections(); }
  MetricDetailsViewCell& cell(std::size_t index, std::size_t section = 0) {
    return *sections().at(section).cells.at(index);
  }

  std::shared_ptr<MetricDetailsViewController> screen;
};

TEST_F(MetricDetailScreenTest, ShowsASpinnerInPlaceOfTheRowsUntilTheReadReturns) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  screen = MetricDetailsViewController::make(store, "LTE", "Tx Power", 0, now());
  screen->viewDidLoad();
  EXPECT_TRUE(screen->view().showsSpinner());
  EXPECT_THAT(sections().at(0).cells, IsEmpty());
  settle();
  EXPECT_FALSE(screen->view().showsSpinner());
  EXPECT_EQ(cell(0).nameText(), "power");
  EXPECT_EQ(cell(0).valueText(), "11");
  EXPECT_TRUE(log.has(line("app-ui", "MetricDetailsViewController - viewDidLoad - metricname: Tx Power")));
}

TEST_F(MetricDetailScreenTest, TheLineAboveTheRowsTellsOfTheLastLoad) {
  launch();
  open("LTE", "Tx Power");
  EXPECT_EQ(screen->view().lastSeenText(), "Last seen on: Mon, 09:30:12 UTC");
}

TEST_F(MetricDetailScreenTest, ASectionedNameAndABandwidthReadAsOnEveryScreen) {
  isMav();
  launch();
  stored(reading("LTE", "Component Carrier Info", "0-section-rsrp", "-90"));
  stored(reading("LTE", "Component Carrier Info", "dl_bw", "50"));
  open("LTE", "Component Carrier Info");
  EXPECT_EQ(cell(0).nameText(), "rsrp");
  EXPECT_EQ(cell(0).valueText(), "-90");
  EXPECT_EQ(cell(1).valueText(), "10 MHz");
}

TEST_F(MetricDetailScreenTest, ABandwidthIsToldByTheRawName) {
  platform.strings.table = {{"dl_bw", "Downlink bandwidth"}, {"power", "dl_bw"}};
  isMav();
  launch();
  stored(reading("LTE", "Serving Cell Info", "dl_bw", "50"));
  stored(reading("LTE", "Serving Cell Info", "power", "25"));
  open("LTE", "Serving Cell Info");
  EXPECT_EQ(cell(0).nameText(), "Downlink bandwidth");
  EXPECT_EQ(cell(0).valueText(), "10 MHz");
  EXPECT_EQ(cell(1).nameText(), "dl_bw");
  EXPECT_EQ(cell(1).valueText(), "25");
}

TEST_F(MetricDetailScreenTest, CaStatusShowsItsSectionsUnderTheirHeaders) {
  openCaStatus();
  ASSERT_THAT(sections(), SizeIs(2));
  EXPECT_EQ(sections()[0].header, "CA Status 0");
  EXPECT_EQ(sections()[1].header, "CA Status 1");
  EXPECT_EQ(cell(0, 1).nameText(), "rsrp");
  EXPECT_EQ(cell(0, 1).valueText(), "-95");
}

TEST_F(MetricDetailScreenTest, CaStatusWithoutSectionsShowsItsRows) {
  launch();
  stored(reading("LTE", "CA Status", "0-section-rsrp", "-90"));
  stored(reading("LTE", "CA Status", "subs_id", "0"));
  open("LTE", "CA Status");
  ASSERT_THAT(sections(), SizeIs(1));
  EXPECT_EQ(sections()[0].header, "");
  EXPECT_THAT(sections()[0].cells, SizeIs(2));
}

// Bookmarks.

TEST_F(MetricDetailScreenTest, ATapOnTheBookmarkPinsAndASecondUnpins) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  EXPECT_STREQ(cell(0).bookmarkSymbol(), "bookmark");
  cell(0).tapBookmark();
  EXPECT_STREQ(cell(0).bookmarkSymbol(), "bookmark.fill");
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 1);
  cell(0).tapBookmark();
  EXPECT_STREQ(cell(0).bookmarkSymbol(), "bookmark");
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
}

TEST_F(MetricDetailScreenTest, ThePinnedRowIsTheOneTappedThoughTheRowsHaveBeenSorted) {
  platform.strings.table = {{"power", "A power"}, {"band", "The band"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  stored(reading("LTE", "Tx Power", "band", "3"));
  open("LTE", "Tx Power");
  ASSERT_EQ(cell(0).nameText(), "A power");
  cell(0).tapBookmark();
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power'"), 1);
}

TEST_F(MetricDetailScreenTest, ASectionsRowPinsItself) {
  openCaStatus();
  cell(0, 1).tapBookmark();
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = '1-section-rsrp'"), 1);
}

TEST_F(MetricDetailScreenTest, TheMarkStaysFlippedWhenTheStatementFails) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  const auto lock = lockDatabase();
  cell(0).tapBookmark();
  settle();
  EXPECT_TRUE(cell(0).isBookmarked());
  screen->refresh();
  EXPECT_TRUE(cell(0).isBookmarked());
}

TEST_F(MetricDetailScreenTest, APinnedAttributeOpenedAgainShowsTheFilledSymbol) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  cell(0).tapBookmark();
  settle();
  open("LTE", "Tx Power");
  EXPECT_STREQ(cell(0).bookmarkSymbol(), "bookmark.fill");
}

TEST_F(MetricDetailScreenTest, ABookmarkTellsOfItsFlips) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  std::vector<bool> seen;
  const Connection connection = cell(0).onBookmarkChange([&](bool isBookmarked) { seen.push_back(isBookmarked); });
  cell(0).tapBookmark();
  EXPECT_THAT(seen, ElementsAre(false, true));
}

TEST_F(MetricDetailScreenTest, ANewReadingGetsANewCell) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  const auto before = sections().at(0).cells.at(0);
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_NE(sections().at(0).cells.at(0), before);
  EXPECT_EQ(cell(0).valueText(), "12");
  before->tapBookmark();  // a tap on what has just gone
  EXPECT_TRUE(log.has(line("metricDetail", "MetricDetailViewModel - updateDashboardItem - unable to unwrap metric")));
}

TEST_F(MetricDetailScreenTest, ANewReadingKeepsTheBookmarkOnShowUntilItIsMarkedItself) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  cell(0).tapBookmark();
  settle();
  bool hasFlickered = false;
  const Connection connection =
      screen->view().onChange([&] { hasFlickered = hasFlickered || !cell(0).isBookmarked(); });
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(cell(0).valueText(), "12");
  EXPECT_TRUE(cell(0).isBookmarked());
  EXPECT_FALSE(hasFlickered);
  // Unpinned elsewhere meanwhile.
  sql("DELETE FROM Dashboard");
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "13"));
  EXPECT_FALSE(cell(0).isBookmarked());
}

TEST_F(MetricDetailScreenTest, ATapOnTheBookmarkOfAReadingThatIsNotMarkedYetUnpins) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  cell(0).tapBookmark();
  settle();
  pass(1s);
  const Metric next = reading("LTE", "Tx Power", "power", "12");
  stored(next);
  bool hasTapped = false;
  const Connection connection = screen->view().onChange([&] {
    if (hasTapped || cell(0).valueText() != "12") return;
    hasTapped = true;
    cell(0).tapBookmark();
  });
  announced(next);
  settle();
  EXPECT_TRUE(hasTapped);
  EXPECT_FALSE(cell(0).isBookmarked());
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
}

TEST_F(MetricDetailScreenTest, ANewReadingOfASectionKeepsTheBookmarkAndASecondTapUnpins) {
  openCaStatus();
  cell(0, 1).tapBookmark();
  settle();
  pass(1s);
  arrives(reading("LTE", "CA Status", "1-section-rsrp", "-70"));
  ASSERT_EQ(cell(0, 1).valueText(), "-70");
  EXPECT_TRUE(cell(0, 1).isBookmarked());
  EXPECT_FALSE(cell(0, 0).isBookmarked());
  cell(0, 1).tapBookmark();
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
  pass(1s);
  arrives(reading("LTE", "CA Status", "1-section-rsrp", "-71"));
  EXPECT_FALSE(cell(0, 1).isBookmarked());
}

TEST_F(MetricDetailScreenTest, TheBookmarkOfASectionsRowIsOfItsSubscription) {
  openCaStatus();
  cell(0, 1).tapBookmark();
  for (const char* name : {"0-section-rsrp", "1-section-rsrp", "2-section-rsrp"})
    stored(reading("LTE", "CA Status", name, "-50", 1));
  announced(reading("LTE", "CA Status", "0-section-rsrp", "-50", 1));
  settle();
  ASSERT_EQ(cell(0, 1).valueText(), "-50");
  EXPECT_FALSE(cell(0, 1).isBookmarked());
  announced(reading("LTE", "CA Status", "0-section-rsrp", "-90", 0));
  settle();
  ASSERT_EQ(cell(0, 1).valueText(), "-95");
  EXPECT_TRUE(cell(0, 1).isBookmarked());
}

TEST_F(MetricDetailScreenTest, ATapOnASectionsRowThatHasGoneLeavesItsAttributeAsItWas) {
  openCaStatus();
  const auto before = sections().at(1).cells.at(0);
  pass(1s);
  arrives(reading("LTE", "CA Status", "1-section-rsrp", "-70"));
  before->tapBookmark();
  pass(1s);
  arrives(reading("LTE", "CA Status", "1-section-rsrp", "-71"));
  EXPECT_FALSE(cell(0, 1).isBookmarked());
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
}

// Graphs.

TEST_F(MetricDetailScreenTest, OnlyBuildsForEngineersAndCarriersShowTheGraphSymbol) {
  livesNow();
  launch();
  Metric graphable = reading("RAT", "Cell Info", "kHVCellMonitorCellId", "77");
  graphable.graphable = true;
  stored(graphable);
  stored(reading("RAT", "Cell Info", "kHVCellMonitorTAC", "4711"));
  open("RAT", "Cell Info");
  EXPECT_FALSE(cell(0).showsGraphSymbol());
  screen.reset();

  isInternalBuild();
  relaunch();
  open("RAT", "Cell Info");
  EXPECT_TRUE(cell(0).showsGraphSymbol());
  EXPECT_FALSE(cell(1).showsGraphSymbol());
  screen.reset();

  platform.properties.booleans.clear();
  isCarrierBuild();
  relaunch();
  open("RAT", "Cell Info");
  EXPECT_TRUE(cell(0).showsGraphSymbol());
}

TEST_F(MetricDetailScreenTest, ATapOnTheGraphSymbolOpensTheHistoryOfTheRow) {
  launch();
  stored(reading("RAT", "Cell Info", "kHVCellMonitorCellId", "77"));
  open("RAT", "Cell Info");
  std::shared_ptr<AttributeContentDetailsViewController> history;
  const Connection connection = screen->onOpenGraph([&](auto opened) { history = std::move(opened); });
  cell(0).tapGraph();
  ASSERT_NE(history, nullptr);
  EXPECT_EQ(history->metric().attributeNameNonLocalized, "kHVCellMonitorCellId");
  EXPECT_EQ(log.texts("app-ui"), std::vector<std::string>{"MetricDetailsViewController - cancellable - called"});
}

TEST_F(MetricDetailScreenTest, ATapOnTheGraphSymbolOfASectionsRowOpensTheHistoryOfThatRow) {
  openCaStatus();
  std::shared_ptr<AttributeContentDetailsViewController> history;
  const Connection connection = screen->onOpenGraph([&](auto opened) { history = std::move(opened); });
  cell(0, 1).tapGraph();
  ASSERT_NE(history, nullptr);
  EXPECT_EQ(history->metric().attributeNameNonLocalized, "1-section-rsrp");
  EXPECT_EQ(history->metric().sectionNumber, "1");
}

TEST_F(MetricDetailScreenTest, EachTapOnTheGraphSymbolOpensAScreenOfItsOwn) {
  launch();
  stored(reading("RAT", "Cell Info", "kHVCellMonitorCellId", "77"));
  open("RAT", "Cell Info");
  int opened = 0;
  const Connection connection = screen->onOpenGraph([&](const auto&) { ++opened; });
  cell(0).tapGraph();
  cell(0).tapGraph();
  EXPECT_EQ(opened, 2);
}

TEST_F(MetricDetailScreenTest, AWishMadeBeforeTheScreenListensIsGrantedWhenItDoes) {
  launch();
  stored(reading("RAT", "Cell Info", "kHVCellMonitorCellId", "77"));
  screen = MetricDetailsViewController::make(store, "RAT", "Cell Info", 0, now());
  settle();
  int opened = 0;
  const Connection connection = screen->onOpenGraph([&](const auto&) { ++opened; });
  cell(0).tapGraph();
  EXPECT_EQ(opened, 0);
  screen->viewDidLoad();
  EXPECT_EQ(opened, 1);
}

TEST_F(MetricDetailScreenTest, ARowWithoutAMetricOpensNothing) {
  launch();
  open("RAT", "Cell Info");
  int opened = 0;
  const Connection connection = screen->onOpenGraph([&](const auto&) { ++opened; });
  screen->view().viewProtocol().showGraphForItemAt(*screen->metricDetailsViewModel(), 3, 0, false);
  EXPECT_EQ(opened, 0);
  EXPECT_TRUE(log.has(line("app-ui", "showGraphForItemAt - showGraphForItemAt - unable to unwrap metric")));
}

// Copying.

TEST_F(MetricDetailScreenTest, ALongPressCopiesTheValueShown) {
  isMav();
  launch();
  stored(reading("LTE", "Serving Cell Info", "dl_bw", "50"));
  open("LTE", "Serving Cell Info");
  cell(0).longPress();
  EXPECT_EQ(platform.pasteboard.text, "10 MHz");
  EXPECT_TRUE(log.has(line("app-ui", "MetricDetailView - MetricDetailsViewCell - copiedString: 10 MHz")));
  EXPECT_TRUE(screen->view().showToast().isShowing());
  EXPECT_EQ(screen->view().showToast().text(), "copied");
  pass(1s);
  EXPECT_FALSE(screen->view().showToast().isShowing());
}

TEST_F(MetricDetailScreenTest, TheScreenTellsOfEveryChange) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  int changes = 0;
  const Connection connection = screen->view().onChange([&] { ++changes; });
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_GE(changes, 2);  // the rows, and then their bookmarks
  EXPECT_EQ(screen->view().lastSeenText(), "Last seen on: Mon, 09:30:13 UTC");
}

}  // namespace
}  // namespace quorl
