#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace quorl {

struct MessageTable;

/// Knows the metric ids of the baseband's numbering, so that a reader does not mistake one for a field number.
///
/// Thread-safe: the table is built once, at the first query that needs it, and never changes.
class KBBMetricUtility {
 public:
  struct Entry {
    std::uint32_t metricId;
    std::string_view text;  // nothing reads it
  };

  KBBMetricUtility() = delete;

  /// Whether `tag` is a known metric id. The answer is the same for every class.
  static bool isValidMetricIdTag(std::uint32_t tag, const MessageTable& forClass) {
    // Field numbers are far below the smallest id.
    return tag >= kSmallestMetricId && holds(tag, forClass);
  }

  /// The known ids in the order of their list.
  static std::span<const Entry> entries();

 private:
  static constexpr std::uint32_t kSmallestMetricId = 0xC1002;
  static bool holds(std::uint32_t tag, const MessageTable& forClass);
};

}  // namespace quorl
