#include <QAbstractItemModelTester>
#include <QColor>
#include <QPointF>
#include <QQmlComponent>
#include <QSignalSpy>
#include <QTest>
#include <chrono>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/CircularTransition.h"
#include "shell/TickerViewController.h"
#include "shell/view/CircularTransitionBinding.h"
#include "shell/view/TickerColumnsModel.h"
#include "support/window/WindowFixture.h"
#include "telephony/HorvaneMetricDetails.h"
#include "telephony/view/BandCellsModel.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;
using ::testing::ElementsAre;

std::vector<Metric> bands(const std::vector<std::string>& values) {
  std::vector<Metric> rows;
  for (const std::string& value : values) {
    rows.emplace_back();
    rows.back().attributeValue = value;
  }
  return rows;
}

TEST(TickerColumnsModelTest, KeepsTheRulesOfAModel) {
  TickerViewController ticker;
  view::TickerColumnsModel model(ticker);
  const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal);
  for (const double value : {0.0, 1.5, 99.99, 100.0, -3.25, 7.0}) {
    model.setNumberValue(value);
    EXPECT_EQ(model.rowCount(), model.stringValue().size()) << value;
  }
}

TEST(BandCellsModelTest, KeepsTheRulesOfAModel) {
  const HorvaneMetricDetails screen(bands({"2", "4", "66"}), "Active Bands");
  view::BandCellsModel model(screen);
  const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal);
  EXPECT_EQ(model.rowCount(), 3);
  EXPECT_EQ(model.data(model.index(2), view::BandCellsModel::MainTextRole), "66");
  EXPECT_EQ(model.data(model.index(2), view::BandCellsModel::IsSecondTextHiddenRole), true);
}

/// The page of the widgets that no screen shows.
class GalleryWindowTest : public test::WindowTest {
 protected:
  void opens() {
    launch();
    QQmlComponent page(&engine(), QUrl::fromLocalFile(QUORL_SOURCE_DIR "/tests/support/window/Gallery.qml"));
    ASSERT_TRUE(page.isReady()) << page.errorString().toStdString();
    item_.reset(qobject_cast<QQuickItem*>(
        page.createWithInitialProperties({{"parent", QVariant::fromValue(window().contentItem())},
                                          {"ticker", QVariant::fromValue(&tickerModel_)},
                                          {"bands", QVariant::fromValue(&bandsModel_)}})));
    ASSERT_NE(item_, nullptr);
    grab();  // lays out what stands under one another
  }
  void TearDown() override {
    item_.reset();
    WindowTest::TearDown();
  }
  /// What stands in the middle of each column.
  std::string shown() {
    std::string result;
    for (QQuickItem* column : findAll("tickerColumn")) {
      for (QQuickItem* label : findAll("numberLabel", column)) {
        const double middle = label->mapToItem(column, QPointF(0, label->height() / 2)).y();
        if (middle > 0 && middle < column->height()) result += label->property("text").toString().toStdString();
      }
    }
    return result;
  }

  TickerViewController ticker_;
  view::TickerColumnsModel tickerModel_{ticker_};
  const HorvaneMetricDetails bandsScreen_{bands({"2", "4", "12", "66", "n41"}), "Active Bands"};
  view::BandCellsModel bandsModel_{bandsScreen_};
  std::unique_ptr<QQuickItem> item_;
};

TEST_F(GalleryWindowTest, TheTickerScrollsEachColumnToItsDigit) {
  opens();
  tickerModel_.setNumberValue(12.34);
  settle();
  std::vector<double> widths;
  for (const QQuickItem* column : findAll("tickerColumn")) widths.push_back(column->width());
  EXPECT_THAT(widths, ElementsAre(20, 32, 8, 20, 20));
  pass(1s);
  EXPECT_EQ(shown(), "12.34");
  tickerModel_.setNumberValue(98.76);
  EXPECT_EQ(shown(), "12.34");
  pass(1s);
  EXPECT_EQ(shown(), "98.76");
}

