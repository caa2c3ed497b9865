#include "screens/export/ExportView.h"

#include <optional>
#include <utility>

#include "base/DateText.h"
#include "base/FatalStop.h"
#include "platform/Platform.h"
#include "screens/export/ExportText.h"
#include "shell/Logs.h"
#include "store/PersistanceStore.h"

namespace quorl {
namespace {

const char* labelOf(AttributeDetailTimeFrame timeFrame) {
  switch (timeFrame) {
    case AttributeDetailTimeFrame::daily:
      return "Daily";
    case AttributeDetailTimeFrame::weekly:
      return "Weekly";
    case AttributeDetailTimeFrame::monthly:
      return "Monthly";
  }
  fatalStop("AttributeDetailTimeFrame: no such case");
}

}  // namespace

ExportView::ExportView(AttributeDetailTimeFrame timeFrame, std::weak_ptr<ExportViewDelegate> delegate)
    : timeFrame_(timeFrame), labelText_(labelOf(timeFrame)), delegate_(std::move(delegate)) {}

std::string ExportView::fileName() const {
  std::string name = "quorl-" + labelText_ + "-" + wallClockText(Platform::current().clock.now()) + ".txt";
  std::erase(name, ':');
  for (char& c : name) c = c == ' ' ? '-' : c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
  return name;
}

void ExportView::didTapExportButton() {
  generalLog.log("Export View - didTapExportButton");
  const auto screen = delegate_.lock();
  if (!screen) return;
  screen->loadingView().setLoadingLabelText(kGatheringText);
  screen->loadingView().show();
  screen->persistanceStore()->exportMetrics(
      timeFrame_, [delegate = delegate_, fileName = fileName()](const ExportedMetrics& metrics,
                                                                const std::optional<SQLiteError>& error) {
        if (error) {
          generalLog.log("error  ---> %{public}s)", *error);  // the bracket is part of the line
          return;
        }
        const auto alive = delegate.lock();
        if (!alive) return;
        alive->loadingView().hide();
        Platform::current().share.share(sharedExportText(metrics, fileName));
      });
}

}  // namespace quorl
