#pragma once

#include <string_view>

#include "intake/MetricGroupV2.h"

namespace quorl::simulator {

/// The name of the class with which metrics of a catalogue row are decoded. It is the row's own, but for the two ids
/// whose rows name no existing class and whose rule fixes another. There need not be a class of that name.
std::string_view decodingClass(const MetricGroupV2& row);

}  // namespace quorl::simulator
