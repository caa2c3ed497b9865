#pragma once

#include <functional>
#include <string_view>

#include <CLI/CLI.hpp>

// The subcommands of quorl-tool, one file each. Every function adds one to `tool`; when the user chooses it, `chosen`
// becomes what is to be done, which answers the exit code.

namespace quorl::tool {

using Action = std::function<int()>;

inline constexpr int kSuccess = 0;
inline constexpr int kFailure = 1;   // something could not be done, or not for all of the input
inline constexpr int kWrongUse = 2;  // nothing was tried

/// Tells the user what is wrong: one line on standard error.
void complain(std::string_view text);

void addDecode(CLI::App& tool, Action& chosen);
void addEncode(CLI::App& tool, Action& chosen);
void addCatalogue(CLI::App& tool, Action& chosen);
void addReplay(CLI::App& tool, Action& chosen);
void addCarriers(CLI::App& tool, Action& chosen);
void addSchema(CLI::App& tool, Action& chosen);
void addSummary(CLI::App& tool, Action& chosen);
void addMakeRecording(CLI::App& tool, Action& chosen);
void addSimulate(CLI::App& tool, Action& chosen);

// On a database that replay made, by what the screens compute.
void addMetrics(CLI::App& tool, Action& chosen);
void addShow(CLI::App& tool, Action& chosen);
void addDashboard(CLI::App& tool, Action& chosen);
void addPin(CLI::App& tool, Action& chosen);
void addUnpin(CLI::App& tool, Action& chosen);
void addHistory(CLI::App& tool, Action& chosen);
void addExport(CLI::App& tool, Action& chosen);

}  // namespace quorl::tool
