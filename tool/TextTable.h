#pragma once

#include <ostream>
#include <string>
#include <string_view>
#include <vector>

namespace quorl::tool {

/// Columns of text under a head, each as wide as its widest cell.
class TextTable {
 public:
  explicit TextTable(std::vector<std::string> head) { add(std::move(head)); }

  /// One cell for each column of the head. Control characters become dots: stored texts come from outside.
  void add(std::vector<std::string> cells);
  void print(std::ostream& output) const;

 private:
  std::vector<std::vector<std::string>> rows_;
  std::vector<std::size_t> widths_;
};

/// How many columns of a terminal a UTF-8 text takes, a column for each character.
std::size_t displayWidth(std::string_view text);

}  // namespace quorl::tool
