#include <QColor>
#include <QImage>
#include <algorithm>
#include <cmath>
#include <map>
#include <tuple>

#include "ScreenWindow.h"
#include "shell/view/Appearance.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;

/// Luminance as it is meant for contrast on screens, 0 for black to 1 for white.
double luminance(const QColor& color) {
  const auto linear = [](double part) {
    return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
  };
  return 0.2126 * linear(color.redF()) + 0.7152 * linear(color.greenF()) + 0.0722 * linear(color.blueF());
}

double contrast(const QColor& a, const QColor& b) {
  const auto [darker, lighter] = std::minmax({luminance(a), luminance(b)});
  return (lighter + 0.05) / (darker + 0.05);
}

/// The colour of most pixels.
QColor background(const QImage& image) {
  std::map<QRgb, int> counts;
  for (int y = 0; y < image.height(); ++y)
    for (int x = 0; x < image.width(); ++x) ++counts[image.pixel(x, y)];
  return std::max_element(counts.begin(), counts.end(),
                          [](const auto& a, const auto& b) { return a.second < b.second; })
      ->first;
}

double opacityOf(const QQuickItem* item) {
  double opacity = 1;
  for (; item != nullptr; item = item->parentItem()) opacity *= item->opacity();
  return opacity;
}

/// Every screen at several widths, in both palettes and with large type: nothing leaves the window, whatever is
/// pressed is large enough for a finger, every text stands out from what lies behind it, and none but names and values
/// is cut.
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
    const QImage picture = grab();
    for (QQuickItem* item : all(window().contentItem())) {
      if (item->inherits("QQuickText") && !item->property("text").toString().isEmpty()) {
        isInside(item);
        isLegible(item, picture);
        isWhole(item);
      }
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
  void isLegible(QQuickItem* item, const QImage& picture) {
    if (!item->isEnabled() || opacityOf(item) < 0.99) return;  // behind what is presented, or on its way
    const QRect where = place(item).toAlignedRect().intersected(picture.rect());
    if (where.height() < item->height() / 2 || where.isEmpty()) return;  // scrolled out of sight
    const QColor behind = background(picture.copy(where));
    EXPECT_GE(contrast(item->property("color").value<QColor>(), behind), 4.5)
        << item->property("text").toString().toStdString() << " on " << behind.name().toStdString();
  }
  void isWhole(QQuickItem* item) {
    if (std::get<2>(GetParam()) > 1 || item->property("elide").toInt() == Qt::ElideMiddle) return;
    EXPECT_FALSE(item->property("truncated").toBool()) << item->property("text").toString().toStdString();
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
