#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Commands.h"
#include "StoreSession.h"
#include "screens/dashboard/ManageDashboardViewController.h"

namespace quorl::tool {
namespace {

struct UnpinOptions {
  StoreOptions store;
  std::string tech;
  std::string attribute;
};

std::optional<std::vector<DashboardTableItem>> pins(StoreSession& session, std::int32_t subsId) {
  std::optional<std::vector<DashboardTableItem>> answer;
  session.store()->fetchDashboard(subsId,
                                  [&](std::vector<DashboardTableItem> items, const std::optional<SQLiteError>& error) {
                                    if (!error) answer = std::move(items);
                                  });
  session.settle();
  return answer;
}

int unpin(StoreSession& session, const UnpinOptions& options) {
  auto items = pins(session, options.store.subscription);
  if (!items) {
    complain("the dashboard cannot be read (see --verbose)");
    return kFailure;
  }
  const auto item = std::find_if(items->begin(), items->end(), [&](const DashboardTableItem& candidate) {
    return candidate.metricTech == options.tech && candidate.attributeName == options.attribute;
  });
  if (item == items->end()) {
    complain(fmt::format("{} \"{}\" is not on the dashboard of subscription {}", options.tech, options.attribute,
                         options.store.subscription));
    return kFailure;
  }
  const auto index = static_cast<std::size_t>(item - items->begin());
  const std::size_t count = items->size();
  const auto screen = ManageDashboardViewController::make(session.store(), *std::move(items));
  screen->swipeToDelete(index);
  session.settle();
  return screen->dashboardList().size() < count ? kSuccess : kFailure;  // the alert has told why
}

}  // namespace

void addUnpin(CommandLine& tool) {
  Command command = tool.addCommand("unpin", "Take an attribute off the dashboard");
  auto options = std::make_shared<UnpinOptions>();
  command.addOption("--tech", options->tech, "Technology, such as LTE").required();
  command.addOption("--attribute", options->attribute, "Attribute as stored, such as dl_freq").required();
  addStoreOptions(command, options->store, /*isTable=*/false);
  command.setAction(
      [options] { return withStore(options->store, [&](StoreSession& session) { return unpin(session, *options); }); });
}

}  // namespace quorl::tool
