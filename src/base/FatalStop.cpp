#include "base/FatalStop.h"

#include <cstdio>
#include <cstdlib>

namespace quorl {

void fatalStop(std::string_view reason) {
  std::fprintf(stderr, "Fatal error: %.*s\n", static_cast<int>(reason.size()), reason.data());
  std::fflush(nullptr);
  std::abort();
}

}  // namespace quorl
