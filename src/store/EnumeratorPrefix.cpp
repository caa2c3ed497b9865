#include "store/EnumeratorPrefix.h"

#include <string_view>
#include <utility>

namespace quorl {
namespace {

// In the order of the search. "RACH_RESULT_ " does end in a blank.
constexpr std::string_view kPrefixes[] = {
    "kHVCellMonitorRadioAccessTechnology",
    "MODULATION_",
    "NR5G_MAC_QSH_METRIC_CONNECTION_",
    "CONN_INFO_",
    "kHVCellMonitorCellType",
    "SDM_TRIGGER_CAUSE_",
    "RB_PATH_",
    "RACH_RESULT_ ",
    "SYS_ROAM_STATUS_",
    "SYS_SRV_STATUS_",
    "SYS_SRV_DOMAIN_",
    "SYS_MODE_",
    "KLTE_RRC_STATE_",
    "FLUSH_REASON_",
    "HEALTH_MONITOR_TYPE_DATA_",
};

}  // namespace

void removeEnumeratorPrefix(std::string& value) {
  for (const std::string_view prefix : kPrefixes) {
    std::size_t at = value.find(prefix);
    if (at == std::string::npos) continue;
    std::string cleaned;
    std::size_t from = 0;
    for (; at != std::string::npos; at = value.find(prefix, from)) {
      cleaned.append(value, from, at - from);
      from = at + prefix.size();
    }
    cleaned.append(value, from);
    value = std::move(cleaned);
    return;
  }
}

}  // namespace quorl
