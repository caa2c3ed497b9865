#pragma once

#include <vector>

#include "hosts/simulator/network/Cell.h"
#include "messages/MessageRef.h"
#include "messages/classes/lte_statistics.h"

namespace quorl::simulator::metrics {

/// The carriers of a connection, the primary one first: only that one sends.
MessageRef<BandCombo> combination(const std::vector<const network::Cell*>& cells);

}  // namespace quorl::simulator::metrics
