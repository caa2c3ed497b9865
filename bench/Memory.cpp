#include "Memory.h"

#include <cstdlib>
#include <fstream>
#include <string>
#include <string_view>

#include <malloc.h>

namespace quorl::bench {
namespace {

std::size_t fieldOfStatus(std::string_view name) {
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);)
    if (line.starts_with(name)) return std::strtoull(line.c_str() + name.size(), nullptr, 10) * 1024;
  return 0;
}

}  // namespace

std::size_t memory() {
  return fieldOfStatus("VmRSS:");
}

std::size_t mostMemory() {
  return fieldOfStatus("VmHWM:");
}

void resetMostMemory() {
  malloc_trim(0);
  std::ofstream("/proc/self/clear_refs") << 5;
}

}  // namespace quorl::bench
