#include <QPointer>
#include <QQmlComponent>
#include <memory>

#include <gtest/gtest.h>

#include "support/window/WindowFixture.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;

/// Screens of the test's own, pushed and presented as the product's are.
class NavigationWindowTest : public test::WindowTest {
 protected:
  void launchAt(int width, int height) {
    setSize(width, height);
    launch();
    screen_ = std::make_unique<QQmlComponent>(&engine());
    screen_->setData(R"(
        import QtQuick
        import QtQuick.Controls.Basic
        import Quorl
        FocusScope {
            property var navigation
            property string title: "A title"
            property int rows: 0
            property alias flickable: list
            ListView {
                id: list
                objectName: "list"
                anchors.fill: parent
                clip: true
                model: parent.rows
                delegate: Text { required property int index; text: index; height: 44 }
            }
            Button { objectName: "focused"; focus: true; text: "A button" }
        })",
                     QUrl("qrc:/qt/qml/Quorl/TestScreen.qml"));
    ASSERT_TRUE(screen_->isReady()) << screen_->errorString().toStdString();
  }
  void ask(const char* what, const char* of, const QString& name, QVariantMap properties = {}) {
    properties["objectName"] = name;
    QObject* navigation = find(of)->property("navigation").value<QObject*>();
    ASSERT_NE(navigation, nullptr);
    QMetaObject::invokeMethod(navigation, what, Q_ARG(QVariant, QVariant::fromValue(screen_.get())),
                              Q_ARG(QVariant, properties));
    settle();
  }
  double left(const QString& name) { return find(name)->mapToScene({0, 0}).x(); }
  void selectList() {
    tap("menuCell1");
    pass(500ms);
  }

  std::unique_ptr<QQmlComponent> screen_;
};

TEST_F(NavigationWindowTest, OnAPhoneAPushedScreenSlidesOverAllAndComesOffAgain) {
  launchAt(390, 844);
  ask("push", "base", "pushed");
  EXPECT_GT(left("pushed"), 300);
  pass(400ms);
  EXPECT_EQ(left("pushed"), 0);
  EXPECT_EQ(find("pushed")->width(), 390);
  EXPECT_FALSE(find("base")->isEnabled());
  tap("backButton");
  pass(400ms);
  EXPECT_FALSE(isShown("pushed"));
  EXPECT_TRUE(find("base")->isEnabled());
}

TEST_F(NavigationWindowTest, EscapeGoesBackOneScreenAtATime) {
  launchAt(390, 844);
  ask("push", "base", "first");
  pass(400ms);
  ask("push", "first", "second");
  pass(400ms);
  ask("present", "second", "sheet");
  pass(400ms);
  for (const char* name : {"sheet", "second", "first"}) {
    EXPECT_TRUE(isShown(name)) << name;
    key(Qt::Key_Escape);
    pass(400ms);
    EXPECT_FALSE(isShown(name)) << name;
  }
  key(Qt::Key_Escape);
  EXPECT_EQ(text("largeTitle"), "Dashboard");
}

TEST_F(NavigationWindowTest, TheKeyboardFollowsTheUppermostScreen) {
  launchAt(390, 844);
  ask("push", "base", "pushed");
  EXPECT_TRUE(find("focused", find("pushed"))->hasActiveFocus());
  ask("present", "pushed", "sheet");
  EXPECT_TRUE(find("focused", find("sheet"))->hasActiveFocus());
  for (int presses = 0; presses < 5; ++presses) {
    key(Qt::Key_Tab);
    EXPECT_TRUE(find("sheet")->property("activeFocus").toBool());
  }
  key(Qt::Key_Escape);
  pass(400ms);
  EXPECT_TRUE(find("pushed")->property("activeFocus").toBool());
}

TEST_F(NavigationWindowTest, WhatLiesUnderAPresentedScreenTakesNoTouch) {
  launchAt(390, 844);
  ask("present", "base", "sheet");
  pass(400ms);
  tap("menuCell1");
  pass(1s);
  EXPECT_EQ(text("largeTitle"), "Dashboard");
}

TEST_F(NavigationWindowTest, APresentedScreenDismissesItself) {
  launchAt(390, 844);
  ask("present", "base", "sheet");
  pass(400ms);
  QMetaObject::invokeMethod(find("sheet")->property("navigation").value<QObject*>(), "dismiss");
  pass(400ms);
  EXPECT_FALSE(isShown("sheet"));
}

