#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "base/Signal.h"
#include "screens/metricdetail/MetricDetailViewDelegate.h"
#include "screens/metricdetail/MetricDetailViewModel.h"
#include "screens/metricdetail/MetricDetailsViewCell.h"
#include "shell/Toast.h"

namespace quorl {

/// What stands on the detail screen: texts, and rows with their state and intents. Main thread.
class MetricDetailView {
 public:
  /// Rows under a header; a header of "" is none.
  struct Section {
    std::string header;
    std::vector<std::shared_ptr<MetricDetailsViewCell>> cells;
  };

  explicit MetricDetailView(std::shared_ptr<MetricDetailViewModel> viewModel);
  MetricDetailView(const MetricDetailView&) = delete;
  MetricDetailView& operator=(const MetricDetailView&) = delete;

  const std::shared_ptr<MetricDetailViewModel>& viewModel() const { return viewModel_; }
  MetricDetailViewDelegate& viewProtocol() { return viewProtocol_; }

  /// "Last seen on: " and a time.
  std::string lastSeenText() const;
  /// While true a spinner with the text "Loading..." stands in place of the rows.
  bool showsSpinner() const { return viewModel_->shouldShowSPinner(); }
  static constexpr char spinnerText[] = "Loading...";
  /// The sections of "CA Status", or all rows in one section without a header.
  const std::vector<Section>& sections() const { return sections_; }
  /// "copied", after a long press on a row.
  Toast& showToast() { return showToast_; }

  /// Takes the model's state on show. A row that is still the same reading keeps its cell, and so what the user has
  /// flipped in it; a new reading of an attribute starts with the bookmark that the one before shows. Rows of sections
  /// show what the user has made of their attribute on this screen.
  void refresh();
  /// The same with the bookmarks, which the model has marked now, but for those of sections.
  void refreshBookmarks();
  /// `handler` runs after every change of a text, of the rows or of the spinner.
  [[nodiscard]] Connection onChange(Signal<>::Handler handler) { return changed_.connect(std::move(handler)); }

 private:
  /// Cells shown before, with the header above them: by reading, and by attribute (raw name).
  struct Earlier {
    std::map<std::pair<std::string, Uuid>, std::shared_ptr<MetricDetailsViewCell>> byId;
    std::map<std::pair<std::string, std::string>, std::shared_ptr<MetricDetailsViewCell>> byName;
  };
  /// Subscription and raw name.
  using Attribute = std::pair<std::int32_t, std::string>;

  Section makeSection(std::string header, const std::vector<Metric>& rows, bool isSectioned, const Earlier& earlier);
  bool startsBookmarked(const std::string& header, const Metric& row, bool isSectioned, const Earlier& earlier) const;
  std::shared_ptr<MetricDetailsViewCell> makeCell(const Metric& row, bool isBookmarked, bool isSectioned);
  /// Where a row stands in the model now. An index that no row has when it is gone.
  struct Place {
    std::size_t index;
    std::size_t sectionIndex;
  };
  Place placeOf(const Uuid& id, bool isSectioned) const;

  const std::shared_ptr<MetricDetailViewModel> viewModel_;
  MetricDetailViewDelegate viewProtocol_;
  std::vector<Section> sections_;
  /// Pins (true) and removals that the user asked for here. The model leaves rows of sections unmarked, and takes the
  /// sections away in the middle of each load, so this is all that tells their bookmarks.
  std::map<Attribute, bool> flipped_;
  Toast showToast_;
  Signal<> changed_;
  Connection modelConnection_;
};

}  // namespace quorl
