#include "screens/metriclist/view/AllMetricsBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

AllMetricsBinding::AllMetricsBinding(std::shared_ptr<AllMetricsViewController> controller, QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      filtered_(rows_),
      changeConnection_(controller_->onChange([this] { controllerDidChange(); })),
      detailConnection_(controller_->onOpenDetail(
          [this](std::shared_ptr<MetricDetailsViewController> detail) { openDetailOf(std::move(detail)); })) {
  rows_.take(controller_->table());
}

void AllMetricsBinding::controllerDidChange() {
  rows_.take(controller_->table());
  emit changed();
}

void AllMetricsBinding::openDetailOf(std::shared_ptr<MetricDetailsViewController> detail) {
  auto* binding = new MetricDetailsBinding(std::move(detail), this);
  detail_ = binding;
  connect(binding, &QObject::destroyed, this, [this](const QObject* gone) {
    if (gone == detail_) setSelection({}, {});
  });
  setSelection(binding->tech(), binding->title());
  emit openDetail(binding);
}

void AllMetricsBinding::setSelection(const QString& tech, const QString& name) {
  selectedTech_ = tech;
  selectedName_ = name;
  emit selectionChanged();
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

void AllMetricsBinding::pullToRefresh() {
  if (!controller_->isRefreshing()) controller_->pullToRefresh();
}

void AllMetricsBinding::select(int index) {
  const QModelIndex source = filtered_.mapToSource(filtered_.index(index, 0));
  if (!source.isValid()) return;
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
