#include "screens/export/ExportViewController.h"

namespace quorl {

std::shared_ptr<ExportViewController> ExportViewController::make(std::shared_ptr<PersistanceStore> store) {
  std::shared_ptr<ExportViewController> controller(new ExportViewController(std::move(store)));
  controller->containerView_.reserve(3);
  for (const auto timeFrame :
       {AttributeDetailTimeFrame::daily, AttributeDetailTimeFrame::weekly, AttributeDetailTimeFrame::monthly})
    controller->containerView_.emplace_back(timeFrame, controller);
  return controller;
}

}  // namespace quorl