TEST_F(NavigationWindowTest, AKeyForAnotherTabLeavesThePushedScreens) {
  launchAt(390, 844);
  ask("push", "base", "pushed");
  pass(400ms);
  key(Qt::Key_2, Qt::ControlModifier);
  pass(600ms);
  EXPECT_FALSE(isShown("pushed"));
  EXPECT_EQ(text("largeTitle"), "All Metrics");
}

TEST_F(NavigationWindowTest, AWideWindowShowsListAndDetailSideBySide) {
  launchAt(1024, 768);
  selectList();
  EXPECT_TRUE(isShown("emptyDetail"));
  EXPECT_EQ(find("base")->width(), 410);
  ask("push", "base", "detail");
  pass(400ms);
  EXPECT_FALSE(isShown("emptyDetail"));
  EXPECT_EQ(left("detail"), 411);
  EXPECT_TRUE(find("base")->isEnabled());
}

TEST_F(NavigationWindowTest, BesideTheListANewDetailReplacesTheOldAndItsGraphGoesOverIt) {
  launchAt(1024, 768);
  selectList();
  ask("push", "base", "first");
  ask("push", "base", "second");
  pass(400ms);
  EXPECT_FALSE(isShown("first"));
  ask("push", "second", "graph");
  pass(400ms);
  EXPECT_EQ(left("graph"), 411);
  key(Qt::Key_Escape);
  pass(400ms);
  EXPECT_FALSE(isShown("graph"));
  EXPECT_TRUE(isShown("second"));
}

TEST_F(NavigationWindowTest, TheDetailStaysWithItsTab) {
  launchAt(1024, 768);
  selectList();
  ask("push", "base", "detail");
  pass(400ms);
  tap("menuCell0");
  pass(600ms);
  EXPECT_FALSE(isShown("detail"));
  EXPECT_EQ(find("base")->width(), 1024);
  tap("menuCell1");
  pass(600ms);
  EXPECT_TRUE(isShown("detail"));
}

TEST_F(NavigationWindowTest, AWindowThatGrowsOrShrinksKeepsItsScreens) {
  launchAt(390, 844);
  selectList();
  ask("push", "base", "detail");
  pass(400ms);
  setSize(720, 900);
  EXPECT_EQ(left("detail"), 321);
  setSize(719, 900);
  EXPECT_EQ(left("detail"), 0);
  EXPECT_EQ(find("detail")->width(), 719);
}

TEST_F(NavigationWindowTest, OnAWideWindowAPresentedScreenIsASheetInTheMiddle) {
  launchAt(1024, 900);
  ask("present", "base", "sheet");
  pass(400ms);
  const QRectF sheet = find("sheet")->mapRectToScene(QRectF(0, 0, find("sheet")->width(), find("sheet")->height()));
  EXPECT_LT(sheet.width(), 700);
  EXPECT_EQ(sheet.center(), QPointF(512, 450));
}

TEST_F(NavigationWindowTest, TheLargeTitleGivesWayOnceTheListIsScrolledAndComesBackAtItsStart) {
  launchAt(390, 844);
  ask("push", "base", "pushed", {{"rows", 100}});
  pass(400ms);
  QQuickItem* bar = find("pageBar");
  const double large = bar->height();
  EXPECT_TRUE(isShown("largeTitle"));
  QQuickItem* list = find("list", find("pushed"));
  list->setProperty("contentY", 200);
  pass(300ms);
  EXPECT_LT(bar->height(), large);
  EXPECT_EQ(find("barTitle", bar)->opacity(), 1);
  EXPECT_EQ(find("barTitle", bar)->property("text"), "A title");
  list->setProperty("contentY", 10);
  pass(300ms);
  EXPECT_LT(bar->height(), large);
  list->setProperty("contentY", 0);
  pass(300ms);
  EXPECT_EQ(bar->height(), large);
}

TEST_F(NavigationWindowTest, AShortListKeepsItsLargeTitle) {
  launchAt(390, 844);
  ask("push", "base", "pushed", {{"rows", 17}});
  pass(400ms);
  QQuickItem* bar = find("pageBar");
  const double large = bar->height();
  find("list", find("pushed"))->setProperty("contentY", 20);
  pass(300ms);
  EXPECT_EQ(bar->height(), large);
}

TEST_F(NavigationWindowTest, AScreenIsFreedOnceItHasLeft) {
  launchAt(390, 844);
  ask("push", "base", "pushed");
  const QPointer<QQuickItem> pushed = find("pushed");
  key(Qt::Key_Escape);
  pass(400ms);
  EXPECT_EQ(pushed, nullptr);
}

}  // namespace
}  // namespace quorl
