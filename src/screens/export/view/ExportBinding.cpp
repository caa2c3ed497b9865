#include "screens/export/view/ExportBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

ExportBinding::ExportBinding(std::shared_ptr<ExportViewController> controller, QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      loadingConnection_(controller_->loadingView().onChange([this] { emit loadingChanged(); })),
      dismissConnection_(controller_->onDismiss([this] { emit dismissed(); })) {
  for (const ExportView& row : controller_->containerView()) options_ << toQt(row.labelText());
}

QString ExportBinding::heading() const {
  return toQt(ExportViewController::exportOptionsLabel);
}

QString ExportBinding::loadingText() const {
  const bool isShown = controller_ && !controller_->loadingView().isLabelHidden();
  return isShown ? toQt(controller_->loadingView().loadingLabelText()) : QString();
}

void ExportBinding::didTapExportButton(int index) {
  if (!controller_ || index < 0 || index >= options_.size()) return;
  controller_->containerView()[static_cast<std::size_t>(index)].didTapExportButton();
}

void ExportBinding::dismiss() {
  if (controller_) controller_->dismiss();
}

void ExportBinding::leave() {
  loadingConnection_.disconnect();
  dismissConnection_.disconnect();
  controller_.reset();
  deleteLater();
}

}  // namespace quorl::view
