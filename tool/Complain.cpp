#include <iostream>
#include <string>

#include "Commands.h"
#include "base/PrintableText.h"

namespace quorl::tool {

void complain(std::string_view text) {
  // One write, so that the line stays whole beside the log's.
  std::cerr << "quorl-tool: " + printable(text) + "\n" << std::flush;
}

}  // namespace quorl::tool
