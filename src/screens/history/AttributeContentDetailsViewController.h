#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/DispatchGroup.h"
#include "base/Signal.h"
#include "screens/history/AttributeDetailsView.h"
#include "store/PersistanceStore.h"

namespace quorl {

/// The history screen of one attribute: reads its three time frames, once, and then shows them. There is no retry;
/// leaving and coming back makes a new one. Main thread.
class AttributeContentDetailsViewController final
    : public std::enable_shared_from_this<AttributeContentDetailsViewController> {
 public:
  /// `metric` is any row of the attribute.
  static std::shared_ptr<AttributeContentDetailsViewController> make(std::shared_ptr<PersistanceStore> store,
                                                                     Metric metric);
  AttributeContentDetailsViewController(const AttributeContentDetailsViewController&) = delete;
  AttributeContentDetailsViewController& operator=(const AttributeContentDetailsViewController&) = delete;

  /// Starts the reads. To be called once. A read that fails costs its time frame only.
  void viewDidLoad();

  /// The attribute's display name.
  const std::string& title() const { return metric_.attributeName; }
  const Metric& metric() const { return metric_; }
  /// Null until all reads have ended.
  const std::shared_ptr<AttributeDetailsView>& view() const { return view_; }
  /// `handler` runs when the view is there.
  [[nodiscard]] Connection onShowView(Signal<>::Handler handler) { return showView_.connect(std::move(handler)); }

 private:
  AttributeContentDetailsViewController(std::shared_ptr<PersistanceStore> store, Metric metric)
      : persistanceStore_(std::move(store)), metric_(std::move(metric)) {}

  void fetch(AttributeDetailTimeFrame timeFrame, DispatchGroup group);
  void frameDidLoad(AttributeDetailTimeFrame timeFrame, std::vector<Metric> rows,
                    const std::optional<SQLiteError>& error);
  void showView();

  const std::shared_ptr<PersistanceStore> persistanceStore_;
  const Metric metric_;
  std::vector<Metric> daily_;
  std::vector<Metric> weekly_;
  std::vector<Metric> monthly_;
  std::shared_ptr<AttributeDetailsView> view_;
  Signal<> showView_;
};

}  // namespace quorl
