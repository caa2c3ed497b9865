#pragma once

#include <cstddef>
#include <optional>

#include "base/Signal.h"
#include "store/Metric.h"

namespace quorl {

class MetricDetailViewModel;

/// Carries a row's wish for its graph from the view to the screen. Main thread.
class MetricDetailViewDelegate {
 public:
  using Handler = Published<std::optional<Metric>>::Handler;

  /// Publishes a row of `model`, or of one of its sections when `isSectioned`. No such row is logged only.
  void showGraphForItemAt(const MetricDetailViewModel& model, std::size_t index, std::size_t sectionIndex,
                          bool isSectioned);
  /// `handler` runs at once with the last row published, nothing at first, and then with each.
  [[nodiscard]] Connection subscribe(Handler handler) { return metric_.subscribe(std::move(handler)); }

 private:
  Published<std::optional<Metric>> metric_;
};

}  // namespace quorl
