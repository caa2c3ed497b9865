#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "Hexadecimal.h"

// A payload as the tool reads it. What is accepted must come back from its own text.

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto bytes = quorl::tool::hexBytes({reinterpret_cast<const char*>(data), size});
  if (bytes && quorl::tool::hexBytes(quorl::tool::hexText(*bytes)) != bytes) std::abort();
  return 0;
}
