#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/Signal.h"
#include "telephony/HorvaneViewModel.h"

namespace quorl {

/// The title of the tab that was chosen in one bar, shared by its tabs. "" until one was chosen.
class SelectedTitle {
 public:
  const std::string& value() const { return value_; }
  /// Announces the change, also when the title stays the same.
  void set(std::string value);
  [[nodiscard]] Connection observeChanges(std::function<void()> handler) { return changed_.connect(handler); }

 private:
  std::string value_;
  Signal<> changed_;
};

/// One tab of the carrier bar: a capsule with a bold title. Main thread.
class TabButton {
 public:
  // The white capsule of the selected tab moves between the tabs as one shape of this name.
  static constexpr char kGeometryId[] = "Tab";
  static constexpr int kHeight = 45;
  // The spring of a press, without blending.
  static constexpr double kSpringResponseS = 0.55;
  static constexpr double kSpringDampingFraction = 0.825;
  /// After this time the spring is within a thousandth of its end.
  static constexpr double kSpringDurationS = 0.8;
  /// How much of its way the capsule has gone after `seconds`; a little more than 1 where it swings over.
  static double springProgress(double seconds);

  TabButton(std::shared_ptr<SelectedTitle> selected, std::size_t selectedIndex, std::string title,
            std::shared_ptr<const HorvaneViewModel> root);

  const std::string& title() const { return title_; }
  /// Position in the bar.
  std::size_t selectedIndex() const { return selectedIndex_; }
  /// Lit when its title is the chosen one, so carriers of one name light up together. The first tab is lit while
  /// nothing is chosen.
  bool isSelected() const;

  /// Chooses this carrier's subscription for all screens, also when the tab is selected already. Listeners of
  /// "subsIdSelectionChange" find the new `currentSubsId` and still the old `tabSelectedTitle`.
  void press();

 private:
  /// Nothing for a nameless tab that outlived its carrier.
  std::optional<std::int32_t> subsIdOfTab() const;

  std::shared_ptr<SelectedTitle> selected_;
  std::size_t selectedIndex_;
  std::string title_;
  std::shared_ptr<const HorvaneViewModel> root_;
};

/// The carrier bar: one tab for each SIM. Main thread.
class CarrierNameSegmentView {
 public:
  explicit CarrierNameSegmentView(std::shared_ptr<HorvaneViewModel> root);

  /// The chosen title; an update of the root leaves it alone.
  const std::string& tab() const { return tab_->value(); }
  /// A tab for each of the root's carriers as they are now, in order; none hides the bar's contents.
  std::vector<TabButton> tabButtons() const;
  /// `handler` runs when the tabs, or which of them are lit, may have changed.
  [[nodiscard]] Connection observeChanges(std::function<void()> handler) { return changed_.connect(handler); }

 private:
  std::shared_ptr<HorvaneViewModel> root_;
  std::shared_ptr<SelectedTitle> tab_ = std::make_shared<SelectedTitle>();
  Signal<> changed_;
  Connection rootObservation_;
  Connection tabObservation_;
};

}  // namespace quorl