TEST_F(GalleryWindowTest, AColumnUnderWayIsLeftAloneAndTheNextValueCatchesUp) {
  opens();
  tickerModel_.setNumberValue(11.11);
  pass(1s);
  tickerModel_.setNumberValue(55.55);
  pass(100ms);
  tickerModel_.setNumberValue(22.22);
  pass(1s);
  EXPECT_EQ(shown(), "55.55");
  tickerModel_.setNumberValue(22.22);
  pass(1s);
  EXPECT_EQ(shown(), "22.22");
}

TEST_F(GalleryWindowTest, TheTickerTakesNoTouches) {
  opens();
  tickerModel_.setNumberValue(1);
  pass(1s);
  swipe(find("tickerColumn"), 0, -40);
  EXPECT_EQ(shown(), "1.00");
}

TEST_F(GalleryWindowTest, TheBandsStandInAGridUnderTheirTitle) {
  opens();
  EXPECT_EQ(text("bandSectionTitle"), "Active Bands");
  std::vector<std::string> values;
  for (const QQuickItem* cell : findAll("bandMainText"))
    values.push_back(cell->property("text").toString().toStdString());
  EXPECT_THAT(values, ElementsAre("2", "4", "12", "66", "n41"));
  EXPECT_FALSE(isShown("bandSecondText"));
}

TEST_F(GalleryWindowTest, AListCellDimsWhilePressedAndComesBackAfterADelay) {
  opens();
  QQuickItem* cell = find("secondCell");
  const QPoint middle = cell->mapToScene(QPointF(cell->width() / 2, cell->height() / 2)).toPoint();
  QTest::mousePress(&window(), Qt::LeftButton, Qt::NoModifier, middle);
  settle();
  EXPECT_EQ(cell->opacity(), 0.5);
  QTest::mouseRelease(&window(), Qt::LeftButton, Qt::NoModifier, middle);
  EXPECT_EQ(cell->opacity(), 0.5);
  pass(48ms);
  EXPECT_EQ(cell->opacity(), 0.5);
  pass(256ms);
  EXPECT_NEAR(cell->opacity(), 0.75, 0.03);
  pass(256ms);
  EXPECT_EQ(cell->opacity(), 1);
}

TEST_F(GalleryWindowTest, TheWaitingStateSaysSo) {
  opens();
  EXPECT_EQ(text("spinningText"), "Loading...");
  EXPECT_EQ(text("toastText"), "copied");
  EXPECT_EQ(find("loadingLabel")->x() - (find("loading")->childItems().constFirst()->width()), 5);
}

constexpr char kTransitionPage[] = R"(
import QtQuick
import Quorl

Item {
    id: page

    required property CircularTransitionBinding binding

    anchors.fill: parent

    Rectangle {
        id: moving

        objectName: "moving"
        width: page.width
        height: page.height
    }
    CircularTransition {
        objectName: "transition"
        anchors.fill: parent
        binding: page.binding
        view: moving
    }
})";

/// A view that comes and goes in a circle around a point of the window.
class CircularTransitionWindowTest : public test::WindowTest {
 protected:
  void opens() {
    launch();
    transition_.setStartingPoint({kOrigin.x(), kOrigin.y()});
    QQmlComponent page(&engine());
    page.setData(kTransitionPage, {});
    ASSERT_TRUE(page.isReady()) << page.errorString().toStdString();
    page_.reset(qobject_cast<QQuickItem*>(page.createWithInitialProperties(
        {{"parent", QVariant::fromValue(window().contentItem())}, {"binding", QVariant::fromValue(&binding_)}})));
    ASSERT_NE(page_, nullptr);
    view_ = page_->findChild<QQuickItem*>("moving");
    circle_ = page_->findChild<QQuickItem*>("transitionCircle");
    ends_ = std::make_unique<QSignalSpy>(page_->findChild<QQuickItem*>("transition"), SIGNAL(finished()));
    grab();
    middle_ = {page_->width() / 2, page_->height() / 2};
  }
  void TearDown() override {
    ends_.reset();
    page_.reset();
    WindowTest::TearDown();
  }
  void runs(view::CircularTransitionBinding::Mode mode) {
    QMetaObject::invokeMethod(page_->findChild<QQuickItem*>("transition"), "run", Q_ARG(QVariant, mode));
  }

