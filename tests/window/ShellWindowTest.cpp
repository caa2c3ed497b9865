#include <QColor>
#include <QFont>
#include <cmath>
#include <string>

#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "hosts/simulator/TelephonyScript.h"
#include "shell/view/Appearance.h"
#include "support/window/WindowFixture.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;
namespace event = simulator::telephony_event;

class ShellWindowTest : public test::WindowTest {
 protected:
  void hasSim(HVSubscriptionSlot slot, const std::string& carrier) {
    telephony.perform(event::SimInserted{slot, carrier});
  }
  QRectF place(const QString& name) {
    const QQuickItem* item = find(name);
    return item == nullptr ? QRectF() : item->mapRectToScene(QRectF(0, 0, item->width(), item->height()));
  }
  std::string title() { return find("rootBar")->property("title").toString().toStdString(); }
  std::size_t numberOfTabs() {
    std::size_t count = 0;
    while (isShown("menuCell" + QString::number(count))) ++count;
    return count;
  }
  QString tint(int tab) { return find("menuIcon" + QString::number(tab))->property("color").toString(); }
  QColor backgroundPixel() { return grab().pixelColor(2, 2); }
};

TEST_F(ShellWindowTest, ALaunchShowsTheDashboardsLargeTitleOverTheTabs) {
  launch();
  EXPECT_EQ(text("largeTitle"), "Dashboard");
  EXPECT_EQ(numberOfTabs(), 2);
  EXPECT_EQ(tint(0), "#b63c0b");
  EXPECT_EQ(tint(1), "#7a8594");
  EXPECT_FALSE(isShown("exportButton"));
}

TEST_F(ShellWindowTest, TheBarsHaveTheirHeightsWithAndWithoutCarriers) {
  launch();
  EXPECT_EQ(place("menuBar").height(), 50);
  EXPECT_EQ(place("menuBar").width(), 390);
  EXPECT_EQ(place("carrierBar").top(), place("menuBar").bottom());
  EXPECT_EQ(place("carrierBar").height(), 50);
  EXPECT_EQ(place("container").top(), place("carrierBar").bottom());
  EXPECT_EQ(place("container").bottom(), 844);
  EXPECT_FALSE(isShown("carrierCapsule"));
}

TEST_F(ShellWindowTest, ATapMovesTheMarkerAndThenChangesTheScreen) {
  launch();
  tap("menuCell1");
  EXPECT_EQ(tint(1), "#b63c0b");
  pass(250ms);
  EXPECT_EQ(title(), "Dashboard");
  EXPECT_GT(place("menuMarker").left(), 97);
  EXPECT_LT(place("menuMarker").left(), 195);
  pass(250ms);
  EXPECT_EQ(title(), "All Metrics");
  EXPECT_EQ(place("menuMarker"), QRectF(195, place("menuBar").bottom() - 3, 195, 3));
}

TEST_F(ShellWindowTest, APressDuringTheMovementSendsTheMarkerOnFromWhereItIs) {
  isInternalBuild();
  hasLogCapture();
  launch();
  tap("menuCell2");
  pass(100ms);
  const double before = place("menuMarker").left();
  EXPECT_GT(before, 0);
  tap("menuCell0");
  EXPECT_NEAR(place("menuMarker").left(), before, 1);
  pass(480ms);
  EXPECT_EQ(title(), "Dashboard");
  pass(5s);
  EXPECT_EQ(title(), "Dashboard");
  EXPECT_EQ(place("menuMarker").left(), 0);
}

TEST_F(ShellWindowTest, KeysChangeTheTab) {
  launch();
  key(Qt::Key_2, Qt::ControlModifier);
  pass(500ms);
  EXPECT_EQ(title(), "All Metrics");
  key(Qt::Key_3, Qt::ControlModifier);  // there is none
  pass(500ms);
  EXPECT_EQ(title(), "All Metrics");
  key(Qt::Key_1, Qt::ControlModifier);
  pass(500ms);
  EXPECT_EQ(title(), "Dashboard");
}

TEST_F(ShellWindowTest, TheTabBarIsReachedAndPressedByKeyboard) {
  launch();
  QQuickItem* cell = find("menuCell1");
  for (int presses = 0; presses < 20 && !cell->hasActiveFocus(); ++presses) key(Qt::Key_Tab);
  ASSERT_TRUE(cell->hasActiveFocus());
  key(Qt::Key_Return);
  pass(500ms);
  EXPECT_EQ(title(), "All Metrics");
}

TEST_F(ShellWindowTest, AskedForLessMotionTheScreenChangesAtOnce) {
  view::Appearance::shared().setReducedMotion(true);
  launch();
  tap("menuCell1");
  settle();
  EXPECT_EQ(title(), "All Metrics");
  EXPECT_EQ(place("menuMarker").left(), 195);
}

TEST_F(ShellWindowTest, AnInternalMavThatCapturesLogsHasThreeTabsAndExportOnTwoOfThem) {
  isInternalBuild();
  hasLogCapture();
  launch();
  EXPECT_EQ(numberOfTabs(), 3);
  EXPECT_TRUE(isShown("exportButton"));
  tap("menuCell2");
  pass(500ms);
  EXPECT_EQ(title(), "Sondrel");
  EXPECT_FALSE(isShown("exportButton"));
  tap("menuCell0");
  pass(500ms);
  EXPECT_TRUE(isShown("exportButton"));
}

