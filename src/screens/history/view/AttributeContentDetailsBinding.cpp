#include "screens/history/view/AttributeContentDetailsBinding.h"

#include <QVariantMap>
#include <utility>

#include "shell/TimeTexts.h"
#include "shell/view/QtText.h"

namespace quorl::view {

AttributeContentDetailsBinding::AttributeContentDetailsBinding(
    std::shared_ptr<AttributeContentDetailsViewController> controller, QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      title_(toQt(controller_->title())),
      showConnection_(controller_->onShowView([this] { viewDidShow(); })) {
  controller_->viewDidLoad();
}

void AttributeContentDetailsBinding::viewDidShow() {
  view_ = controller_->view();
  bars_.setView(view_);
  rowsConnection_ = view_->model().onDataSource([this](const std::vector<Metric>&) { rowsDidChange(); });
}

void AttributeContentDetailsBinding::rowsDidChange() {
  bars_.take();
  emit scaleChanged();
  emit selectionChanged();
  emit changed();
}

QString AttributeContentDetailsBinding::headerText() const {
  return view_ ? toQt(view_->headerText()) : title_;
}

QString AttributeContentDetailsBinding::emptyText() const {
  return view_ ? toQt(view_->emptyText()) : QString();
}

QString AttributeContentDetailsBinding::captionText() const {
  return view_ ? toQt(graphCaption(view_->model().dataSource(), currentSegmentIndex())) : QString();
}

QStringList AttributeContentDetailsBinding::segments() const {
  QStringList labels;
  for (const char* label : AttributeDetailsView::availableOptions) labels << toQt(label);
  return labels;
}

int AttributeContentDetailsBinding::currentSegmentIndex() const {
  return view_ ? view_->model().currentSegmentIndex() : 0;
}

void AttributeContentDetailsBinding::setPlotHeight(double plotHeight) {
  if (std::exchange(plotHeight_, plotHeight) == plotHeight) return;
  bars_.setPlotHeight(plotHeight);
  emit scaleChanged();
}

QVariantList AttributeContentDetailsBinding::ticks() const {
  QVariantList ticks;
  for (const GraphTick& tick : bars_.scale().ticks())
    ticks << QVariantMap{{QStringLiteral("y"), tick.y}, {QStringLiteral("text"), toQt(tick.text)}};
  return ticks;
}

QString AttributeContentDetailsBinding::selectedValue() const {
  const int selected = selectedIndex();
  return selected < 0 ? QString() : bars_.data(bars_.index(selected), GraphBarsModel::ValueRole).toString();
}

QString AttributeContentDetailsBinding::selectedTime() const {
  const int selected = selectedIndex();
  if (selected < 0) return {};
  // A day's own bar says no more than its day; a reading's tells its second.
  if (currentSegmentIndex() != 0) return bars_.data(bars_.index(selected), GraphBarsModel::LabelRole).toString();
  return toQt(timeText(view_->model().dataSource()[static_cast<std::size_t>(selected)].collectedOn));
}

QString AttributeContentDetailsBinding::widestLabel() const {
  if (bars_.rowCount() == 0) return {};
  QString widest = bars_.data(bars_.index(0), GraphBarsModel::LabelRole).toString();
  for (QChar& character : widest)
    if (character.isDigit()) character = QLatin1Char('0');
  return widest + QLatin1Char('0');  // names of days differ a little
}

void AttributeContentDetailsBinding::selectSegment(int index) {
  if (view_) view_->model().selectSegment(index);
}

void AttributeContentDetailsBinding::tapBar(int index) {
  if (view_ && index >= 0) view_->model().tapBar(static_cast<std::size_t>(index));
}

int AttributeContentDetailsBinding::labelStride(double labelWidth, double barPitch) const {
  return static_cast<int>(quorl::labelStride(labelWidth, barPitch));
}

void AttributeContentDetailsBinding::leave() {
  showConnection_.disconnect();
  rowsConnection_.disconnect();
  controller_.reset();
  deleteLater();
}

}  // namespace quorl::view
