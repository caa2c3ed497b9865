#pragma once

#include <cstddef>

namespace quorl::bench {

/// Memory of the process in bytes, as the system counts it: all pages that are present, shared ones included.
std::size_t memory();

/// The most that this was, since the process began or since `resetMostMemory`.
std::size_t mostMemory();

/// Gives freed memory back to the system, and begins `mostMemory` anew.
void resetMostMemory();

}  // namespace quorl::bench
