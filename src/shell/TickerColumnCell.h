#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace quorl {

/// One character of a ticker.
struct TickerCell {
  std::string digit;
  double fontSize = 40;  // points

  friend bool operator==(const TickerCell&, const TickerCell&) = default;
};

/// One column of a ticker: a small vertical list of characters that scrolls to the one to be shown. It takes no
/// touches, and its rows have no separators. Main thread.
class TickerColumnCell {
 public:
  enum class Size { mini, small, large };

  TickerColumnCell(std::vector<std::string> characters, Size size) : characters_(std::move(characters)), size_(size) {}

  const std::vector<std::string>& characters() const { return characters_; }
  Size size() const { return size_; }
  /// True while a movement is under way; the view sets it. The column is not sent elsewhere meanwhile.
  bool isScrolling() const { return isScrolling_; }
  void setScrolling(bool isScrolling) { isScrolling_ = isScrolling; }

  /// `index` must be less than the number of characters.
  TickerCell cellAt(std::size_t index) const { return {characters_.at(index), size_ == Size::small ? 35.0 : 40.0}; }
  /// Nothing when the column has no such character.
  std::optional<std::size_t> rowOf(const std::string& character) const;

  /// Row in the column's centre.
  std::size_t row() const { return row_; }
  void scrollToRow(std::size_t row) { row_ = row; }

 private:
  std::vector<std::string> characters_;
  Size size_;
  bool isScrolling_ = false;
  std::size_t row_ = 0;
};

}  // namespace quorl
