#pragma once

#include <vector>

#include "store/Metric.h"

namespace quorl {

/// The attributes that a dashboard with nothing to show is filled with, in the order of their insertion: 28 rows for
/// devices of the Mav family, 13 for all others. They hold no value, and `now` as their time.
std::vector<Metric> defaultDashboard(bool isMavDevice, Date now);

}  // namespace quorl
