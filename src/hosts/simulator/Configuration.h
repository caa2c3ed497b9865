#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include <tl/expected.hpp>

#include "hosts/simulator/CommandCode.h"

namespace quorl::simulator {

/// What an application wants from the simulated baseband manager: which metrics, and by which triggers it asks for
/// them. The form of the file is told in docs/recording-format.md.
struct Configuration {
  static constexpr std::int64_t kApplicationId = 2;  // the one this phone runs

  struct Trigger {
    std::int64_t id = 0;
    std::int64_t type = 0;
    std::int64_t ref = 0;

    friend bool operator==(const Trigger&, const Trigger&) = default;
  };

  std::int64_t profileId = 0;
  std::vector<Trigger> triggers;
  std::vector<std::int64_t> metrics;  // in the order of the file, none twice

  bool selects(std::int64_t metricId) const;
};

/// Reads the content of a configuration. The fault is of the first thing that is wrong, in the order of the table in
/// the document. Any thread.
tl::expected<Configuration, CommandFault> parseConfiguration(std::string_view content);

}  // namespace quorl::simulator
