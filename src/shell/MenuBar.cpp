#include "shell/MenuBar.h"

#include <algorithm>
#include <chrono>
#include <cmath>

#include "platform/Platform.h"

namespace quorl {
namespace {

constexpr int kMostSegments = 3;
constexpr double kInitialVelocity = 1;  // ways a second
/// Angular frequency, in 1/s, at which a critically damped spring has come within a thousandth of its end in time.
constexpr double kSpringFrequency = 18.4;

}  // namespace

std::shared_ptr<MenuBar> MenuBar::make(int numberOfSegments) {
  return std::shared_ptr<MenuBar>(new MenuBar(numberOfSegments));
}

MenuBar::MenuBar(int numberOfSegments)
    : menuImageNames_(numberOfSegments == kMostSegments ? std::vector<std::string>{"house", "list.dash", "bolt"}
                                                        : std::vector<std::string>{"house", "list.dash"}),
      numberOfSegments_(static_cast<int>(menuImageNames_.size())),
      segmentWidthMultiplier_(numberOfSegments_) {}

std::vector<MenuCell> MenuBar::cells() const {
  std::vector<MenuCell> cells(menuImageNames_.size(), MenuCell(height));
  for (std::size_t index = 0; index < cells.size(); ++index) {
    cells[index].setImageName(menuImageNames_[index]);
    cells[index].setSelected(index == selectedIndex_);
  }
  return cells;
}

double MenuBar::markerX(double barWidth) const {
  return barWidth * static_cast<double>(selectedIndex_) / segmentWidthMultiplier_;
}

double MenuBar::markerProgress(double part) {
  if (part <= 0) return 0;
  if (part >= 1) return 1;
  const double time = part * animationDuration;
  const double left = std::exp(-kSpringFrequency * time) * (1 + (kSpringFrequency - kInitialVelocity) * time);
  return std::clamp(1 - left, 0.0, 1.0);
}

void MenuBar::didSelectItemAt(std::size_t index, bool animated) {
  if (index >= menuImageNames_.size()) return;
  selectedIndex_ = index;
  const std::size_t movement = ++movement_;
  selected_();
  Platform::current().mainQueue.asyncAfter(
      std::chrono::duration_cast<Queue::Duration>(std::chrono::duration<double>(animated ? animationDuration : 0)),
      [weak = weak_from_this(), movement] {
        if (const auto self = weak.lock()) self->markerDidArrive(movement);
      });
}

void MenuBar::markerDidArrive(std::size_t movement) {
  if (movement != movement_) return;
  if (const auto delegate = delegate_.lock()) delegate->menuBarDidSelectItemAt(selectedIndex_);
}

}  // namespace quorl
