#include "screens/dashboard/view/DashboardBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

DashboardBinding::DashboardBinding(std::shared_ptr<DashboardViewController> controller, QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      rows_(controller_->viewModel()),
      lastRefreshedConnection_(controller_->onLastRefreshed([this] { emit lastRefreshedTextChanged(); })),
      toastConnection_(controller_->showToast().onChange([this](bool) { emit isToastShowingChanged(); })),
      managingConnection_(controller_->onOpenManaging([this](std::shared_ptr<ManageDashboardViewController> managing) {
        emit openManaging(new ManageDashboardBinding(std::move(managing), this));
      })) {}

QString DashboardBinding::lastRefreshedText() const {
  return toQt(controller_->lastRefreshedText());
}

QString DashboardBinding::manageControlText() const {
  return toQt(DashboardViewController::manageControlText);
}

QString DashboardBinding::toastText() const {
  return toQt(controller_->showToast().text());
}

bool DashboardBinding::isToastShowing() const {
  return controller_->showToast().isShowing();
}

void DashboardBinding::longPress(int index) {
  if (index >= 0) controller_->longPress(static_cast<std::size_t>(index));
}

void DashboardBinding::manageDashboardTapped() {
  controller_->manageDashboardTapped();
}

}  // namespace quorl::view
