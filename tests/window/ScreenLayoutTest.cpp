#include <tuple>

#include "ScreenWindow.h"
#include "shell/view/Appearance.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;

/// Every screen at several widths, in both palettes and with large type: nothing leaves the window, whatever is
/// pressed is large enough for a finger and has a name.
class ScreenLayoutTest : public test::ScreenWindowTest,
                         public ::testing::WithParamInterface<std::tuple<int, bool, double>> {
 protected:
  ScreenLayoutTest() {
    isInternalBuild();
    hasADashboard();
    hasStored(reading("LTE", "CA Status", "0-section-rsrp", "-90"));
    hasStored(reading("LTE", "CA Status", "1-section-rsrp", "-90"));
    Metric cell = reading("RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnologyOfTheServingCell", "-104");
    cell.graphable = true;
    hasStored(cell);
    hasStored(reading("RAT", "Cell Info", "kHVCellMonitorAVeryLongNameIndeedThatNeverEnds",
                      "AValueOfOneWordThatIsLongerThanAnyLineOfANarrowScreenCanEverBe"));
    setSize(std::get<0>(GetParam()), 700);
  }

  void looksRight(const char* screen) {
    SCOPED_TRACE(screen);
    for (QQuickItem* item : all(window().contentItem())) {
      if (item->inherits("QQuickText") && !item->property("text").toString().isEmpty()) isInside(item);
      if (item->inherits("QQuickAbstractButton")) canBePressed(item);
    }
  }

 private:
  static void collect(QQuickItem* item, std::vector<QQuickItem*>& items) {
    if (!item->isVisible() || item->opacity() == 0) return;
    items.push_back(item);
    if (item->objectName() == "bars") return;  // what is scrolled out of sight is clipped
    for (QQuickItem* child : item->childItems()) collect(child, items);
  }
  static std::vector<QQuickItem*> all(QQuickItem* root) {
    std::vector<QQuickItem*> items;
    collect(root, items);
    return items;
  }
  void isInside(QQuickItem* item) {
    const QRectF where = place(item);
    EXPECT_GE(where.left(), 0) << item->property("text").toString().toStdString();
    EXPECT_LE(where.right(), window().width() + 0.5) << item->property("text").toString().toStdString();
  }
  void canBePressed(QQuickItem* item) {
    const std::string name = item->objectName().toStdString() + " " + item->property("text").toString().toStdString();
    EXPECT_GE(item->height(), 44) << name;
    EXPECT_GE(item->width(), 44) << name;
  }
};

TEST_P(ScreenLayoutTest, EveryScreenFits) {
  launch();
  view::Appearance::shared().setDark(std::get<1>(GetParam()));
  view::Appearance::shared().setFontScale(std::get<2>(GetParam()));
  pass(500ms);
  looksRight("dashboard");
  tap("manageButton");
  pass(500ms);
  looksRight("managing");
  tap("closeButton");
  pass(500ms);
  showsAllMetrics();
  looksRight("list");
  tap("filterButton");
  looksRight("filter");
  tap("closeFilterButton");
  opens("CA Status");
  looksRight("sections");
  if (isShown("backButton")) {
    tap("backButton");
    pass(600ms);
  }
  opens("Cell Info");
  looksRight("detail");
  tap("graphButton");
  pass(600ms);
  looksRight("history");
  if (isShown("bar")) tap("bar");
  looksRight("selected bar");
  tap("exportButton");
  pass(500ms);
  looksRight("export");
}

INSTANTIATE_TEST_SUITE_P(Widths, ScreenLayoutTest,
                         ::testing::Values(std::tuple(320, false, 1.0), std::tuple(320, true, 1.6),
                                           std::tuple(720, true, 1.0), std::tuple(1280, false, 1.0)));

}  // namespace
}  // namespace quorl
