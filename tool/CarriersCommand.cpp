#include <chrono>
#include <cstdint>
#include <iostream>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "Commands.h"
#include "Documents.h"
#include "JsonLine.h"
#include "Player.h"
#include "ProductRun.h"
#include "RemovedRows.h"
#include "RunDocuments.h"
#include "TextTable.h"
#include "ToolLog.h"
#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "hosts/simulator/UsableDocuments.h"
#include "shell/NotificationNames.h"
#include "telephony/CarrierNameSegmentView.h"

namespace quorl::tool {
namespace {

using simulator::SimulatedPhone;

struct CarriersOptions {
  simulator::DeviceDescription device;
  std::string chipset = "mav20";
  std::string documents;  // empty: a directory that goes with the process
  std::string telephonyScript;
  std::optional<std::int64_t> untilMs;
  std::vector<std::size_t> pressedTabs;  // counted from 1
  bool isVerbose = false;
  bool asJson = false;
};

/// The carrier bar as the shell keeps it.
class CarrierBar {
 public:
  std::vector<TabButton> tabs() const { return view_.tabButtons(); }

 private:
  std::shared_ptr<HorvaneViewModel> root_ = std::make_shared<HorvaneViewModel>();
  CarrierNameSegmentView view_{root_};
  NotificationCenter::Observation observation_ = NotificationCenter::defaultCenter().observe(
      notification::kCarrierUpdate,
      [this](const Notification& update) { updateFromCarrierNotification(update, root_.get()); });
};

void printTables(const CarrierBar& bar) {
  const HardwareManager& hardware = HardwareManager::shared();
  TextTable records({"Slot", "Carrier", "SIM", "Subscription", "Cell rows", "Active bands", "Supported bands"});
  for (const CarrierInfoObject& record : hardware.carriers())
    records.add({std::to_string(record.simSlot), record.carrierName, record.isSimPresent ? "yes" : "no",
                 std::to_string(subsIdForSlot(record.simSlot)), std::to_string(record.cellInfo.size()),
                 std::to_string(record.activeBands.size()), std::to_string(record.supportedBands.size())});
  records.print(std::cout);
  std::cout << '\n';
  TextTable tabs({"Tab", "Title", "Selected"});
  for (const TabButton& tab : bar.tabs())
    tabs.add({std::to_string(tab.selectedIndex() + 1), tab.title(), tab.isSelected() ? "yes" : ""});
  tabs.print(std::cout);
  std::cout << "\nCurrent subscription: " << hardware.currentSubsId() << '\n';
}

void printJson(const CarrierBar& bar) {
  const HardwareManager& hardware = HardwareManager::shared();
  for (const CarrierInfoObject& record : hardware.carriers())
    std::cout << jsonLine({{"slot", record.simSlot},
                           {"carrier", record.carrierName},
                           {"simPresent", record.isSimPresent},
                           {"subscription", subsIdForSlot(record.simSlot)},
                           {"cellRows", record.cellInfo.size()},
                           {"activeBands", record.activeBands.size()},
                           {"supportedBands", record.supportedBands.size()}})
              << '\n';
  for (const TabButton& tab : bar.tabs())
    std::cout << jsonLine({{"tab", tab.selectedIndex() + 1}, {"title", tab.title()}, {"selected", tab.isSelected()}})
              << '\n';
  std::cout << jsonLine({{"currentSubscription", hardware.currentSubsId()}}) << '\n';
}

/// Presses the tabs one after the other, each in the bar as it then is.
bool press(const CarrierBar& bar, SimulatedPhone& phone, const std::vector<std::size_t>& tabs) {
  for (const std::size_t number : tabs) {
    std::vector<TabButton> buttons = bar.tabs();
    if (number < 1 || number > buttons.size()) {
      complain(fmt::format("there is no tab {}, the bar has {}", number, buttons.size()));
      return false;
    }
    buttons[number - 1].press();
    phone.runUntilAtRest();
  }
  return true;
}

int showCarriers(const CarriersOptions& options) {
  std::size_t faults = 0;
  auto steps = readScript(options.telephonyScript, faults);
  if (!steps) return kFailure;
  const auto made = RunDocuments::make(options.documents);
  const auto prepared = made ? simulator::prepareDocuments((*made)->path()) : tl::unexpected(made.error());
  if (!prepared) {
    complain(prepared.error());
    return kFailure;
  }
  RunDocuments& documents = **made;
  const RemovedRows removed(documents.path());

  // As the product, they live until the process ends.
  const auto log = installToolLog(options.isVerbose);
  SimulatedPhone::Options description{options.device, documents.path(),
                                      simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY)};
  description.isConsoleShown = options.isVerbose;
  static auto* phone = new SimulatedPhone(std::move(description));
  static const auto* bar = new CarrierBar;
  ProductRun product(*phone);
  Player player(*phone, *std::move(steps));
  product.launch([&player] { player.goTo(std::chrono::milliseconds(0)); });
  documents.settled();
  player.goTo(options.untilMs ? std::chrono::milliseconds(*options.untilMs) : std::chrono::milliseconds::max());
  const bool isPressed = press(*bar, *phone, options.pressedTabs);
  if (isPressed) options.asJson ? printJson(*bar) : printTables(*bar);
  product.terminate();
  removed.tell();
  const std::string lost = log->report();
  if (!lost.empty()) complain(lost);

  const auto folded = documents.isNamed() ? foldWriteAheadLog(documents.path()) : tl::expected<void, std::string>();
  if (!folded) complain(folded.error());
  return faults == 0 && isPressed && lost.empty() && folded ? kSuccess : kFailure;
}

}  // namespace

void addCarriers(CommandLine& tool) {
  Command command = tool.addCommand("carriers", "Play a telephony script and show the carriers and their tabs");
  command.setFooter(
      "Starts the product on a simulated phone, plays the script, and shows the record of each slot, the tabs of the\n"
      "carrier bar, and the subscription that the screens show. Without --documents nothing is kept.");
  auto options = std::make_shared<CarriersOptions>();
  command.addOption("--telephony", options->telephonyScript, "Telephony script to play").required().notEmpty();
  command.addOption("--until-ms", options->untilMs, "Stop after the events of this time; all of them if left out")
      .wholeWithin(0, std::numeric_limits<std::int64_t>::max());
  command.addOption("--press", options->pressedTabs, "Press this tab at the end, counted from 1; may be repeated")
      .wholeWithin(1, std::numeric_limits<std::size_t>::max());
  command
      .addOption(
          "--documents", options->documents,
          "Directory for the database; made if it is missing, and its rows of thirty days ago and older are removed")
      .notEmpty();
  command.addOption("--chipset", options->chipset, "Baseband chipset; \"mav\" or \"ice\" in it selects the family")
      .showDefault();
  command.addFlag("--internal-build", options->device.isInternalBuild, "Be an internal build, which has band rows");
  command.addFlag("--carrier-build", options->device.isCarrierBuild, "Be a carrier build, which has band rows");
  command.addFlag("--json", options->asJson, "One JSON object a line");
  command.addFlag("--verbose", options->isVerbose, "Show the log on standard error");
  command.setAction([options] {
    options->device.chipset = options->chipset;
    return showCarriers(*options);
  });
}

}  // namespace quorl::tool
