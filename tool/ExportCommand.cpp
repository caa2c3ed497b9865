#include <cerrno>
#include <iostream>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>

#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

#include "Commands.h"
#include "StoreSession.h"
#include "TimeFrameOption.h"
#include "screens/export/ExportViewController.h"

namespace quorl::tool {
namespace {

struct ExportOptions {
  StoreOptions store;
  std::string timeFrame;
  std::string output;  // empty: standard output
};

bool writeAll(int file, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = write(file, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return false;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return true;
}

/// Rows hold cell identities, so a new file is for its owner alone.
int writeFile(const std::string& path, std::string_view text) {
  const int file = open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
  bool isWritten = file >= 0 && writeAll(file, text);
  int error = errno;
  if (file >= 0 && close(file) != 0 && isWritten) {
    isWritten = false;
    error = errno;
  }
  if (isWritten) return kSuccess;
  complain(fmt::format("{}: {}", path, std::generic_category().message(error)));
  return kFailure;
}

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
  if (!options.output.empty()) return writeFile(options.output, *text);
  std::cout.write(text->data(), static_cast<std::streamsize>(text->size()));
  return kSuccess;
}

}  // namespace

void addExport(CommandLine& tool) {
  Command command =
      tool.addCommand("export", "Print all stored rows of a time frame, as the export screen shares them");
  command.setFooter("The text has no line break, not even at its end, and mixes both subscriptions.");
  auto options = std::make_shared<ExportOptions>();
  addTimeFrameOption(command, options->timeFrame);
  command.addOption("--output", options->output, "File to write to instead of standard output");
  addStoreOptions(command, options->store, /*isTable=*/false);
  command.setAction([options] {
    return withStore(options->store, [&](StoreSession& session) { return exportRows(session, *options); });
  });
}

}  // namespace quorl::tool
