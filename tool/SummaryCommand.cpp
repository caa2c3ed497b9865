#include <algorithm>
#include <iostream>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include <fmt/format.h>

#include "Commands.h"
#include "Documents.h"
#include "JsonLine.h"
#include "base/PrintableText.h"

namespace quorl::tool {
namespace {

struct SummaryOptions {
  std::string documents;
  bool asJson = false;
};

void printTable(const std::vector<MetricSummary>& metrics) {
  const MetricSummary head{"Technology", "Metric", 0, "Last seen"};
  std::size_t techWidth = head.tech.size();
  std::size_t nameWidth = head.name.size();
  std::size_t rowsWidth = std::string_view("Rows").size();
  for (const MetricSummary& metric : metrics) {
    techWidth = std::max(techWidth, metric.tech.size());
    nameWidth = std::max(nameWidth, metric.name.size());
    rowsWidth = std::max(rowsWidth, std::to_string(metric.rows).size());
  }
  const auto print = [&](const MetricSummary& metric, const std::string& rows) {
    std::cout << fmt::format("{:<{}}  {:<{}}  {:>{}}  {}\n", printable(metric.tech), techWidth, printable(metric.name),
                             nameWidth, rows, rowsWidth, printable(metric.lastSeen));
  };
  print(head, "Rows");
  for (const MetricSummary& metric : metrics) print(metric, std::to_string(metric.rows));
}

void printJson(const std::vector<MetricSummary>& metrics) {
  for (const MetricSummary& metric : metrics)
    std::cout << jsonLine({{"tech", metric.tech},
                           {"name", metric.name},
                           {"rows", metric.rows},
                           {"lastSeen", metric.lastSeen}})
              << '\n';
}

int printSummary(const SummaryOptions& options) {
  const auto metrics = summarize(options.documents);
  if (!metrics) {
    complain(metrics.error());
    return kFailure;
  }
  options.asJson ? printJson(*metrics) : printTable(*metrics);
  return kSuccess;
}

}  // namespace

void addSummary(CommandLine& tool) {
  Command command = tool.addCommand("summary", "Print what a database holds, metric by metric");
  command.setFooter("One line for each metric: technology, metric, rows, and the time of the latest row.");
  auto options = std::make_shared<SummaryOptions>();
  command.addOption("--documents", options->documents, "Documents directory that replay filled").required().notEmpty();
  command.addFlag("--json", options->asJson, "Print one JSON object a line instead of a table");
  command.setAction([options] { return printSummary(*options); });
}

}  // namespace quorl::tool
