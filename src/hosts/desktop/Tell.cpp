#include "hosts/desktop/Tell.h"

#include <iostream>
#include <sstream>
#include <string>

#include "base/PrintableText.h"

namespace quorl::desktop {

void tell(std::string_view text) {
  std::istringstream lines{std::string(text)};
  std::string whole;
  for (std::string line; std::getline(lines, line);) whole += "quorl-simulator: " + printable(line) + "\n";
  // One write, so that the lines stay whole beside the log's.
  std::cerr << whole << std::flush;
}

}  // namespace quorl::desktop
