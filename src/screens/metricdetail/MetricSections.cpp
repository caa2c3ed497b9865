#include "screens/metricdetail/MetricSections.h"

#include <algorithm>
#include <cstdint>
#include <string_view>

#include "base/FatalStop.h"
#include "base/NumberText.h"

namespace quorl {
namespace {

constexpr std::string_view kTechnologyKey = "kHVCellMonitorCellRadioAccessTechnology";
constexpr std::string_view kDeploymentKey = "kHVCellMonitorDeploymentType";

auto rowOf(std::vector<Metric>& rows, std::string_view rawName) {
  return std::find_if(rows.begin(), rows.end(),
                      [&](const Metric& row) { return row.attributeNameNonLocalized == rawName; });
}

}  // namespace

void applyDeploymentRule(std::vector<Metric>& rows) {
  const auto deployment = rowOf(rows, kDeploymentKey);
  if (deployment == rows.end()) return;
  const std::int64_t kind = decimalInteger(deployment->attributeValue).value_or(0);
  if (kind < 0) return;
  if (kind == 0) {
    deployment->attributeValue = "LTE (0)";
    return;
  }
  deployment->attributeValue = "5G NSA (" + std::to_string(kind) + ")";
  const auto technology = rowOf(rows, kTechnologyKey);
  if (technology != rows.end() && technology->attributeValue == "LTE") rows.erase(technology);
}

std::optional<std::string> sectionNumberOf(const std::string& rawName) {
  if (rawName.find("section-") == std::string::npos) return std::nullopt;
  return rawName.substr(0, rawName.find('-'));
}

void assignSectionNumbers(std::vector<Metric>& rows) {
  for (Metric& row : rows)
    if (auto number = sectionNumberOf(row.attributeNameNonLocalized)) row.sectionNumber = std::move(number);
}

std::vector<MetricSectional> sectionsOf(const std::vector<Metric>& rows) {
  std::vector<MetricSectional> sections;
  if (rows.empty() || !rows.back().sectionNumber) return sections;
  const std::int64_t end = decimalInteger(*rows.back().sectionNumber).value_or(0);
  if (end < 0) fatalStop("negative section number");
  for (std::int64_t number = 0; number < end; ++number) {
    MetricSectional section{Uuid::make(), std::to_string(number), {}};
    std::copy_if(rows.begin(), rows.end(), std::back_inserter(section.sectionMetrics),
                 [&](const Metric& row) { return row.sectionNumber == section.sectionName; });
    sections.push_back(std::move(section));
  }
  return sections;
}

}  // namespace quorl
