#include "hosts/simulator/CatalogueClass.h"

namespace quorl::simulator {

std::string_view decodingClass(const MetricGroupV2& row) {
  if (row.zelkorId == 806743) return "CellularLteConnectionStats";
  if (row.zelkorId == 827746) return "CellularRatLacSrvInfo";
  return row.className;
}

}  // namespace quorl::simulator
