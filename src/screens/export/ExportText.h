#pragma once

#include <string>

#include "store/ExportedMetrics.h"

namespace quorl {

/// Appends the reflective print of a record, all thirteen fields in their order: "QuorlInternal_4.Metric(id: …,
/// metricTech: LTE, …, sectionNumber: nil)". The time is in UTC; nothing is quoted or escaped but a section number.
void appendMetricText(std::string& text, const Metric& metric);

/// The prints of all records, in their order, with a comma between two and nothing else. Any thread.
std::string exportText(const ExportedMetrics& metrics);

/// The same text in pieces of some ten thousand bytes.
SharedText sharedExportText(ExportedMetrics metrics, std::string fileName);

}  // namespace quorl
