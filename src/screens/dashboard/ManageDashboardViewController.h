#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <vector>

#include "base/Signal.h"
#include "store/PersistanceStore.h"

namespace quorl {

/// The screen that removes pins: a table of those it was opened with. Main thread.
class ManageDashboardViewController final : public std::enable_shared_from_this<ManageDashboardViewController> {
 public:
  static constexpr char hint[] = "Swipe to delete";

  static std::shared_ptr<ManageDashboardViewController> make(std::shared_ptr<PersistanceStore> store,
                                                             std::vector<DashboardTableItem> dashboardList);
  ManageDashboardViewController(const ManageDashboardViewController&) = delete;
  ManageDashboardViewController& operator=(const ManageDashboardViewController&) = delete;

  const std::vector<DashboardTableItem>& dashboardList() const { return dashboardList_; }

  /// Unpins row `index`; the row leaves once the store has done so. A failure is shown in an alert and changes
  /// nothing. Out of range it does nothing.
  void swipeToDelete(std::size_t index);
  /// The cross button.
  void dismiss() { dismissed_(); }

  /// `handler` receives the index that the row had, after it has left `dashboardList`.
  [[nodiscard]] Connection onRowRemoved(Signal<std::size_t>::Handler handler) {
    return rowRemoved_.connect(std::move(handler));
  }
  /// `handler` closes the screen.
  [[nodiscard]] Connection onDismiss(Signal<>::Handler handler) { return dismissed_.connect(std::move(handler)); }

 private:
  ManageDashboardViewController(std::shared_ptr<PersistanceStore> store, std::vector<DashboardTableItem> dashboardList)
      : persistanceStore_(std::move(store)), dashboardList_(std::move(dashboardList)) {}

  void rowDidGo(const DashboardTableItem& item);
  static void presentFailure(const std::optional<SQLiteError>& error);

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  std::vector<DashboardTableItem> dashboardList_;
  Signal<std::size_t> rowRemoved_;
  Signal<> dismissed_;
};

}  // namespace quorl
