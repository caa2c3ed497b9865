#include "InputLines.h"

#include <iostream>

#include "Commands.h"

namespace quorl::tool {

bool forEachInputLine(const std::function<void(std::size_t number, const std::string& line)>& take) {
  std::string line;
  for (std::size_t number = 1; std::cout && std::getline(std::cin, line); ++number) take(number, line);
  if (!std::cin.bad()) return true;
  complain("standard input cannot be read to its end");
  return false;
}

}  // namespace quorl::tool
