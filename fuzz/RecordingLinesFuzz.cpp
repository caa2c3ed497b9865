#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "hosts/simulator/Recording.h"

// One line of a recording. What is accepted must come back from its own text.

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto event = quorl::simulator::parseRecordingLine({reinterpret_cast<const char*>(data), size});
  if (!event) return 0;
  const auto again = quorl::simulator::parseRecordingLine(quorl::simulator::recordingLine(*event));
  if (!again || !(*again == *event)) std::abort();
  return 0;
}
