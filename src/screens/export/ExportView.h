#pragma once

#include <memory>
#include <string>

#include "shell/LoadingView.h"
#include "store/Metric.h"

namespace quorl {

class PersistanceStore;

/// What the loading view says while an export is gathered.
inline constexpr char kGatheringText[] = "Gathering metrics from database";

/// What a row of the export screen needs of it.
class ExportViewDelegate {
 public:
  virtual ~ExportViewDelegate() = default;
  virtual LoadingView& loadingView() = 0;
  virtual const std::shared_ptr<PersistanceStore>& persistanceStore() const = 0;
};

/// One row of the export screen: a time frame that can be taken out. Main thread.
class ExportView {
 public:
  ExportView(AttributeDetailTimeFrame timeFrame, std::weak_ptr<ExportViewDelegate> delegate);

  /// "Daily", "Weekly" or "Monthly".
  const std::string& labelText() const { return labelText_; }
  AttributeDetailTimeFrame timeFrame() const { return timeFrame_; }

  /// What a file of the text is called at this moment: "quorl-daily-2026-01-05-093012.txt".
  std::string fileName() const;

  /// Gathers all rows of the time frame and hands them to the share facility as one text, which is made as it is taken.
  /// A failed read is logged, and the loading view stays.
  void didTapExportButton();

 private:
  const AttributeDetailTimeFrame timeFrame_;
  const std::string labelText_;
  const std::weak_ptr<ExportViewDelegate> delegate_;
};

}  // namespace quorl
