#include "store/DefaultDashboard.h"

#include <cstdint>
#include <span>
#include <utility>

namespace quorl {
namespace {

struct Pin {
  const char* metricTech;
  const char* metricName;
  const char* attributeName;
  const char* attributeValueType;
  const char* metricId;
};

// The ids of "Rach Attempt" and of "phy_cell_id" do repeat the id of the first row.
constexpr Pin kMavPins[] = {
    {"LTE", "Serving Cell Info", "dl_freq", "INT", "803010"},
    {"LTE", "Serving Cell Info", "ul_freq", "INT", "803010"},
    {"LTE", "Serving Cell Info", "prio_of_camped_lte_band", "INT", "803010"},
    {"5G", "Nr Ota Msg", "deployment", "INT", "806913"},
    {"LTE", "Rach Attempt", "p_max", "INT", "803010"},
    {"LTE", "Rach Attempt", "rsrp", "INT", "803010"},
    {"5G", "Nr Ota Msg", "phy_cell_id", "INT", "803010"},
    {"LTE", "Ota Msg", "channel_type", "STRING", "803011"},
    {"5G", "Nr ConnectionStats", "max_dl_mod", "STRING", "806934"},
    {"5G", "Nr ConnectionStats", "nr5g_total_dl_mimo_layers", "INT", "806934"},
    {"RAT", "Cell Info", "kHVCellMonitorDeploymentType", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnology", "STRING", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorTAC", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorBandInfo", "INT", "Cell Info"},
};

constexpr Pin kPinsOfSubscription0[] = {
    {"RAT", "Cell Info", "kHVCellMonitorBandInfo", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorCellType", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorUARFCN", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnology", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorDeploymentType", "INT", "Cell Info"},
    {"LTE", "C-DRX", "rrc_state", "STRING", "3952152"},
};

// The MNC stands in this list alone.
constexpr Pin kPinsOfSubscription1[] = {
    {"RAT", "Cell Info", "kHVCellMonitorBandInfo", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorCellType", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorMNC", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorUARFCN", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnology", "INT", "Cell Info"},
    {"RAT", "Cell Info", "kHVCellMonitorDeploymentType", "INT", "Cell Info"},
    {"LTE", "C-DRX", "rrc_state", "STRING", "3952152"},
};

void append(std::vector<Metric>& rows, std::span<const Pin> pins, std::int32_t subsId, Date now) {
  for (const Pin& pin : pins) {
    Metric row;
    row.id = Uuid::make();
    row.metricTech = pin.metricTech;
    row.metricName = pin.metricName;
    row.attributeName = pin.attributeName;
    row.attributeNameNonLocalized = pin.attributeName;
    row.attributeValueType = pin.attributeValueType;
    row.collectedOn = now;
    row.metricId = pin.metricId;
    row.subsId = subsId;
    rows.push_back(std::move(row));
  }
}

}  // namespace

std::vector<Metric> defaultDashboard(bool isMavDevice, Date now) {
  std::vector<Metric> rows;
  append(rows, isMavDevice ? std::span<const Pin>(kMavPins) : std::span<const Pin>(kPinsOfSubscription0), 0, now);
  append(rows, isMavDevice ? std::span<const Pin>(kMavPins) : std::span<const Pin>(kPinsOfSubscription1), 1, now);
  return rows;
}

}  // namespace quorl
