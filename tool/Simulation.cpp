#include "Simulation.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <thread>
#include <utility>

#include "ProductRun.h"
#include "RowCounter.h"
#include "ToolLog.h"
#include "hosts/simulator/EpochTime.h"
#include "hosts/simulator/RecordingWriter.h"
#include "hosts/simulator/SimulatedPhone.h"
#include "hosts/simulator/UsableDocuments.h"

namespace quorl::tool {
namespace {

using simulator::LiveScenario;
using simulator::RecordingWriter;
using std::chrono::milliseconds;
using SteadyTime = std::chrono::steady_clock::time_point;

constexpr milliseconds kPortion{1000};

double secondsSince(SteadyTime start) {
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

/// Calls `pass` with one portion of `length` after the other, and tells how far it has come.
template <typename Pass>
void inPortions(milliseconds length, const Progress& progress, Pass pass) {
  for (milliseconds done{0}; done < length;) {
    const milliseconds portion = std::min(kPortion, length - done);
    pass(portion);
    done += portion;
    if (progress) progress(static_cast<double>(done.count()) / static_cast<double>(length.count()));
  }
}

}  // namespace

tl::expected<RecordedScenario, std::string> recordScenario(simulator::ScenarioChoice choice, Date start,
                                                           milliseconds length, const std::filesystem::path& file,
                                                           const Progress& progress) {
  auto writer = RecordingWriter::open(file);
  if (!writer) return tl::unexpected(std::move(writer.error()));
  const auto begin = std::chrono::steady_clock::now();
  simulator::ScenarioRun run(std::move(choice), simulator::millisecondsSince1970(start));
  inPortions(length, progress, [&](milliseconds portion) {
    run.advance(portion, [&writer](const simulator::RecordedEvent& event) { writer->write(event); });
  });
  const std::uint64_t events = writer->events();
  if (auto closed = writer->close(); !closed) return tl::unexpected(std::move(closed.error()));
  return RecordedScenario{events, secondsSince(begin)};
}

/// The product has no tear-down: what is made here lives until the process ends.
class SimulatedProduct::Phone {
 public:
  Phone(std::string chipset, const std::filesystem::path& documents, bool isVerbose)
      : phone({{std::move(chipset), std::nullopt, false, false, {}},
               documents,
               simulator::ResourceDirectories::ofThisProgram(QUORL_RESOURCE_DIRECTORY),
               isVerbose}) {}

  simulator::SimulatedPhone phone;
};

SimulatedProduct::SimulatedProduct(std::string chipset, std::filesystem::path documents, bool isVerbose)
    : phone_(*new Phone(std::move(chipset), documents, isVerbose)),
      documents_(std::move(documents)),
      isVerbose_(isVerbose) {}

tl::expected<MadeHistory, std::string> SimulatedProduct::makeHistory(
    const simulator::HistoryPlan& plan, const std::function<void(const simulator::HistoryProgress&)>& progress) {
  installToolLog(isVerbose_);
  const auto begin = std::chrono::steady_clock::now();
  auto made = simulator::writeHistory(simulator::databaseFile(documents_), plan, progress);
  installLogSink(nullptr);
  if (!made) return tl::unexpected(std::move(made.error()));
  return MadeHistory{made->sessionsDone, made->events, made->rows, secondsSince(begin)};
}

tl::expected<LivedScenario, std::string> SimulatedProduct::live(LiveScenario::Options options, milliseconds length,
                                                                bool isPaced, const Progress& progress) {
  const double speed = options.speed;
  const std::optional<std::filesystem::path> recording = options.recording;
  simulator::SimulatedPhone& phone = phone_.phone;
  auto scenario = phone.live(std::move(options));
  if (!scenario) return tl::unexpected(std::move(scenario.error()));
  const auto log = installToolLog(isVerbose_);
  const auto begin = std::chrono::steady_clock::now();
  ProductRun product(phone);
  static const auto* rows = new RowCounter;
  product.launch([&scenario] { (*scenario)->advance(milliseconds(1)); });
  milliseconds passed{0};
  inPortions(length, progress, [&](milliseconds portion) {
    if (isPaced) {
      const std::chrono::duration<double, std::milli> due(static_cast<double>(passed.count()) / speed);
      std::this_thread::sleep_until(begin + std::chrono::duration_cast<std::chrono::steady_clock::duration>(due));
    }
    (*scenario)->advance(portion);
    phone.runUntilAtRest();
    passed += portion;
  });
  std::optional<RecordingWriter::Outcome> recorded;
  product.terminate([&] {
    (*scenario)->finishRecording([&recorded](const RecordingWriter::Outcome& outcome) { recorded = outcome; });
  });
  std::string recordingFault;
  if (recording && recorded && !*recorded) recordingFault = recording->string() + ": " + recorded->error();
  return LivedScenario{(*scenario)->events(), rows->count(), log->count(),
                       secondsSince(begin),   log->report(), std::move(recordingFault)};
}

}  // namespace quorl::tool
