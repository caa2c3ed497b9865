#pragma once

#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/nr_cell.h"

namespace quorl::simulator::metrics {

/// One beam of an NR cell at its level. What else a beam report holds is the serving cell's, if it is that cell.
MessageRef<ServingCellBeamInfo> beamFields(const Moment& moment, const network::Cell& cell, std::uint8_t beam,
                                           network::Centi power);

}  // namespace quorl::simulator::metrics
