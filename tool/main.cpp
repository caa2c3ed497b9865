#include <clocale>
#include <iostream>
#include <string>
#include <string_view>

#include <fmt/format.h>

#include "Commands.h"

namespace {

/// The first line of what the parser says; nobody needs its hint at --help a second time.
std::string oneLine(const std::string& text) {
  return text.substr(0, text.find('\n'));
}

/// What is wrong with the command line, in one line.
std::string faultText(const CLI::App& tool, const CLI::ParseError& error, int argc, char** argv) {
  // The parser misses a subcommand before it looks at what stands in its place.
  const std::string_view first = argc > 1 ? argv[1] : "";
  if (tool.get_subcommands().empty() && !first.empty() && !first.starts_with('-'))
    return fmt::format("there is no subcommand \"{}\"", first);
  return oneLine(error.what());
}

}  // namespace

int main(int argc, char** argv) {
  using namespace quorl::tool;
  std::setlocale(LC_ALL, "");
  std::ios::sync_with_stdio(false);
  std::cin.tie(nullptr);

  CLI::App tool("Decodes cellular metrics, and runs the diagnostics monitor without a phone and without a screen.",
                "quorl-tool");
  tool.require_subcommand(1);
  Action chosen;
  addReplay(tool, chosen);
  addSimulate(tool, chosen);
  addCarriers(tool, chosen);
  addSummary(tool, chosen);
  addMetrics(tool, chosen);
  addShow(tool, chosen);
  addDashboard(tool, chosen);
  addPin(tool, chosen);
  addUnpin(tool, chosen);
  addHistory(tool, chosen);
  addExport(tool, chosen);
  addDecode(tool, chosen);
  addEncode(tool, chosen);
  addCatalogue(tool, chosen);
  addSchema(tool, chosen);
  addMakeRecording(tool, chosen);

  try {
    tool.parse(argc, argv);
  } catch (const CLI::CallForHelp&) {
    std::cout << tool.help();
    return kSuccess;
  } catch (const CLI::ParseError& error) {
    complain(faultText(tool, error, argc, argv) + " (see quorl-tool --help)");
    return kWrongUse;
  }

  const int exitCode = chosen();
  std::cout.flush();
  if (!std::cout) {
    complain("standard output cannot be written");
    return kFailure;
  }
  return exitCode;
}
