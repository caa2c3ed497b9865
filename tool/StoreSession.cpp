#include "StoreSession.h"

#include <utility>

#include "Documents.h"
#include "RemovedRows.h"
#include "ToolLog.h"
#include "app/HardwareManager.h"
#include "hosts/simulator/UsableDocuments.h"
#include "intake/ZelkorWrapper.h"

namespace quorl::tool {
namespace {

simulator::SimulatedPhone::Options phoneOptions(const StoreOptions& options, std::string chipset) {
  simulator::SimulatedPhone::Options phone;
  phone.device.chipset = std::move(chipset);
  phone.device.isInternalBuild = options.isInternalBuild;
  phone.device.isCarrierBuild = options.isCarrierBuild;
  phone.documents = options.documents;
  phone.resources = simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY);
  phone.isConsoleShown = options.isVerbose;
  return phone;
}

}  // namespace

void addStoreOptions(Command& command, StoreOptions& options, bool isTable) {
  command
      .addOption("--documents", options.documents,
                 "Documents directory that replay filled; its rows of thirty days ago and older are removed")
      .required()
      .notEmpty();
  command.addOption("--subscription", options.subscription, "Subscription to look at; 0 if not given").oneOf({0, 1});
  command.addOption("--chipset", options.chipset, "Baseband chipset; that of the stored metrics if not given");
  command.addFlag("--internal-build", options.isInternalBuild, "Be an internal build");
  command.addFlag("--carrier-build", options.isCarrierBuild, "Be a carrier build");
  command.addFlag("--verbose", options.isVerbose, "Show the log on standard error");
  if (isTable) command.addFlag("--json", options.asJson, "Print one JSON object a line instead of a table");
}

tl::expected<StoreSession*, std::string> StoreSession::open(const StoreOptions& options) {
  auto family = basebandFamily(options.documents);
  if (!family) return tl::unexpected(std::move(family.error()));
  if (auto prepared = simulator::prepareDocuments(options.documents); !prepared)
    return tl::unexpected(prepared.error());
  RemovedRows removed(options.documents);
  installToolLog(options.isVerbose);
  auto* session = new StoreSession(options, options.chipset.empty() ? *std::move(family) : options.chipset);
  removed.tell();
  return session;
}

StoreSession::StoreSession(const StoreOptions& options, std::string chipset)
    : documents_(options.documents),
      phone_(phoneOptions(options, std::move(chipset))),
      store_(std::make_shared<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance())) {
  settle();
  HardwareManager::shared().setCurrentSubsId(options.subscription);
}

int StoreSession::finish(int exitCode) {
  settle();
  installLogSink(nullptr);
  if (const auto folded = foldWriteAheadLog(documents_); !folded) {
    complain(folded.error());
    return kFailure;
  }
  return exitCode;
}

}  // namespace quorl::tool