TEST_F(ShellWindowTest, ACarrierBuildOfAnIceDeviceHasTwoTabsAndExport) {
  isDevice("ice15");
  isCarrierBuild();
  hasLogCapture();
  launch();
  EXPECT_EQ(numberOfTabs(), 2);
  EXPECT_TRUE(isShown("exportButton"));
}

TEST_F(ShellWindowTest, TheExportIconStandsInItsCorner) {
  isInternalBuild();
  launch();
  const QRectF button = place("exportButton");
  EXPECT_EQ(button.center(), QPointF(390 - 16 - 15, place("rootBar").bottom() - 12 - 15));
  EXPECT_GE(button.width(), 44);
  EXPECT_GE(button.height(), 44);
}

TEST_F(ShellWindowTest, AnUnknownChipsetPutsTheDialogOverTheRunningShell) {
  phone.properties.texts.erase("BasebandChipset");
  launch();
  EXPECT_EQ(text("alertTitle"), "Error Occured");
  EXPECT_EQ(text("alertMessage"), "Unable to get baseband information. Please try again or file a bug report.");
  EXPECT_EQ(text("alertButton"), "Done");
  EXPECT_EQ(text("largeTitle"), "Dashboard");
  tap("menuCell1");
  key(Qt::Key_2, Qt::ControlModifier);
  key(Qt::Key_Escape);
  pass(1s);
  EXPECT_EQ(title(), "Dashboard");
  EXPECT_TRUE(isShown("alertButton"));
}

TEST_F(ShellWindowTest, DoneEndsTheProcessOfAnUnknownChipset) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  phone.properties.texts.erase("BasebandChipset");
  launch();
  EXPECT_DEATH(tap("alertButton"), "Fatal error: unknown baseband");
}

TEST_F(ShellWindowTest, ACarriersTabChoosesItsSubscriptionAndTheCapsuleMovesThere) {
  hasSim(1, "Testnet North");
  hasSim(2, "Testnet South");
  launch();
  pass(1s);
  EXPECT_EQ(text("carrierTitle0"), "Testnet North");
  EXPECT_EQ(text("carrierTitle1"), "Testnet South");
  EXPECT_EQ(HardwareManager::shared().currentSubsId(), 0);
  EXPECT_EQ(place("carrierCapsule").left(), 16);
  tap("carrierTab1");
  EXPECT_EQ(HardwareManager::shared().currentSubsId(), 1);
  pass(150ms);
  EXPECT_GT(place("carrierCapsule").left(), 20);
  EXPECT_LT(place("carrierCapsule").left(), 190);
  pass(1s);
  EXPECT_EQ(place("carrierCapsule").left(), 195);
  EXPECT_EQ(place("carrierCapsule").height(), 45);
}

TEST_F(ShellWindowTest, TwoCarriersOfOneNameLightUpTogether) {
  hasSim(1, "Testnet North");
  hasSim(2, "Testnet North");
  launch();
  pass(1s);
  tap("carrierTab1");
  EXPECT_TRUE(find("carrierTab0")->property("isSelected").toBool());
  EXPECT_TRUE(find("carrierTab1")->property("isSelected").toBool());
  EXPECT_EQ(HardwareManager::shared().currentSubsId(), 1);
}

TEST_F(ShellWindowTest, ASimThatGoesTakesItsTabAlong) {
  hasSim(1, "Testnet North");
  hasSim(2, "Testnet South");
  launch();
  pass(1s);
  telephony.perform(event::SimRemoved{2});
  pass(1s);
  EXPECT_TRUE(isShown("carrierTab0"));
  EXPECT_FALSE(isShown("carrierTab1"));
}

TEST_F(ShellWindowTest, TheWindowFollowsTheSystemsPalette) {
  launch();
  EXPECT_EQ(backgroundPixel(), QColor("#F7F8FA"));
  view::Appearance::shared().setDark(true);
  EXPECT_EQ(backgroundPixel(), QColor("#0E1217"));
}

TEST_F(ShellWindowTest, TypeFollowsTheSystemsFontScale) {
  launch();
  const double before = find("largeTitle")->property("font").value<QFont>().pixelSize();
  view::Appearance::shared().setFontScale(1.5);
  settle();
  EXPECT_EQ(find("largeTitle")->property("font").value<QFont>().pixelSize(), std::lround(before * 1.5));
}

TEST_F(ShellWindowTest, NothingLeavesTheWindowAtAnyWidth) {
  isInternalBuild();
  hasLogCapture();
  hasSim(1, "A carrier with quite a long name of its own");
  hasSim(2, "Testnet South");
  launch();
  pass(1s);
  for (const QSize size : {QSize(320, 568), QSize(390, 844), QSize(719, 900), QSize(768, 1024), QSize(1280, 800)}) {
    setSize(size.width(), size.height());
    pass(1s);
    for (const char* name : {"menuBar", "menuCell2", "carrierTab0", "carrierTab1", "exportButton", "container"}) {
      const QRectF item = place(name);
      EXPECT_FALSE(item.isEmpty()) << name << " at " << size.width();
      EXPECT_GE(item.left(), 0) << name << " at " << size.width();
      EXPECT_LE(item.right(), size.width()) << name << " at " << size.width();
      EXPECT_LE(item.bottom(), size.height()) << name << " at " << size.width();
    }
    EXPECT_GE(place("menuCell0").width(), 44);
  }
}

}  // namespace
}  // namespace quorl
