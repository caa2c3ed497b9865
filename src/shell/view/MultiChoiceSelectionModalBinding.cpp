#include "shell/view/MultiChoiceSelectionModalBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

MultiChoiceSelectionModalBinding::MultiChoiceSelectionModalBinding(std::shared_ptr<MultiChoiceSelectionModal> modal,
                                                                   QObject* parent)
    : QObject(parent), modal_(std::move(modal)), dismissal_(modal_->onDismiss([this] { emit dismissed(); })) {}

QStringList MultiChoiceSelectionModalBinding::names() const {
  QStringList names;
  for (const std::string& name : modal_->tableViewData()) names.append(toQt(name));
  return names;
}

void MultiChoiceSelectionModalBinding::selectRow(int index) {
  if (index >= 0) modal_->didSelectRow(static_cast<std::size_t>(index));
}

void MultiChoiceSelectionModalBinding::dismiss() {
  modal_->dismiss();
}

}  // namespace quorl::view
