#include "screens/metricdetail/MetricDetailViewDelegate.h"

#include "screens/metricdetail/MetricDetailViewModel.h"
#include "shell/Logs.h"

namespace quorl {

void MetricDetailViewDelegate::showGraphForItemAt(const MetricDetailViewModel& model, std::size_t index,
                                                  std::size_t sectionIndex, bool isSectioned) {
  const Metric* metric = model.row(index, sectionIndex, isSectioned);
  if (metric == nullptr) {
    appUiLog.log("showGraphForItemAt - showGraphForItemAt - unable to unwrap metric");
    return;
  }
  metric_.set(*metric);
}

}  // namespace quorl
