#include "screens/dashboard/DashboardViewController.h"

#include <optional>
#include <utility>

#include "app/HardwareManager.h"
#include "intake/ValueConversion.h"
#include "platform/Platform.h"
#include "shell/Logs.h"

namespace quorl {
namespace {

constexpr char kLastRefreshed[] = "Last refreshed: ";

}  // namespace

std::string dashboardNameText(const DashboardViewModelObject& row) {
  std::string name = row.attributeName;
  if (name.find("section-") != std::string::npos) name = processAttributeName(row.attributeName, row.attributeValue);
  if (row.section) name.append(" (CA ").append(*row.section).append(")");
  return name;
}

std::string dashboardValueText(const DashboardViewModelObject& row) {
  return processValue(row.attributeNameNonLocalized, row.attributeValue);
}

std::shared_ptr<DashboardViewController> DashboardViewController::make(std::shared_ptr<PersistanceStore> store) {
  std::shared_ptr<DashboardViewController> controller(
      new DashboardViewController(DashboardViewModel::make(std::move(store))));
  controller->viewModel_->setDelegate(controller);
  return controller;
}

DashboardViewController::DashboardViewController(std::shared_ptr<DashboardViewModel> model)
    : viewModel_(std::move(model)), lastRefreshedText_(kLastRefreshed), showToast_("copied") {}

void DashboardViewController::updateLastRefreshed(const std::string& text) {
  lastRefreshedText_ = kLastRefreshed + text + " ";
  refreshed_();
}

void DashboardViewController::longPress(std::size_t index) {
  if (index >= viewModel_->metrics().size()) return;
  const std::string copied = dashboardValueText(viewModel_->metrics()[index]);
  Platform::current().pasteboard.setText(copied);
  generalLog.log("DashboardViewItem - copiedString: %{public}@", copied);
  showToast_.show();
}

void DashboardViewController::manageDashboardTapped() {
  generalLog.log("show manage dashboard UI");
  viewModel_->persistanceStore()->fetchDashboard(
      HardwareManager::shared().currentSubsId(),
      [weak = weak_from_this()](std::vector<DashboardTableItem> pinned, std::optional<SQLiteError> error) {
        if (error) {
          generalLog.error("error  ---> %{public}s", *error);
          return;
        }
        const auto self = weak.lock();
        if (!self) return;
        self->openManaging_(
            ManageDashboardViewController::make(self->viewModel_->persistanceStore(), std::move(pinned)));
      });
}

}  // namespace quorl
