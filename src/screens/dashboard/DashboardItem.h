#pragma once

#include <string>

namespace quorl {

/// A pinned attribute in a form that can be written out. Nothing does so today.
struct DashboardItem {
  std::string metricTech;
  std::string metricName;
  std::string metricId;
  std::string attributeName;
};

}  // namespace quorl