  static void expectCentre(const QQuickItem* item, QPointF point) {
    const QPointF centre = item->mapToScene(QPointF(item->width() / 2, item->height() / 2));
    EXPECT_NEAR(centre.x(), point.x(), 0.01);
    EXPECT_NEAR(centre.y(), point.y(), 0.01);
  }
  void expectSmallestAtItsOrigin() {
    EXPECT_DOUBLE_EQ(view_->scale(), 0.001);
    EXPECT_DOUBLE_EQ(circle_->scale(), 0.001);
    EXPECT_EQ(view_->opacity(), 0);
    expectCentre(view_, kOrigin);
    expectCentre(circle_, kOrigin);
  }
  void expectWholeInItsPlace() {
    EXPECT_EQ(view_->scale(), 1);
    EXPECT_EQ(circle_->scale(), 1);
    EXPECT_EQ(view_->opacity(), 1);
    expectCentre(view_, middle_);
    expectCentre(circle_, kOrigin);
  }
  void expectHalfWay() {
    const double progress = view_->opacity();
    EXPECT_NEAR(progress, 0.5, 0.2);
    EXPECT_NEAR(view_->scale(), progress, 0.01);
    EXPECT_EQ(circle_->scale(), view_->scale());
    expectCentre(view_, kOrigin + (middle_ - kOrigin) * progress);
    expectCentre(circle_, kOrigin);
  }

  static constexpr QPointF kOrigin{60, 700};
  CircularTransition transition_;
  view::CircularTransitionBinding binding_{transition_};
  std::unique_ptr<QQuickItem> page_;
  std::unique_ptr<QSignalSpy> ends_;
  QQuickItem* view_ = nullptr;
  QQuickItem* circle_ = nullptr;
  QPointF middle_;
};

TEST_F(CircularTransitionWindowTest, TheCircleIsWhiteUnlessAColourIsNamed) {
  opens();
  EXPECT_EQ(circle_->property("color").value<QColor>(), QColor("white"));
}

TEST_F(CircularTransitionWindowTest, TheCircleHasTheColourOfThatName) {
  transition_.setCircleColor("ButtonSelected");
  opens();
  EXPECT_EQ(circle_->property("color").value<QColor>(), QColor("#B63C0B"));
}

TEST_F(CircularTransitionWindowTest, AViewThatIsPresentedGrowsOutOfThePointIntoItsPlace) {
  opens();
  runs(view::CircularTransitionBinding::Present);
  expectSmallestAtItsOrigin();
  pass(150ms);
  expectHalfWay();
  EXPECT_EQ(ends_->count(), 0);
  pass(200ms);
  expectWholeInItsPlace();
  EXPECT_EQ(ends_->count(), 1);
  EXPECT_EQ(transition_.transitionMode(), CircularTransitionMode::present);
}

TEST_F(CircularTransitionWindowTest, AViewThatIsDismissedShrinksIntoThePoint) {
  opens();
  runs(view::CircularTransitionBinding::Present);
  pass(400ms);
  runs(view::CircularTransitionBinding::Dismiss);
  expectWholeInItsPlace();
  pass(150ms);
  expectHalfWay();
  EXPECT_EQ(ends_->count(), 1);
  pass(200ms);
  expectSmallestAtItsOrigin();
  EXPECT_EQ(ends_->count(), 2);
  EXPECT_EQ(transition_.transitionMode(), CircularTransitionMode::dismiss);
}

TEST_F(CircularTransitionWindowTest, APopShrinksTheViewThatComesLikeOneThatGoesAsMeant) {
  opens();
  runs(view::CircularTransitionBinding::Pop);  // nothing was presented before
  expectWholeInItsPlace();
  pass(150ms);
  expectHalfWay();
  EXPECT_EQ(ends_->count(), 0);
  pass(200ms);
  expectSmallestAtItsOrigin();
  EXPECT_EQ(ends_->count(), 1);
  EXPECT_EQ(transition_.transitionMode(), CircularTransitionMode::pop);
}

}  // namespace
}  // namespace quorl
