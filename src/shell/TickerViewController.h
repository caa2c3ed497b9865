#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "base/Signal.h"
#include "shell/TickerColumnCell.h"

namespace quorl {

/// A number in the manner of a mechanical counter, one column for each character. Main thread.
class TickerViewController {
 public:
  /// "0" to "9".
  static const std::vector<std::string>& numericAlphabet();

  double numberValue() const { return numberValue_; }
  /// Shows `value` with two decimals. The columns stay, and scroll, as long as their kinds do.
  void setNumberValue(double value);
  /// "" before the first value.
  const std::string& stringValue() const { return stringValue_; }

  std::vector<TickerColumnCell>& collectionView() { return collectionView_; }
  const std::vector<TickerColumnCell>& collectionView() const { return collectionView_; }
  /// Of a column in points, by its position alone. `index` must be less than the number of columns.
  double widthAt(std::size_t index) const;

  /// Sends each column to its character, up to the first one that has no such character.
  void scrollToValue();

  /// `handler` reads the columns anew.
  [[nodiscard]] Connection onReload(Signal<>::Handler handler) { return reload_.connect(std::move(handler)); }
  /// `handler` receives the index of the column that is to move to its row.
  [[nodiscard]] Connection onScroll(Signal<std::size_t>::Handler handler) {
    return scroll_.connect(std::move(handler));
  }

 private:
  void updateColumns();

  double numberValue_ = 0;
  std::string stringValue_;
  std::vector<TickerColumnCell> collectionView_;
  Signal<> reload_;
  Signal<std::size_t> scroll_;
};

}  // namespace quorl
