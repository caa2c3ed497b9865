#include "hosts/desktop/SimulatedDesktop.h"

#include <utility>

#include "hosts/desktop/QtQueue.h"
#include "screens/export/view/SaveText.h"

namespace quorl::desktop {
namespace {

simulator::SondrelSimulator::Options captureOptions(const std::filesystem::path& documents) {
  simulator::SondrelSimulator::Options options;
  options.folder = documents / "Sondrel";
  return options;
}

}  // namespace

SimulatedDesktop::SimulatedDesktop(simulator::DeviceDescription device, const std::filesystem::path& documents,
                                   PlayedRadio::Programme programme)
    : activity_(std::make_shared<simulator::Activity>([] {})),
      queues_(activity_),
      mainQueue_(std::make_shared<QtQueue>("main"), activity_),
      backgroundQueue_(queues_.makeSerialQueue("background")),
      device_(std::move(device)),
      resourceFolders_(simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY)),
      resources_(resourceFolders_),
      documents_(documents),
      strings_(resourceFolders_),
      console_(/*isShown=*/false),
      telephony_(queues_),
      sondrel_(captureOptions(documents), mainQueue_, queues_, clock_),
      radio_(std::move(programme), {baseband_, telephony_, mainQueue_, clock_}),
      platform_{mainQueue_,  *backgroundQueue_, queues_,    clock_,   device_,    resources_,
                documents_,  strings_,          console_,   alerts_,  analytics_, view::SaveText::shared(),
                pasteboard_, baseband_,         telephony_, &sondrel_} {
  Platform::install(&platform_);
}

SimulatedDesktop::~SimulatedDesktop() {
  Platform::install(nullptr);
}

void SimulatedDesktop::deliver(const simulator::RecordedEvent& event) {
  baseband_.deliver(zelkor::kEventMetric, event.message());
}

}  // namespace quorl::desktop
