#pragma once

#include <memory>

#include "hosts/simulator/FailedRows.h"

namespace quorl::tool {

/// Directs the log of a tool run to standard error if `isVerbose`, else nowhere. Answers what counts the rows that
/// could not be stored from now on.
std::shared_ptr<simulator::FailedRows> installToolLog(bool isVerbose);

}  // namespace quorl::tool
