#include <iostream>
#include <string>

#include "Commands.h"

namespace quorl::tool {

void complain(std::string_view text) {
  // One write, so that the line stays whole beside the log's.
  std::cerr << "quorl-tool: " + std::string(text) + "\n" << std::flush;
}

}  // namespace quorl::tool
