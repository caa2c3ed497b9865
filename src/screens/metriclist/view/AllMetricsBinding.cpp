#include "screens/metriclist/view/AllMetricsBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

AllMetricsBinding::AllMetricsBinding(std::shared_ptr<AllMetricsViewController> controller, QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      filtered_(rows_),
      changeConnection_(controller_->onChange([this] { controllerDidChange(); })),
      detailConnection_(controller_->onOpenDetail([this](std::shared_ptr<MetricDetailsViewController> detail) {
        emit openDetail(new MetricDetailsBinding(std::move(detail), this));
      })) {
  rows_.take(controller_->table());
}

void AllMetricsBinding::controllerDidChange() {
  rows_.take(controller_->table());
  emit changed();
}

void AllMetricsBinding::setFilterText(const QString& text) {
  if (text == filterText_) return;
  filterText_ = text;
  filtered_.setFilterFixedString(text);
  emit filterTextChanged();
}

QString AllMetricsBinding::lastRefreshedText() const {
  return toQt(controller_->lastRefreshedText());
}

QString AllMetricsBinding::pullToRefreshHint() const {
  return toQt(AllMetricsViewController::pullToRefreshHint);
}

void AllMetricsBinding::viewWillAppear() {
  controller_->viewWillAppear();
}

void AllMetricsBinding::pullToRefresh() {
  if (!controller_->isRefreshing()) controller_->pullToRefresh();
}

void AllMetricsBinding::select(int index) {
  const QModelIndex source = filtered_.mapToSource(filtered_.index(index, 0));
  if (!source.isValid()) return;
  const AllMetricsRow row = rows_.rows()[static_cast<std::size_t>(source.row())];
  selectedTech_ = toQt(row.metricTech);
  selectedName_ = toQt(row.metricName);
  emit selectionChanged();
  // The controller counts by group.
  std::size_t place = static_cast<std::size_t>(source.row());
  for (std::size_t section = 0; section < controller_->table().size(); ++section) {
    const std::size_t size = controller_->table()[section].rowItems.size();
    if (place < size) {
      controller_->didSelectItemAt(section, place);
      return;
    }
    place -= size;
  }
}

}  // namespace quorl::view
