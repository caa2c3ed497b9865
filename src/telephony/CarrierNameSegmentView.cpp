#include "telephony/CarrierNameSegmentView.h"

#include <cmath>
#include <numbers>
#include <utility>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "shell/NotificationNames.h"

namespace quorl {

void SelectedTitle::set(std::string value) {
  value_ = std::move(value);
  changed_();
}

TabButton::TabButton(std::shared_ptr<SelectedTitle> selected, std::size_t selectedIndex, std::string title,
                     std::shared_ptr<const HorvaneViewModel> root)
    : selected_(std::move(selected)), selectedIndex_(selectedIndex), title_(std::move(title)), root_(std::move(root)) {}

double TabButton::springProgress(double seconds) {
  if (seconds <= 0) return 0;
  if (seconds >= kSpringDurationS) return 1;
  const double frequency = 2 * std::numbers::pi / kSpringResponseS;
  const double decay = kSpringDampingFraction * frequency;
  const double swing = frequency * std::sqrt(1 - kSpringDampingFraction * kSpringDampingFraction);
  return 1 - std::exp(-decay * seconds) * (std::cos(swing * seconds) + decay / swing * std::sin(swing * seconds));
}

bool TabButton::isSelected() const {
  return selected_->value() == title_ || (selected_->value().empty() && selectedIndex_ == 0);
}

void TabButton::press() {
  // A listener may rebuild the bar and with it this tab.
  const auto selected = selected_;
  HardwareManager& hardwareManager = HardwareManager::shared();
  const std::optional<std::int32_t> subsId = subsIdOfTab();
  selected->set(std::string(title_));
  if (subsId) hardwareManager.setCurrentSubsId(*subsId);
  NotificationCenter::defaultCenter().post(notification::kSubsIdSelectionChange);
  hardwareManager.setTabSelectedTitle(selected->value());
}

std::optional<std::int32_t> TabButton::subsIdOfTab() const {
  if (!title_.empty()) {
    const auto found = root_->carrierCurrentSubsIdMap().find(title_);
    return found == root_->carrierCurrentSubsIdMap().end() ? 0 : found->second;
  }
  if (selectedIndex_ >= root_->carriers().size()) return std::nullopt;
  return root_->carriers()[selectedIndex_]->subsId();
}

CarrierNameSegmentView::CarrierNameSegmentView(std::shared_ptr<HorvaneViewModel> root)
    : root_(std::move(root)),
      rootObservation_(root_->observeChanges([this] { changed_(); })),
      tabObservation_(tab_->observeChanges([this] { changed_(); })) {}

std::vector<TabButton> CarrierNameSegmentView::tabButtons() const {
  std::vector<TabButton> buttons;
  for (std::size_t index = 0; index < root_->carriers().size(); ++index)
    buttons.emplace_back(tab_, index, root_->carriers()[index]->name(), root_);
  return buttons;
}

}  // namespace quorl
