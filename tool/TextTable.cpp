#include "TextTable.h"

#include <algorithm>

#include "base/PrintableText.h"

namespace quorl::tool {

std::size_t displayWidth(std::string_view text) {
  return static_cast<std::size_t>(std::count_if(
      text.begin(), text.end(), [](char byte) { return (static_cast<unsigned char>(byte) & 0xC0) != 0x80; }));
}

void TextTable::add(std::vector<std::string> cells) {
  widths_.resize(std::max(widths_.size(), cells.size()));
  for (std::size_t column = 0; column < cells.size(); ++column) {
    cells[column] = printable(cells[column]);
    widths_[column] = std::max(widths_[column], displayWidth(cells[column]));
  }
  rows_.push_back(std::move(cells));
}

void TextTable::print(std::ostream& output) const {
  for (const std::vector<std::string>& cells : rows_) {
    std::string line;
    std::size_t missing = 0;  // blanks up to the next column
    for (std::size_t column = 0; column < cells.size(); ++column) {
      if (!cells[column].empty()) {
        line.append(missing, ' ').append(cells[column]);
        missing = 0;
      }
      missing += widths_[column] - displayWidth(cells[column]) + 2;
    }
    output << line << '\n';
  }
}

}  // namespace quorl::tool
