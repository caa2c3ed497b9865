#pragma once

#include <string_view>

#include "CommandLine.h"

// The subcommands of quorl-tool, one file each. Every function adds one to `tool`.

namespace quorl::tool {

inline constexpr int kSuccess = 0;
inline constexpr int kFailure = 1;   // something could not be done, or not for all of the input
inline constexpr int kWrongUse = 2;  // nothing was tried

/// Tells the user what is wrong: one line on standard error, without control characters.
void complain(std::string_view text);

void addDecode(CommandLine& tool);
void addEncode(CommandLine& tool);
void addCatalogue(CommandLine& tool);
void addReplay(CommandLine& tool);
void addCarriers(CommandLine& tool);
void addSchema(CommandLine& tool);
void addSummary(CommandLine& tool);
void addMakeRecording(CommandLine& tool);
void addSimulate(CommandLine& tool);

// On a database that replay made, by what the screens compute.
void addMetrics(CommandLine& tool);
void addShow(CommandLine& tool);
void addDashboard(CommandLine& tool);
void addPin(CommandLine& tool);
void addUnpin(CommandLine& tool);
void addHistory(CommandLine& tool);
void addExport(CommandLine& tool);

}  // namespace quorl::tool
