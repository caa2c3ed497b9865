#include <iostream>
#include <memory>
#include <string>

#include <fmt/format.h>

#include "Commands.h"
#include "JsonLine.h"
#include "StoreSession.h"
#include "TextTable.h"
#include "base/DateText.h"
#include "base/PrintableText.h"
#include "screens/metricdetail/MetricDetailsViewController.h"

namespace quorl::tool {
namespace {

struct ShowOptions {
  StoreOptions store;
  std::string tech;
  std::string metric;
};

void printTable(MetricDetailView& view) {
  std::cout << view.lastSeenText() << '\n';
  for (const MetricDetailView::Section& section : view.sections()) {
    std::cout << '\n';
    if (!section.header.empty()) std::cout << printable(section.header) << '\n';
    TextTable table({"Attribute", "Value", "Pinned", "Graph"});
    for (const auto& cell : section.cells)
      table.add({cell->nameText(), cell->valueText(), cell->isBookmarked() ? "yes" : "",
                 cell->showsGraphSymbol() ? "yes" : ""});
    table.print(std::cout);
  }
}

void printJson(MetricDetailView& view) {
  for (const MetricDetailView::Section& section : view.sections()) {
    for (const auto& cell : section.cells) {
      const Metric& row = cell->metricObject();
      std::cout << jsonLine({{"section", section.header.empty() ? JsonValue() : JsonValue(section.header)},
                             {"attribute", row.attributeNameNonLocalized},
                             {"name", cell->nameText()},
                             {"value", cell->valueText()},
                             {"type", row.attributeValueType},
                             {"collectedOn", wallClockText(row.collectedOn)},
                             {"isBookmarked", cell->isBookmarked()},
                             {"graphable", row.graphable}})
                << '\n';
    }
  }
}

int show(StoreSession& session, const ShowOptions& options) {
  const auto screen = MetricDetailsViewController::make(session.store(), options.tech, options.metric,
                                                        options.store.subscription, SystemClock().now());
  screen->viewDidLoad();
  session.settle();
  if (screen->metricDetailsViewModel()->metrics().empty()) {
    complain(fmt::format("there is nothing of {} \"{}\" for subscription {} (see quorl-tool metrics)", options.tech,
                         options.metric, options.store.subscription));
    return kFailure;
  }
  options.store.asJson ? printJson(screen->view()) : printTable(screen->view());
  return kSuccess;
}

}  // namespace

void addShow(CommandLine& tool) {
  Command command = tool.addCommand("show", "Print the latest value of each attribute of a metric");
  command.setFooter(
      "Names and values are those that the detail screen shows; --json has the stored names beside them.");
  auto options = std::make_shared<ShowOptions>();
  command.addOption("--tech", options->tech, "Technology, such as LTE").required();
  command.addOption("--metric", options->metric, "Metric, such as \"Serving Cell Info\"").required();
  addStoreOptions(command, options->store, /*isTable=*/true);
  command.setAction(
      [options] { return withStore(options->store, [&](StoreSession& session) { return show(session, *options); }); });
}

}  // namespace quorl::tool
