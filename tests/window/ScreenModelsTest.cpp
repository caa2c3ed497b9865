#include <QAbstractItemModelTester>
#include <algorithm>
#include <random>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "intake/ZelkorWrapper.h"
#include "screens/dashboard/view/DashboardListModel.h"
#include "screens/dashboard/view/ManageDashboardBinding.h"
#include "screens/history/view/GraphBarsModel.h"
#include "screens/metricdetail/view/MetricDetailsListModel.h"
#include "screens/metriclist/view/AllMetricsListModel.h"
#include "support/FakePlatform.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl::view {
namespace {

/// Each model under Qt's own tester, which ends the test at the first breach, while its rows change at random.
class ScreenModelsTest : public ::testing::Test {
 protected:
  ~ScreenModelsTest() override { platform.time.settle(); }

  unsigned below(unsigned limit) { return static_cast<unsigned>(random() % limit); }
  std::string text(unsigned limit) { return std::string(1, static_cast<char>('a' + below(limit))); }
  Metric row() {
    Metric metric;
    metric.id = Uuid::make();
    metric.metricTech = "LTE";
    metric.metricName = text(3);
    metric.attributeNameNonLocalized = metric.attributeName = text(9);
    metric.attributeValue = std::to_string(below(5));
    metric.collectedOn = platform.time.now() + std::chrono::seconds(below(4));
    metric.graphable = below(2) == 0;
    return metric;
  }
  std::vector<Metric> rows() {
    std::vector<Metric> made(below(12));
    std::generate(made.begin(), made.end(), [this] { return row(); });
    return made;
  }

  static constexpr auto kFatal = QAbstractItemModelTester::FailureReportingMode::Fatal;
  static constexpr int kRounds = 500;

  test::FakePlatform platform;
  std::mt19937 random{11};  // NOLINT: a test's numbers are to be the same in every run
};

TEST_F(ScreenModelsTest, Dashboard) {
  const auto store = std::make_shared<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
  const auto viewModel = DashboardViewModel::make(store);
  DashboardListModel model(viewModel);
  const QAbstractItemModelTester tester(&model, kFatal);
  for (int round = 0; round < kRounds; ++round) {
    viewModel->updateDashboardDataSource(rows());
    ASSERT_EQ(model.rowCount(), static_cast<int>(viewModel->metrics().size()));
    for (int i = 0; i < model.rowCount(); ++i)
      ASSERT_EQ(model.index(i).data(DashboardListModel::ValueRole).toString().toStdString(),
                viewModel->metrics()[static_cast<std::size_t>(i)].attributeValue);
  }
}

TEST_F(ScreenModelsTest, ManagedDashboard) {
  ManageDashboardListModel model;
  const QAbstractItemModelTester tester(&model, kFatal);
  for (int round = 0; round < kRounds; ++round) {
    std::vector<ManagedRow> next;
    for (const Metric& metric : rows())
      next.push_back({{metric.metricTech, metric.metricId, metric.metricName, metric.attributeName, 0}});
    const std::size_t size = next.size();
    model.setRows(std::move(next));
    ASSERT_EQ(model.rowCount(), static_cast<int>(size));
  }
}

TEST_F(ScreenModelsTest, AllMetrics) {
  AllMetricsListModel model;
  AllMetricsFilterModel filtered(model);
  const QAbstractItemModelTester tester(&model, kFatal);
  const QAbstractItemModelTester filteredTester(&filtered, kFatal);
  for (int round = 0; round < kRounds; ++round) {
    std::vector<AllMetricsDataSource> table;
    for (const char* tech : {"RAT", "5G", "LTE"}) {
      AllMetricsDataSource group{tech, {}};
      for (char name = 'a'; name < 'k'; ++name)
        if (below(3) != 0) group.rowItems.push_back({{name}, row().collectedOn, 0});
      if (below(4) != 0) table.push_back(group);
    }
    model.take(table);
    filtered.setFilterFixedString(below(2) == 0 ? QString() : QString::fromStdString(text(9)));
    std::size_t count = 0;
    for (const auto& group : table) count += group.rowItems.size();
    ASSERT_EQ(model.rowCount(), static_cast<int>(count));
  }
}

TEST_F(ScreenModelsTest, MetricDetails) {
  MetricDetailsListModel model;
  const QAbstractItemModelTester tester(&model, kFatal);
  for (int round = 0; round < kRounds; ++round) {
    std::vector<MetricDetailView::Section> sections(below(3) + 1);
    for (std::size_t i = 0; i < sections.size(); ++i) {
      sections[i].header = "CA Status " + std::to_string(i);
      for (const Metric& metric : rows())
        sections[i].cells.push_back(
            std::make_shared<MetricDetailsViewCell>(metric, below(2) == 0, MetricDetailsViewCell::Actions{}));
    }
    model.take(sections);
    std::size_t count = 0;
    for (const auto& section : sections) count += section.cells.size();
    ASSERT_EQ(model.rowCount(), static_cast<int>(count));
  }
}

TEST_F(ScreenModelsTest, GraphBars) {
  for (int round = 0; round < kRounds / 10; ++round) {
    const auto viewModel = std::make_shared<AttributeDetailsViewModel>(rows(), rows(), rows());
    const auto view = std::make_shared<AttributeDetailsView>(viewModel, "attribute");
    GraphBarsModel model;
    const QAbstractItemModelTester tester(&model, kFatal);
    model.setView(view);
    for (int step = 0; step < 20; ++step) {
      switch (below(3)) {
        case 0:
          viewModel->selectSegment(static_cast<int>(below(3)));
          break;
        case 1:
          viewModel->tapBar(below(12));
          break;
        default:
          model.setPlotHeight(below(400));
          break;
      }
      model.take();
      ASSERT_EQ(model.rowCount(), static_cast<int>(viewModel->dataSource().size()));
    }
  }
}

TEST_F(ScreenModelsTest, BarsOfADayAreLabelledWithTheTimeAndOthersWithTheDay) {
  const test::ScopedTimeZone zone("UTC");
  const test::ScopedLocale locale("en_US");
  Metric metric = row();
  metric.collectedOn = Date(std::chrono::seconds(1767605412));
  metric.attributeValue = "50";
  Metric half = metric;
  half.attributeValue = "25";
  const std::vector<Metric> both{metric, half};
  const auto viewModel = std::make_shared<AttributeDetailsViewModel>(both, both, both);
  GraphBarsModel model;
  model.setPlotHeight(240);
  model.setView(std::make_shared<AttributeDetailsView>(viewModel, "attribute"));
  for (const auto& [segment, label] :
       {std::pair(0, "09:30 UTC"), std::pair(1, "Mon, 01/05"), std::pair(2, "Mon, 01/05")}) {
    viewModel->selectSegment(segment);
    model.take();
    EXPECT_EQ(model.index(1).data(GraphBarsModel::LabelRole).toString().toStdString(), label);
    EXPECT_EQ(model.index(0).data(GraphBarsModel::HeightRole).toDouble(), 200);
    EXPECT_EQ(model.index(1).data(GraphBarsModel::HeightRole).toDouble(), 100);
  }
}

}  // namespace
}  // namespace quorl::view
