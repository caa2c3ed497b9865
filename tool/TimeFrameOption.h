#pragma once

#include <CLI/CLI.hpp>

#include "store/Metric.h"

namespace quorl::tool {

/// Adds the required option "--time-frame".
inline void addTimeFrameOption(CLI::App& command, AttributeDetailTimeFrame& timeFrame) {
  using Frame = AttributeDetailTimeFrame;
  command.add_option("--time-frame", timeFrame, "daily, weekly or monthly")
      ->required()
      ->transform(CLI::Transformer(std::map<std::string, Frame>{
          {"daily", Frame::daily}, {"weekly", Frame::weekly}, {"monthly", Frame::monthly}}));
}

}  // namespace quorl::tool
