#include "shell/TickerViewController.h"

#include <utility>

#include <fmt/format.h>

namespace quorl {
namespace {

using Size = TickerColumnCell::Size;

// Of columns, in points: the first and the two decimals, the decimal point, all between.
constexpr double kEdgeWidth = 20;
constexpr double kPointWidth = 8;
constexpr double kMiddleWidth = 32;

bool isDigit(char character) {
  return character >= '0' && character <= '9';
}

Size sizeOf(char character, std::size_t fromEnd) {
  if (character == '.') return Size::mini;
  if (!isDigit(character)) return Size::small;
  return fromEnd < 2 ? Size::small : Size::large;
}

}  // namespace

const std::vector<std::string>& TickerViewController::numericAlphabet() {
  static const std::vector<std::string> alphabet{"0", "1", "2", "3", "4", "5", "6", "7", "8", "9"};
  return alphabet;
}

void TickerViewController::setNumberValue(double value) {
  numberValue_ = value;
  stringValue_ = fmt::format("{:.2f}", value);
  updateColumns();
  scrollToValue();
}

void TickerViewController::updateColumns() {
  const std::size_t count = stringValue_.size();
  std::vector<TickerColumnCell> columns;
  columns.reserve(count);
  bool isSame = collectionView_.size() == count;
  for (std::size_t index = 0; index < count; ++index) {
    const char character = stringValue_[index];
    columns.emplace_back(isDigit(character) ? numericAlphabet() : std::vector<std::string>{std::string(1, character)},
                         sizeOf(character, count - 1 - index));
    isSame = isSame && columns[index].size() == collectionView_[index].size() &&
             columns[index].characters() == collectionView_[index].characters();
  }
  if (isSame) return;
  collectionView_ = std::move(columns);
  reload_();
}

double TickerViewController::widthAt(std::size_t index) const {
  const std::size_t fromEnd = collectionView_.size() - 1 - index;
  if (index == 0 || fromEnd < 2) return kEdgeWidth;
  return fromEnd == 2 ? kPointWidth : kMiddleWidth;
}

void TickerViewController::scrollToValue() {
  for (std::size_t index = 0; index < stringValue_.size() && index < collectionView_.size(); ++index) {
    TickerColumnCell& column = collectionView_[index];
    const auto row = column.rowOf(std::string(1, stringValue_[index]));
    if (!row) return;
    if (column.isScrolling()) continue;
    column.scrollToRow(*row);
    scroll_(index);
  }
}

}  // namespace quorl
