#include "screens/history/AttributeContentDetailsViewController.h"

#include <utility>

#include "base/FatalStop.h"
#include "platform/Platform.h"
#include "shell/Logs.h"

namespace quorl {

std::shared_ptr<AttributeContentDetailsViewController> AttributeContentDetailsViewController::make(
    std::shared_ptr<PersistanceStore> store, Metric metric) {
  return std::shared_ptr<AttributeContentDetailsViewController>(
      new AttributeContentDetailsViewController(std::move(store), std::move(metric)));
}

void AttributeContentDetailsViewController::viewDidLoad() {
  DispatchGroup group;
  fetch(AttributeDetailTimeFrame::daily, group);
  fetch(AttributeDetailTimeFrame::weekly, group);
  fetch(AttributeDetailTimeFrame::monthly, group);
  group.notify(Platform::current().mainQueue, [weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->showView();
  });
}

void AttributeContentDetailsViewController::fetch(AttributeDetailTimeFrame timeFrame, DispatchGroup group) {
  group.enter();
  persistanceStore_->fetchAttributeHistory(
      metric_.metricName, metric_.attributeNameNonLocalized, timeFrame,
      [weak = weak_from_this(), group, timeFrame](std::vector<Metric> rows, std::optional<SQLiteError> error) mutable {
        if (const auto self = weak.lock()) self->frameDidLoad(timeFrame, std::move(rows), error);
        group.leave();
      });
}

void AttributeContentDetailsViewController::frameDidLoad(AttributeDetailTimeFrame timeFrame, std::vector<Metric> rows,
                                                         const std::optional<SQLiteError>& error) {
  switch (timeFrame) {
    case AttributeDetailTimeFrame::daily:
      if (error) {
        generalLog.log("error occured  fetch daily ---> %{public}s", *error);
      } else {
        daily_ = std::move(rows);
      }
      return;
    case AttributeDetailTimeFrame::weekly:
      if (error) {
        generalLog.log("error occured  fetch weekly ---> %{public}s", *error);
      } else {
        weekly_ = std::move(rows);
      }
      return;
    case AttributeDetailTimeFrame::monthly:
      if (error) {
        generalLog.log("error occured  fetch weekly ---> %{public}s", *error);  // it does say weekly
      } else {
        monthly_ = std::move(rows);
      }
      return;
  }
  fatalStop("AttributeDetailTimeFrame: no such case");
}

void AttributeContentDetailsViewController::showView() {
  view_ = std::make_shared<AttributeDetailsView>(
      std::make_shared<AttributeDetailsViewModel>(std::move(daily_), std::move(weekly_), std::move(monthly_)),
      metric_.attributeName);
  showView_();
}

}  // namespace quorl
