#include "screens/metricdetail/view/MetricDetailsBinding.h"

#include <algorithm>
#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

MetricDetailsBinding::MetricDetailsBinding(std::shared_ptr<MetricDetailsViewController> controller, QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      title_(toQt(controller_->title())),
      tech_(toQt(controller_->metricDetailsViewModel()->metricTech())),
      toastText_(toQt(controller_->view().showToast().text())),
      changeConnection_(controller_->view().onChange([this] { takeLater(); })),
      toastConnection_(controller_->view().showToast().onChange([this](bool isShowing) {
        isToastShowing_ = isShowing;
        emit isToastShowingChanged();
      })),
      graphConnection_(controller_->onOpenGraph([this](std::shared_ptr<AttributeContentDetailsViewController> history) {
        emit openGraph(new AttributeContentDetailsBinding(std::move(history), this));
      })) {
  controller_->viewDidLoad();
  take();
}

void MetricDetailsBinding::takeLater() {
  if (std::exchange(isTaking_, true)) return;
  QMetaObject::invokeMethod(
      this,
      [this] {
        isTaking_ = false;
        if (!controller_) return;
        take();
        emit changed();
      },
      Qt::QueuedConnection);
}

void MetricDetailsBinding::take() {
  lastSeenText_ = toQt(controller_->view().lastSeenText());
  showsSpinner_ = controller_->view().showsSpinner();
  rows_.take(controller_->view().sections());
}

bool MetricDetailsBinding::hasGraphs() const {
  return std::any_of(rows_.rows().begin(), rows_.rows().end(),
                     [](const MetricDetailsRow& row) { return row.showsGraphSymbol; });
}

QString MetricDetailsBinding::spinnerText() const {
  return toQt(MetricDetailView::spinnerText);
}

void MetricDetailsBinding::tapBookmark(int index) {
  MetricDetailsViewCell* cell = rows_.cell(index);
  if (!controller_ || cell == nullptr) return;
  cell->tapBookmark();
  rows_.refreshBookmark(index);
}

void MetricDetailsBinding::tapGraph(int index) {
  MetricDetailsViewCell* cell = rows_.cell(index);
  if (controller_ && cell != nullptr) cell->tapGraph();
}

void MetricDetailsBinding::longPress(int index) {
  MetricDetailsViewCell* cell = rows_.cell(index);
  if (controller_ && cell != nullptr) cell->longPress();
}

void MetricDetailsBinding::leave() {
  changeConnection_.disconnect();
  toastConnection_.disconnect();
  graphConnection_.disconnect();
  controller_.reset();
  deleteLater();
}

}  // namespace quorl::view
