#include "shell/MultiChoiceSelectionModal.h"

namespace quorl {

void MultiChoiceSelectionModal::didSelectRow(std::size_t index) {
  if (index >= tableViewData_.size()) return;
  const std::string& name = tableViewData_[index];
  if (!name.empty()) {
    if (const auto delegate = delegate_.lock()) delegate->didSelectChoice(name);
  }
  dismiss();
}

}  // namespace quorl
