#pragma once

#include <string>
#include <string_view>

#include "CommandLine.h"
#include "store/Metric.h"

namespace quorl::tool {

/// Adds the required option "--time-frame", which takes daily, weekly or monthly.
inline void addTimeFrameOption(Command& command, std::string& name) {
  command.addOption("--time-frame", name, "daily, weekly or monthly").required().oneOf({"daily", "weekly", "monthly"});
}

/// The time frame of a name that the option has let pass.
inline AttributeDetailTimeFrame timeFrameNamed(std::string_view name) {
  if (name == "daily") return AttributeDetailTimeFrame::daily;
  return name == "weekly" ? AttributeDetailTimeFrame::weekly : AttributeDetailTimeFrame::monthly;
}

}  // namespace quorl::tool
