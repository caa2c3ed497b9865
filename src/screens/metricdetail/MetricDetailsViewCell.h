#pragma once

#include <functional>
#include <string>

#include "base/Signal.h"
#include "store/Metric.h"

namespace quorl {

/// One row of the detail screen with its own view state. Main thread.
class MetricDetailsViewCell {
 public:
  struct Actions {
    std::function<void()> graphableAction;
    std::function<void(bool isBookmarked)> bookMarkAction;
    std::function<void()> onCopyAction;
  };

  /// `isBookmarked` holds until the reading's own bookmark is known.
  MetricDetailsViewCell(Metric metricObject, bool isBookmarked, Actions actions);
  MetricDetailsViewCell(const MetricDetailsViewCell&) = delete;
  MetricDetailsViewCell& operator=(const MetricDetailsViewCell&) = delete;

  const Metric& metricObject() const { return metricObject_; }
  /// The attribute's name as shown: "rsrp" for "0-section-rsrp".
  std::string nameText() const;
  /// The value as shown: "10 MHz" for a bandwidth of 50 resource blocks.
  std::string valueText() const;

  /// Only internal and carrier builds show graphs.
  bool showsGraphSymbol() const;
  /// Flips at the tap and stays so, whatever becomes of the statement.
  bool isBookmarked() const { return isBookmarked_.get(); }
  const char* bookmarkSymbol() const { return isBookmarked() ? "bookmark.fill" : "bookmark"; }

  void tapGraph();
  void tapBookmark();
  /// Copies the value shown to the pasteboard.
  void longPress();

  /// Takes over what has become of the same reading, but for its bookmark.
  void update(const Metric& metric);
  /// Takes over the reading's bookmark, unless the user has flipped it here.
  void mark();
  /// `handler` runs at once and whenever the bookmark flips.
  [[nodiscard]] Connection onBookmarkChange(Published<bool>::Handler handler) {
    return isBookmarked_.subscribe(std::move(handler));
  }

 private:
  Metric metricObject_;
  const Actions actions_;
  Published<bool> isBookmarked_;
  bool isFlippedByUser_ = false;
};

}  // namespace quorl
