#include <iostream>
#include <memory>

#include "Commands.h"
#include "JsonLine.h"
#include "StoreSession.h"
#include "TextTable.h"
#include "base/DateText.h"
#include "screens/dashboard/DashboardViewController.h"
#include "shell/TimeTexts.h"

namespace quorl::tool {
namespace {

void printTable(const DashboardViewModel& model) {
  TextTable table({"Attribute", "Value", "Technology", "Metric", "Last seen"});
  for (const DashboardViewModelObject& row : model.metrics())
    table.add(
        {dashboardNameText(row), dashboardValueText(row), row.metricTech, row.metricName, dateText(row.timeStamp)});
  table.print(std::cout);
}

void printJson(const DashboardViewModel& model) {
  for (const DashboardViewModelObject& row : model.metrics())
    std::cout << jsonLine({{"tech", row.metricTech},
                           {"metric", row.metricName},
                           {"attribute", row.attributeNameNonLocalized},
                           {"name", dashboardNameText(row)},
                           {"value", dashboardValueText(row)},
                           {"collectedOn", wallClockText(row.timeStamp)}})
              << '\n';
}

int showDashboard(StoreSession& session, bool asJson) {
  const auto screen = DashboardViewController::make(session.store());
  session.settle();
  const DashboardViewModel& model = *screen->viewModel();
  asJson ? printJson(model) : printTable(model);
  if (model.metrics().empty()) complain("fewer than two of the pinned attributes have a reading");
  return kSuccess;
}

}  // namespace

void addDashboard(CommandLine& tool) {
  Command command = tool.addCommand("dashboard", "Print the pinned attributes with their latest values");
  command.setFooter(
      "Fewer than two readings count as none. As at every start of the product, the default attributes are pinned "
      "then,\non top of what is there.");
  auto options = std::make_shared<StoreOptions>();
  addStoreOptions(command, *options, /*isTable=*/true);
  command.setAction([options] {
    return withStore(*options, [&](StoreSession& session) { return showDashboard(session, options->asJson); });
  });
}

}  // namespace quorl::tool
