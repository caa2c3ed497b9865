#pragma once

#include <cstddef>
#include <cstdint>

#include "base/SharedBytes.h"

namespace quorl::simulator::metrics {

/// A payload with something wrong in it: cut off, turned bits, a wire type that does not exist, a length that runs
/// over the end, a group that never ends, or octets of no meaning at all. Which one follows from `number`, the rest
/// from `salt`.
ByteString damaged(const ByteString& payload, std::uint64_t salt, std::uint32_t number);

/// The payload with a field of `bytes` octets behind it that no class knows. It can be read.
ByteString inflated(const ByteString& payload, std::size_t bytes);

}  // namespace quorl::simulator::metrics
