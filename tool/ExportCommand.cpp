#include <iostream>
#include <memory>
#include <optional>
#include <string>

#include <fmt/format.h>

#include "Commands.h"
#include "OutputFile.h"
#include "StoreSession.h"
#include "TimeFrameOption.h"
#include "hosts/simulator/UsableDocuments.h"
#include "screens/export/ExportViewController.h"

namespace quorl::tool {
namespace {

struct ExportOptions {
  StoreOptions store;
  std::string timeFrame;
  std::string output;  // empty: standard output
};

int exportRows(StoreSession& session, const ExportOptions& options) {
  const auto screen = ExportViewController::make(session.store());
  for (ExportView& row : screen->containerView())
    if (row.timeFrame() == timeFrameNamed(options.timeFrame)) row.didTapExportButton();
  session.settle();
  const std::optional<std::string>& text = session.phone().share().text();
  if (!text) {
    complain("the rows cannot be read (see --verbose)");
    return kFailure;
  }
  if (options.output.empty()) {
    std::cout.write(text->data(), static_cast<std::streamsize>(text->size()));
    return kSuccess;
  }
  if (const auto written = writeWholeFile(options.output, *text); !written) {
    complain(fmt::format("{}: {}", options.output, written.error()));
    return kFailure;
  }
  return kSuccess;
}

}  // namespace

void addExport(CommandLine& tool) {
  Command command =
      tool.addCommand("export", "Print all stored rows of a time frame, as the export screen shares them");
  command.setFooter("The text has no line break, not even at its end, and mixes both subscriptions.");
  auto options = std::make_shared<ExportOptions>();
  addTimeFrameOption(command, options->timeFrame);
  command.addOption("--output", options->output, "File to write to instead of standard output").notEmpty();
  addStoreOptions(command, options->store, /*isTable=*/false);
  command.setAction([options] {
    if (!options->output.empty()) {
      if (const auto spared = simulator::spareDatabase(options->output, options->store.documents); !spared) {
        complain(spared.error());
        return kWrongUse;
      }
    }
    return withStore(options->store, [&](StoreSession& session) { return exportRows(session, *options); });
  });
}

}  // namespace quorl::tool
