#include "hosts/desktop/RecordPipe.h"

#include <cerrno>
#include <system_error>

#include <fcntl.h>

namespace quorl::desktop {
namespace {

constexpr std::chrono::milliseconds kNextTry{50};

}  // namespace

simulator::Descriptor awaitReader(const std::filesystem::path& file, const QuitOnSignal& quitting) {
  std::error_code ignored;
  while (std::filesystem::is_fifo(file, ignored)) {
    simulator::Descriptor pipe(::open(file.c_str(), O_WRONLY | O_NONBLOCK | O_CLOEXEC));
    // Any other error comes again, and is told, when the recording begins.
    if (!pipe.isOpen() && errno != ENXIO) return pipe;
    // As a second reader.
    if (pipe.isOpen()) return simulator::Descriptor(::open(file.c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC));
    if (quitting.isAsked(kNextTry)) break;
  }
  return simulator::Descriptor();
}

}  // namespace quorl::desktop
