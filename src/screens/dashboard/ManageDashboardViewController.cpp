#include "screens/dashboard/ManageDashboardViewController.h"

#include <algorithm>
#include <utility>

#include "base/NotificationCenter.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"

namespace quorl {

std::shared_ptr<ManageDashboardViewController> ManageDashboardViewController::make(
    std::shared_ptr<PersistanceStore> store, std::vector<DashboardTableItem> dashboardList) {
  return std::shared_ptr<ManageDashboardViewController>(
      new ManageDashboardViewController(std::move(store), std::move(dashboardList)));
}

void ManageDashboardViewController::swipeToDelete(std::size_t index) {
  if (index >= dashboardList_.size()) return;
  const DashboardTableItem& item = dashboardList_[index];
  persistanceStore_->removeDashboardItem(
      item.metricTech, item.attributeName, item.subsId,
      [weak = weak_from_this(), item](bool success, std::optional<SQLiteError> error) {
        if (!success) {
          presentFailure(error);
          return;
        }
        if (const auto self = weak.lock()) self->rowDidGo(item);
        NotificationCenter::defaultCenter().post(notification::kRemovedDashboardMetric);
      });
}

void ManageDashboardViewController::rowDidGo(const DashboardTableItem& item) {
  // Looked up anew: an earlier swipe may have moved it meanwhile.
  const auto row = std::find_if(dashboardList_.begin(), dashboardList_.end(), [&](const DashboardTableItem& other) {
    return other.metricTech == item.metricTech && other.attributeName == item.attributeName &&
           other.subsId == item.subsId;
  });
  if (row == dashboardList_.end()) return;
  const auto index = static_cast<std::size_t>(row - dashboardList_.begin());
  dashboardList_.erase(row);
  rowRemoved_(index);
}

void ManageDashboardViewController::presentFailure(const std::optional<SQLiteError>& error) {
  generalLog.error("unable to delete metric from dashboard ---> %{public}s", error.value_or(SQLiteError{}));
  Platform::current().mainQueue.async([] {
    Platform::current().alerts.present({"", "unable to delete metric from dashboard please try again later", "Ok", {}});
  });
}

}  // namespace quorl
