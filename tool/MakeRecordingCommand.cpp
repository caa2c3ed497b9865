#include <cstdint>
#include <fstream>
#include <limits>
#include <memory>
#include <string>

#include <fmt/format.h>

#include "Commands.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/UsableDocuments.h"
#include "recording/RecordingMaker.h"

namespace quorl::tool {
namespace {

struct MakeRecordingOptions {
  std::string family;
  std::string output;
  std::uint64_t seed = 1;
};

int writeRecording(const MakeRecordingOptions& options) {
  if (const auto spared = simulator::spareDatabase(options.output, {}); !spared) {
    complain(spared.error());
    return kWrongUse;
  }
  std::ofstream output(options.output, std::ios::binary);
  const BasebandFamily family = options.family == "ice" ? BasebandFamily::Ice : BasebandFamily::Mav;
  for (const simulator::RecordedEvent& event : makeRecording(family, options.seed))
    output << simulator::recordingLine(event) << '\n';
  if (output.flush()) return kSuccess;
  complain(fmt::format("{}: cannot be written", options.output));
  return kFailure;
}

}  // namespace

void addMakeRecording(CommandLine& tool) {
  Command command = tool.addCommand("make-recording", "Make a recording of invented events");
  command.setFooter(
      "The recordings that ship with the project are made by it. The same seed gives the same recording.");
  command.hide();  // of no use but to the project itself
  auto options = std::make_shared<MakeRecordingOptions>();
  command.addOption("--family", options->family, "Baseband family").required().oneOf({"mav", "ice"});
  command.addOption("--seed", options->seed, "Where the invention starts")
      .wholeWithin(0, std::numeric_limits<std::uint64_t>::max())
      .showDefault();
  command.addOption("--output", options->output, "File to write").required().notEmpty();
  command.setAction([options] { return writeRecording(*options); });
}

}  // namespace quorl::tool
