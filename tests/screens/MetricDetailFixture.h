#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "ScreenTest.h"
#include "screens/metricdetail/MetricDetailViewModel.h"

namespace quorl::test {

/// Counts what a model asks of its screen.
struct DetailScreen final : MetricDetailViewModelDelegate {
  void refresh() override { ++refreshes; }
  int refreshes = 0;
};

/// A model of the detail screen on its own, without the screen.
class MetricDetailTest : public ScreenTest {
 protected:
  void open(const std::string& tech, const std::string& name, std::int32_t subsId = 0) {
    model = MetricDetailViewModel::make(store, tech, name, subsId, now());
    model->setDelegate(screen);
  }
  void opened(const std::string& tech, const std::string& name, std::int32_t subsId = 0) {
    open(tech, name, subsId);
    settle();
    log.clear();
  }
  void cellInfo(const std::string& attribute, const std::string& value) {
    stored(reading("RAT", "Cell Info", attribute, value));
  }
  void caStatus(const std::string& attribute, const std::string& value = "1") {
    stored(reading("LTE", "CA Status", attribute, value));
  }
  std::vector<std::pair<std::string, std::string>> shown() const {
    std::vector<std::pair<std::string, std::string>> rows;
    for (const Metric& row : model->metrics()) rows.emplace_back(row.attributeNameNonLocalized, row.attributeValue);
    return rows;
  }
  bool isMarked(const std::string& attribute) const {
    for (const Metric& row : model->metrics())
      if (row.attributeNameNonLocalized == attribute) return row.isBookmarked;
    ADD_FAILURE() << "no row " << attribute;
    return false;
  }

  std::shared_ptr<DetailScreen> screen = std::make_shared<DetailScreen>();
  std::shared_ptr<MetricDetailViewModel> model;
};

}  // namespace quorl::test
