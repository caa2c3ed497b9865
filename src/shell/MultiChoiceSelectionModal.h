#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "base/Signal.h"

namespace quorl {

class MultiChoiceSelectionModalDelegate {
 public:
  virtual ~MultiChoiceSelectionModalDelegate() = default;
  virtual void didSelectChoice(const std::string& name) = 0;
};

/// A list of names over the screen, one of which can be chosen. Whoever shows it holds it. Main thread.
class MultiChoiceSelectionModal {
 public:
  MultiChoiceSelectionModal(std::vector<std::string> tableViewData,
                            std::weak_ptr<MultiChoiceSelectionModalDelegate> delegate)
      : tableViewData_(std::move(tableViewData)), delegate_(std::move(delegate)) {}
  MultiChoiceSelectionModal(const MultiChoiceSelectionModal&) = delete;
  MultiChoiceSelectionModal& operator=(const MultiChoiceSelectionModal&) = delete;

  const std::vector<std::string>& tableViewData() const { return tableViewData_; }

  /// Tells the delegate the row's text and closes. A row without text only closes; out of range it does nothing.
  void didSelectRow(std::size_t index);
  /// The cross button.
  void dismiss() { dismissed_(); }

  /// `handler` closes the modal.
  [[nodiscard]] Connection onDismiss(Signal<>::Handler handler) { return dismissed_.connect(std::move(handler)); }

 private:
  const std::vector<std::string> tableViewData_;
  const std::weak_ptr<MultiChoiceSelectionModalDelegate> delegate_;
  Signal<> dismissed_;
};

}  // namespace quorl
