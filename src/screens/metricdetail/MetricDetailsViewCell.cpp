#include "screens/metricdetail/MetricDetailsViewCell.h"

#include <utility>

#include "app/HardwareManager.h"
#include "intake/ValueConversion.h"
#include "platform/Platform.h"
#include "shell/Logs.h"

namespace quorl {

MetricDetailsViewCell::MetricDetailsViewCell(Metric metricObject, bool isBookmarked, Actions actions)
    : metricObject_(std::move(metricObject)), actions_(std::move(actions)), isBookmarked_(isBookmarked) {}

std::string MetricDetailsViewCell::nameText() const {
  if (metricObject_.attributeName.find("section-") == std::string::npos) return metricObject_.attributeName;
  return processAttributeName(metricObject_.attributeName, metricObject_.attributeValue);
}

std::string MetricDetailsViewCell::valueText() const {
  return processValue(metricObject_.attributeNameNonLocalized, metricObject_.attributeValue);
}

bool MetricDetailsViewCell::showsGraphSymbol() const {
  return HardwareManager::shared().isInternalOrCarrierBuild() && metricObject_.graphable;
}

void MetricDetailsViewCell::tapGraph() {
  actions_.graphableAction();
}

void MetricDetailsViewCell::tapBookmark() {
  isFlippedByUser_ = true;
  isBookmarked_.set(!isBookmarked_.get());
  actions_.bookMarkAction(isBookmarked_.get());
}

void MetricDetailsViewCell::longPress() {
  const std::string copied = valueText();
  Platform::current().pasteboard.setText(copied);
  appUiLog.log("MetricDetailView - MetricDetailsViewCell - copiedString: %{public}@", copied);
  actions_.onCopyAction();
}

void MetricDetailsViewCell::update(const Metric& metric) {
  metricObject_ = metric;
}

void MetricDetailsViewCell::mark() {
  if (!isFlippedByUser_ && metricObject_.isBookmarked != isBookmarked_.get())
    isBookmarked_.set(metricObject_.isBookmarked);
}

}  // namespace quorl
