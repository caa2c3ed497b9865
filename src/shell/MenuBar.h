#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "base/Signal.h"

namespace quorl {

/// Hears which tab was chosen, once the bar's marker has arrived there.
class MenuBarDelegate {
 public:
  virtual ~MenuBarDelegate() = default;
  virtual void menuBarDidSelectItemAt(std::size_t index) = 0;
};

/// One item of the tab bar: an icon.
class MenuCell {
 public:
  explicit MenuCell(double menuCellSize) : menuCellSize_(menuCellSize) {}

  /// Height in points.
  double menuCellSize() const { return menuCellSize_; }
  const std::string& imageName() const { return imageName_; }
  void setImageName(std::string name) { imageName_ = std::move(name); }
  bool isSelected() const { return isSelected_; }
  void setSelected(bool isSelected) { isSelected_ = isSelected; }
  /// Named colour of the icon.
  const char* tint() const { return isSelected_ ? "ButtonSelected" : "ButtonNormal"; }

 private:
  double menuCellSize_;
  std::string imageName_ = "house";
  bool isSelected_ = false;
};

/// The tab bar: icons side by side and a marker under the chosen one. A pressed item is selected at once; the delegate
/// is told when the marker has arrived. Main thread.
class MenuBar final : public std::enable_shared_from_this<MenuBar> {
 public:
  static constexpr double animationDuration = 0.5;  // seconds
  static constexpr char cellId[] = "MenuBarCellId";
  static constexpr double horizontalViewBarHeight = 3;  // points, of the marker
  static constexpr double height = 50;                  // points

  /// Three segments, or two for any other number. The first is selected.
  static std::shared_ptr<MenuBar> make(int numberOfSegments);
  MenuBar(const MenuBar&) = delete;
  MenuBar& operator=(const MenuBar&) = delete;

  const std::vector<std::string>& menuImageNames() const { return menuImageNames_; }
  int numberOfSegments() const { return numberOfSegments_; }
  double segmentWidthMultiplier() const { return segmentWidthMultiplier_; }
  void setDelegate(std::weak_ptr<MenuBarDelegate> delegate) { delegate_ = std::move(delegate); }

  /// One for each segment.
  std::vector<MenuCell> cells() const;
  std::size_t selectedIndex() const { return selectedIndex_; }
  /// Width of an item, and of the marker, in a bar of `barWidth`.
  double itemWidth(double barWidth) const { return barWidth / segmentWidthMultiplier_; }
  /// Left edge of the marker when it stands under the selected item.
  double markerX(double barWidth) const;
  /// How much of its way the marker has gone after `part` (0 to 1) of its time: a spring without overshoot that starts
  /// at a speed of one way a second.
  static double markerProgress(double part);

  /// Selects the item and sends the marker there. The delegate hears of it in half a second, unless another press comes
  /// before: an interrupted movement tells nothing. Not animated, it hears in the main queue's next turn. Out of range
  /// it does nothing.
  void didSelectItemAt(std::size_t index, bool animated = true);

  /// `handler` runs when another item is selected: the marker moves to it from wherever it is.
  [[nodiscard]] Connection onSelect(Signal<>::Handler handler) { return selected_.connect(std::move(handler)); }

 private:
  explicit MenuBar(int numberOfSegments);
  void markerDidArrive(std::size_t movement);

  const std::vector<std::string> menuImageNames_;
  const int numberOfSegments_;
  const double segmentWidthMultiplier_;
  std::weak_ptr<MenuBarDelegate> delegate_;
  std::size_t selectedIndex_ = 0;
  std::size_t movement_ = 0;  // counts them, so that an interrupted one knows it
  Signal<> selected_;
};

}  // namespace quorl
