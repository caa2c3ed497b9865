#include <iostream>
#include <memory>

#include "Commands.h"
#include "JsonLine.h"
#include "StoreSession.h"
#include "TextTable.h"
#include "base/DateText.h"
#include "screens/metriclist/AllMetricsViewController.h"

namespace quorl::tool {
namespace {

void printTable(const AllMetricsViewController& screen) {
  std::cout << screen.lastRefreshedText() << "\n\n";
  TextTable table({"Technology", "Metric", "Last seen"});
  for (const AllMetricsDataSource& group : screen.table())
    for (const AllMetricsRowItem& row : group.rowItems)
      table.add({group.metricTech, AllMetricsViewController::nameText(row), AllMetricsViewController::timeText(row)});
  table.print(std::cout);
}

void printJson(const AllMetricsViewController& screen) {
  for (const AllMetricsDataSource& group : screen.table())
    for (const AllMetricsRowItem& row : group.rowItems)
      std::cout << jsonLine({{"tech", group.metricTech},
                             {"name", row.metricName},
                             {"lastSeen", wallClockText(row.timeStamp)},
                             {"subscription", row.subsId}})
                << '\n';
}

int listMetrics(StoreSession& session, bool asJson) {
  const auto screen = AllMetricsViewController::make(session.store());
  screen->viewWillAppear();
  session.settle();
  if (screen->table().empty()) {
    complain("the metrics cannot be read (see --verbose)");
    return kFailure;
  }
  asJson ? printJson(*screen) : printTable(*screen);
  return kSuccess;
}

}  // namespace

void addMetrics(CommandLine& tool) {
  Command command = tool.addCommand("metrics", "List the metrics of a subscription, as the second tab does");
  command.setFooter(
      "One line for each metric, by technology, with the time it was last seen. The rows of \"RAT\" are always there,\n"
      "with the present time.");
  auto options = std::make_shared<StoreOptions>();
  addStoreOptions(command, *options, /*isTable=*/true);
  command.setAction([options] {
    return withStore(*options, [&](StoreSession& session) { return listMetrics(session, options->asJson); });
  });
}

}  // namespace quorl::tool
