#include <QAccessible>
#include <filesystem>
#include <fstream>
#include <memory>
#include <set>
#include <string>

#include "ScreenWindow.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "screens/export/view/SaveText.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;

/// Every control of every screen without a mouse and without eyes: the keyboard gets to it, it has a name, and a finger
/// would hit it. Rows of a list are alike, so that one of a kind stands for all.
class ReachTest : public test::ScreenWindowTest, public ::testing::WithParamInterface<int> {
 protected:
  ReachTest() {
    isInternalBuild();
    hasLogCapture();
    hasADashboard();
    setSize(GetParam(), 700);
    simulator::SondrelSimulator::Options options;
    options.folder = phone.directory.path() / "Sondrel";
    library_ = std::make_unique<simulator::SondrelSimulator>(options, *phone.mainQueue, phone.time, phone.time);
    Platform::current().sondrel = library_.get();
    std::filesystem::create_directory(folder());
    view::SaveText::shared().setFolder(QString::fromStdString(folder().string()));
  }

  std::filesystem::path folder() const { return phone.directory.path() / "saved"; }

  /// What is below `root` is within reach: by Tab, and within a list by the arrow keys.
  void isWithinReach(const char* screen, QQuickItem* root) {
    SCOPED_TRACE(screen);
    ASSERT_NE(root, nullptr);
    window().grabWindow();
    std::set<std::string> controls;
    collect(root, [&](QQuickItem* item) {
      if (!isControl(item)) return;
      controls.insert(kindOf(item));
      hasAName(item);
      if (!isList(item)) isLargeEnough(item);
    });
    std::set<std::string> reached;
    for (int presses = 0; presses < kPresses; ++presses) {
      step(Qt::Key_Tab, reached);
      if (listOf(window().activeFocusItem()) == nullptr) continue;
      const Qt::Key onward = isHorizontal(listOf(window().activeFocusItem())) ? Qt::Key_Right : Qt::Key_Down;
      for (int rows = 0; rows < 3; ++rows) step(onward, reached);
    }
    for (const std::string& control : controls) EXPECT_TRUE(reached.contains(control)) << control << " is not reached";
  }
  /// The uppermost of the items of that name.
  QQuickItem* top(const QString& objectName) {
    const auto items = findAll(objectName);
    return items.empty() ? nullptr : items.back();
  }

 private:
  static constexpr int kPresses = 60;

  std::unique_ptr<simulator::SondrelSimulator> library_;

  void step(Qt::Key pressed, std::set<std::string>& reached) {
    WindowTest::key(pressed);
    for (QQuickItem* item = window().activeFocusItem(); item != nullptr; item = item->parentItem())
      if (isControl(item)) reached.insert(kindOf(item));
  }
  static bool isList(const QQuickItem* item) { return item->inherits("QQuickItemView"); }
  static bool isHorizontal(const QQuickItem* list) { return list->objectName() == "bars"; }
  static QQuickItem* listOf(QQuickItem* item) {
    while (item != nullptr && !isList(item)) item = item->parentItem();
    return item;
  }
  static bool isControl(const QQuickItem* item) {
    if (item->objectName() == "bar") return true;
    return item->inherits("QQuickAbstractButton") || item->inherits("QQuickTextField") ||
           item->inherits("QQuickSlider") || (isList(item) && item->property("count").toInt() > 0);
  }
  static std::string kindOf(QQuickItem* item) {
    const std::string name =
        item->objectName().isEmpty() ? item->metaObject()->className() : item->objectName().toStdString();
    QQuickItem* list = listOf(item->parentItem());
    return list == nullptr ? name : list->objectName().toStdString() + " / " + name;
  }
  template <typename Visitor>
  static void collect(QQuickItem* item, const Visitor& visitor) {
    if (!item->isVisible() || !item->isEnabled() || item->opacity() == 0) return;
    visitor(item);
    for (QQuickItem* child : item->childItems()) collect(child, visitor);
  }
  static void hasAName(QQuickItem* item) {
    QAccessibleInterface* face = QAccessible::queryAccessibleInterface(item);
    ASSERT_NE(face, nullptr) << kindOf(item);
    EXPECT_FALSE(face->text(QAccessible::Name).trimmed().isEmpty()) << kindOf(item) << " has no name";
    EXPECT_NE(face->role(), QAccessible::NoRole) << kindOf(item);
    EXPECT_NE(face->role(), QAccessible::Client) << kindOf(item);
  }
  static void isLargeEnough(const QQuickItem* item) {
    EXPECT_GE(item->width(), 44) << kindOf(const_cast<QQuickItem*>(item));
    EXPECT_GE(item->height(), 44) << kindOf(const_cast<QQuickItem*>(item));
  }
};

TEST_P(ReachTest, Dashboard) {
  launch();
  isWithinReach("dashboard", find("base"));
  tap("manageButton");
  pass(500ms);
  isWithinReach("managing", find("ManageDashboardViewController"));
}

TEST_P(ReachTest, MetricList) {
  launch();
  showsAllMetrics();
  isWithinReach("list", find("base"));
  tap("filterButton");
  isWithinReach("filter", find("base"));
}

TEST_P(ReachTest, DetailAndHistory) {
  for (const char* value : {"1", "2", "3"}) {
    Metric metric = reading("RAT", "Cell Info", "kHVCellMonitorCellId", value);
    metric.graphable = true;
    hasStored(metric);
  }
  launch();
  showsAllMetrics();
  opens("Cell Info");
  isWithinReach("detail", top("pageBar")->parentItem());
  tap("graphButton");
  pass(600ms);
  isWithinReach("history", top("pageBar")->parentItem());
}

TEST_P(ReachTest, Export) {
  launch();
  tap("exportButton");
  pass(500ms);
  isWithinReach("export", find("ExportViewController"));
  tap("exportOption0");
  pass(300ms);
  isWithinReach("save", find("saveSheetContent"));
  std::ofstream(folder() / view::SaveText::shared().fileName().toStdString()) << "there";
  tap("saveButton");
  pass(300ms);
  isWithinReach("replace", find("saveSheetContent"));
  tap("replaceButton");
  pass(300ms);
  isWithinReach("saved", find("saveSheetContent"));
}

TEST_P(ReachTest, Capture) {
  launch();
  tap("menuCell2");
  pass(1s);
  tap("startButton");
  pass(5s);
  isWithinReach("capture", find("base"));
  tap("configButton");
  pass(1s);
  isWithinReach("choice", find("choiceList")->parentItem());
}

TEST_P(ReachTest, UnknownBaseband) {
  phone.properties.texts.erase("BasebandChipset");
  launch();
  pass(1s);
  isWithinReach("dialog", find("alertButton")->parentItem());
}

INSTANTIATE_TEST_SUITE_P(Widths, ReachTest, ::testing::Values(320, 1024));

}  // namespace
}  // namespace quorl
