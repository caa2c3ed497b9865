#include <QAbstractItemModelTester>
#include <QSignalSpy>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/view/AlertsBinding.h"
#include "shell/view/CarrierBarBinding.h"
#include "shell/view/MenuBarBinding.h"
#include "support/FakePlatform.h"
#include "support/window/WindowFixture.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::vector<std::string> column(const QAbstractItemModel& model, int role) {
  std::vector<std::string> values;
  for (int row = 0; row < model.rowCount(); ++row)
    values.push_back(model.data(model.index(row, 0), role).toString().toStdString());
  return values;
}

class ShellModelsTest : public ::testing::Test {
 protected:
  static std::shared_ptr<HorvaneViewModel> carrier(const std::string& name, std::int32_t subsId) {
    return std::make_shared<HorvaneViewModel>(name, true, subsId, Uuid::make());
  }
  void update(const HorvaneViewModel::Entries& entries) {
    root_->update(entries);
    QCoreApplication::processEvents();
  }

  test::FakePlatform platform_;
  test::WarningCollector warnings_;
  std::shared_ptr<HorvaneViewModel> root_ = std::make_shared<HorvaneViewModel>();
  CarrierNameSegmentView carriers_{root_};
};

TEST_F(ShellModelsTest, TheTabBarsRowsAreItsCells) {
  view::MenuBarBinding model(MenuBar::make(3));
  const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Warning);
  EXPECT_THAT(column(model, view::MenuBarBinding::NameRole), ElementsAre("Dashboard", "All Metrics", "Sondrel"));
  EXPECT_THAT(column(model, view::MenuBarBinding::ImageNameRole), ElementsAre("house", "list.dash", "bolt"));
  QSignalSpy selected(&model, &view::MenuBarBinding::selected);
  model.press(2);
  model.press(-1);
  model.press(3);
  EXPECT_EQ(selected.count(), 1);
  EXPECT_THAT(column(model, view::MenuBarBinding::TintRole),
              ElementsAre("ButtonNormal", "ButtonNormal", "ButtonSelected"));
  EXPECT_THAT(warnings_.take(), IsEmpty());
}

TEST_F(ShellModelsTest, TheCarrierBarsRowsComeAndGoWithTheCarriers) {
  view::CarrierBarBinding model(carriers_);
  const QAbstractItemModelTester tester(&model, QAbstractItemModelTester::FailureReportingMode::Warning);
  EXPECT_EQ(model.litIndex(), -1);
  update({carrier("North", 0), carrier("South", 1)});
  EXPECT_THAT(column(model, view::CarrierBarBinding::TitleRole), ElementsAre("North", "South"));
  EXPECT_EQ(model.litIndex(), 0);
  update({carrier("South", 1)});
  EXPECT_THAT(column(model, view::CarrierBarBinding::TitleRole), ElementsAre("South"));
  update({});
  EXPECT_EQ(model.count(), 0);
  EXPECT_EQ(model.litIndex(), -1);
  EXPECT_THAT(warnings_.take(), IsEmpty());
}

TEST_F(ShellModelsTest, AnUpdateWithTheSameCarriersTakesNoRowAway) {
  view::CarrierBarBinding model(carriers_);
  update({carrier("North", 0), carrier("South", 1)});
  QSignalSpy removed(&model, &QAbstractItemModel::rowsRemoved);
  QSignalSpy inserted(&model, &QAbstractItemModel::rowsInserted);
  update({carrier("North", 0), carrier("South", 1)});
  EXPECT_EQ(removed.count(), 0);
  EXPECT_EQ(inserted.count(), 0);
}

TEST_F(ShellModelsTest, OfTwoLitTabsTheCapsuleStandsUnderThePressedOne) {
  view::CarrierBarBinding model(carriers_);
  update({carrier("North", 0), carrier("North", 1)});
  model.press(1);
  QCoreApplication::processEvents();
  EXPECT_EQ(model.litIndex(), 1);
  EXPECT_THAT(column(model, view::CarrierBarBinding::IsSelectedRole), ElementsAre("true", "true"));
}

TEST_F(ShellModelsTest, APressOutOfRangeDoesNothing) {
  view::CarrierBarBinding model(carriers_);
  model.press(0);
  model.press(-1);
  QCoreApplication::processEvents();
  EXPECT_EQ(carriers_.tab(), "");
}

TEST_F(ShellModelsTest, DialogsWaitForOneAnother) {
  view::AlertsBinding alerts;
  std::vector<std::string> pressed;
  alerts.present({"First", "One", "Done", [&] { pressed.emplace_back("First"); }});
  alerts.present({"Second", "Two", "Ok", nullptr});
  EXPECT_EQ(alerts.title(), "First");
  alerts.press();
  EXPECT_EQ(alerts.title(), "Second");
  EXPECT_EQ(alerts.button(), "Ok");
  alerts.press();
  EXPECT_FALSE(alerts.isShowing());
  alerts.press();
  EXPECT_THAT(pressed, ElementsAre("First"));
}

TEST_F(ShellModelsTest, ADialogsButtonMayBringTheNext) {
  view::AlertsBinding alerts;
  alerts.present({"First", "", "Done", [&] { alerts.present({"Second", "", "Done", nullptr}); }});
  alerts.press();
  EXPECT_EQ(alerts.title(), "Second");
}

}  // namespace
}  // namespace quorl
