#pragma once

#include <optional>
#include <string>
#include <vector>

#include "store/Metric.h"

// The rules by which some metrics are shown otherwise than row by row.

namespace quorl {

inline constexpr char kCellInfoName[] = "Cell Info";
inline constexpr char kCaStatusName[] = "CA Status";

/// Rows that are shown under one header. Identified by `id`.
struct MetricSectional {
  Uuid id;
  std::string sectionName;
  std::vector<Metric> sectionMetrics;
};

/// "Cell Info": spells out the deployment row's value, and drops the technology row where that says the same.
void applyDeploymentRule(std::vector<Metric>& rows);

/// Gives each row whose raw name has "section-", as "0-section-rsrp" has, its section number.
void assignSectionNumbers(std::vector<Metric>& rows);

/// One section for each number below that of the last row, so the last section gets none. Without such a number there
/// are no sections; a negative one is a fault and ends the process.
std::vector<MetricSectional> sectionsOf(const std::vector<Metric>& rows);

/// The piece of a raw name with "section-" that stands before its first '-'; nothing for any other name.
std::optional<std::string> sectionNumberOf(const std::string& rawName);

}  // namespace quorl
