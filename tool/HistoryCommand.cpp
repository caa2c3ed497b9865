#include <algorithm>
#include <iostream>
#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include "Commands.h"
#include "JsonLine.h"
#include "StoreSession.h"
#include "TextTable.h"
#include "TimeFrameOption.h"
#include "base/DateText.h"
#include "base/PrintableText.h"
#include "screens/history/AttributeContentDetailsViewController.h"

namespace quorl::tool {
namespace {

struct HistoryOptions {
  StoreOptions store;
  std::string metric;
  std::string attribute;
  std::string timeFrame;
  bool isCharted = false;
};

constexpr std::size_t kUsualWidth = 80;
constexpr std::size_t kLeastBarWidth = 10;

std::size_t terminalWidth() {
  winsize size{};
  return ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 0 ? size.ws_col : kUsualWidth;
}

/// A bar that lies, by the same geometry as one that stands on the screen; what is higher than that is cut off.
std::string bar(const GraphView& graph, std::size_t width) {
  const auto available = static_cast<double>(width);
  const double length = std::clamp(graph.height(available + kBarAreaReserve), 0.0, available);
  std::string text;
  for (auto columns = static_cast<std::size_t>(length + 0.5); columns > 0; --columns) text += "█";
  return text;
}

void printChart(const AttributeDetailsView& view) {
  const std::vector<GraphView> bars = view.bars();
  const std::vector<Metric>& rows = view.model().dataSource();
  std::size_t textWidth = 0;
  for (std::size_t i = 0; i < bars.size(); ++i)
    textWidth = std::max(textWidth, displayWidth(bars[i].label()) + displayWidth(rows[i].attributeValue));
  const std::size_t used = textWidth + 4;  // two blanks behind each of the two texts
  const std::size_t width = std::max(kLeastBarWidth, terminalWidth() > used ? terminalWidth() - used : 0);
  TextTable table({"Time", "Value", ""});
  for (std::size_t i = 0; i < bars.size(); ++i)
    table.add({bars[i].label(), rows[i].attributeValue, bar(bars[i], width)});
  table.print(std::cout);
}

void printTable(const AttributeDetailsView& view) {
  const std::vector<Metric>& rows = view.model().dataSource();
  TextTable table({"Time", "Value"});
  for (const Metric& row : rows)
    table.add({barLabel(row.collectedOn, view.model().currentSegmentIndex()), row.attributeValue});
  table.print(std::cout);
}

void printJson(const AttributeDetailsView& view) {
  for (const Metric& row : view.model().dataSource())
    std::cout << jsonLine({{"collectedOn", wallClockText(row.collectedOn)}, {"value", row.attributeValue}}) << '\n';
}

int showHistory(StoreSession& session, const HistoryOptions& options) {
  Metric metric;
  metric.metricName = options.metric;
  metric.attributeName = metric.attributeNameNonLocalized = options.attribute;
  const auto screen = AttributeContentDetailsViewController::make(session.store(), metric);
  screen->viewDidLoad();
  session.settle();
  const AttributeDetailsView& view = *screen->view();
  view.model().selectSegment(static_cast<int>(timeFrameNamed(options.timeFrame)));
  if (options.store.asJson) {
    printJson(view);
    return kSuccess;
  }
  std::cout << printable(view.headerText()) << "\n\n";
  if (view.model().dataSource().empty()) {
    std::cout << view.emptyText() << '\n';
  } else if (options.isCharted || isatty(STDOUT_FILENO) != 0) {
    printChart(view);
  } else {
    printTable(view);
  }
  return kSuccess;
}

}  // namespace

void addHistory(CommandLine& tool) {
  Command command = tool.addCommand("history", "Print the readings of an attribute over time");
  command.setFooter(
      "daily: the readings of today, of one subscription. weekly, monthly: an average for each day, of both\n"
      "subscriptions together. On a terminal each line has a bar.");
  auto options = std::make_shared<HistoryOptions>();
  command.addOption("--metric", options->metric, "Metric, such as \"Cell Info\"").required();
  command.addOption("--attribute", options->attribute, "Attribute as stored, such as kHVCellMonitorCellId").required();
  addTimeFrameOption(command, options->timeFrame);
  command.addFlag("--chart", options->isCharted, "Draw bars even if the output is no terminal");
  addStoreOptions(command, options->store, /*isTable=*/true);
  command.setAction([options] {
    return withStore(options->store, [&](StoreSession& session) { return showHistory(session, *options); });
  });
}

}  // namespace quorl::tool
