#pragma once

#include <filesystem>

#include "hosts/desktop/QuitOnSignal.h"
#include "hosts/simulator/Descriptor.h"

namespace quorl::desktop {

/// Waits until somebody reads a named pipe that is to be written, or until the process is asked to end: opening the
/// pipe would wait as well, deaf to that. While the answer lives, it does not, even if the reader has gone. None for
/// any other file.
simulator::Descriptor awaitReader(const std::filesystem::path& file, const QuitOnSignal& quitting);

}  // namespace quorl::desktop
