#include <clocale>
#include <iostream>

#include "Commands.h"

int main(int argc, char** argv) {
  using namespace quorl::tool;
  std::setlocale(LC_ALL, "");
  std::setlocale(LC_NUMERIC, "C");  // numbers are read and written alike everywhere
  std::ios::sync_with_stdio(false);
  std::cin.tie(nullptr);

  CommandLine tool("Decodes cellular metrics, and runs the diagnostics monitor without a phone and without a screen.",
                   "quorl-tool");
  addReplay(tool);
  addSimulate(tool);
  addCarriers(tool);
  addSummary(tool);
  addMetrics(tool);
  addShow(tool);
  addDashboard(tool);
  addPin(tool);
  addUnpin(tool);
  addHistory(tool);
  addExport(tool);
  addDecode(tool);
  addEncode(tool);
  addCatalogue(tool);
  addSchema(tool);
  addMakeRecording(tool);

  const int exitCode = tool.run(argc, argv);
  std::cout.flush();
  if (!std::cout) {
    complain("standard output cannot be written");
    return kFailure;
  }
  return exitCode;
}
