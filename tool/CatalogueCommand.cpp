#include <iostream>
#include <string>

#include <fmt/format.h>

#include "Commands.h"
#include "JsonLine.h"
#include "hosts/simulator/CatalogueClass.h"
#include "intake/MetricGroupV2.h"
#include "messages/MetricCodable.h"

namespace quorl::tool {
namespace {

int printCatalogue() {
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    std::cout << jsonLine({{"tech", row.tech},
                           {"name", row.name},
                           {"zelkorId", row.zelkorId},
                           {"hex", fmt::format("{:2X}", row.zelkorId)},
                           {"className", row.className},
                           {"deviceType", row.deviceType},
                           {"decodable", makeMessage(simulator::decodingClass(row)) != nullptr}})
              << '\n';
  }
  return kSuccess;
}

}  // namespace

void addCatalogue(CommandLine& tool) {
  Command command = tool.addCommand("catalogue", "Print the metrics that can be decoded");
  command.setFooter(
      "Prints the rows of the metric catalogue in their order, one JSON object a line. \"decodable\" says whether\n"
      "metrics of the row's id can be decoded; some rows name a class that does not exist.");
  command.setAction(printCatalogue);
}

}  // namespace quorl::tool
