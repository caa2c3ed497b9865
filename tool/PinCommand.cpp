#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "Commands.h"
#include "NearestNames.h"
#include "StoreSession.h"
#include "screens/metricdetail/MetricDetailViewModel.h"

namespace quorl::tool {
namespace {

struct PinOptions {
  StoreOptions store;
  std::string tech;
  std::string metric;
  std::string attribute;
};

int complainOfAttribute(const std::vector<Metric>& rows, const PinOptions& options) {
  std::string text = fmt::format("there is no attribute \"{}\" of {} \"{}\" for subscription {}", options.attribute,
                                 options.tech, options.metric, options.store.subscription);
  std::vector<std::string_view> names;
  for (const Metric& row : rows) names.emplace_back(row.attributeNameNonLocalized);
  const auto nearest = nearestNames(options.attribute, names, 3);
  if (!nearest.empty()) text += fmt::format("; nearest: {}", fmt::join(nearest, ", "));
  complain(text);
  return kFailure;
}

/// Whether the attribute stands on the dashboard now. A pin that fails is told nowhere else.
bool isPinned(StoreSession& session, const Metric& row) {
  bool isFound = false;
  session.store()->fetchDashboard(
      row.subsId, [&](const std::vector<DashboardTableItem>& items, const std::optional<SQLiteError>&) {
        isFound = std::any_of(items.begin(), items.end(), [&](const DashboardTableItem& item) {
          return item.attributeName == row.attributeNameNonLocalized;
        });
      });
  session.settle();
  return isFound;
}

int pin(StoreSession& session, const PinOptions& options) {
  const auto model = MetricDetailViewModel::make(session.store(), options.tech, options.metric,
                                                 options.store.subscription, SystemClock().now());
  session.settle();
  const std::vector<Metric>& rows = model->metrics();
  const auto row = std::find_if(rows.begin(), rows.end(), [&](const Metric& candidate) {
    return candidate.attributeNameNonLocalized == options.attribute;
  });
  if (row == rows.end()) return complainOfAttribute(rows, options);
  model->updateDashboardItem(static_cast<std::size_t>(row - rows.begin()), /*isBookmarked=*/true, 0,
                             /*isSectioned=*/false);
  session.settle();
  if (isPinned(session, *row)) return kSuccess;
  complain("the attribute could not be pinned (see --verbose)");
  return kFailure;
}

}  // namespace

void addPin(CommandLine& tool) {
  Command command = tool.addCommand("pin", "Put an attribute on the dashboard");
  auto options = std::make_shared<PinOptions>();
  command.addOption("--tech", options->tech, "Technology, such as LTE").required();
  command.addOption("--metric", options->metric, "Metric, such as \"Serving Cell Info\"").required();
  command.addOption("--attribute", options->attribute, "Attribute as stored, such as dl_freq").required();
  addStoreOptions(command, options->store, /*isTable=*/false);
  command.setAction(
      [options] { return withStore(options->store, [&](StoreSession& session) { return pin(session, *options); }); });
}

}  // namespace quorl::tool
