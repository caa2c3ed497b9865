// One metric end to end: delivered at the baseband channel, decoded, flattened, and every row of it reported as stored,
// beside a bare loop that inserts as many rows with the same statement, in the same run. On /dev/shm, so that the disk
// does not hide what the product adds. At the end the ratio of the medians is printed.

#include <cstdint>
#include <cstdlib>
#include <memory>

#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <sqlite3.h>

#include "Medians.h"
#include "StoreBench.h"
#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "intake/ZelkorWrapper.h"
#include "messages/classes/nas_context.h"
#include "messages/wire/WireWriter.h"
#include "shell/NotificationNames.h"
#include "store/MetricStatements.h"
#include "store/PersistanceStore.h"
#include "support/MetricEvent.h"
#include "support/TemporaryDirectory.h"

namespace quorl {
namespace {

constexpr std::int64_t kNasMetricId = 3986700;
constexpr int kRepetitions = 21;

/// The store of an Ice phone.
struct Site {
  Site() {
    phone.fake.properties.texts["BasebandChipset"] = "ice";
    phone.fake.documents.directory = directory.path();
    store = std::make_unique<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
  }

  bench::Phone phone;
  const test::TemporaryDirectory directory{"/dev/shm"};
  std::unique_ptr<PersistanceStore> store;
};

ByteString nasPayload() {
  KCellularEmmContext message;
  message.setTimestamp(1700000000123);
  message.setRegStatus(0);
  message.setUpdateStatus(0);
  message.setUeOpMode(2);
  message.setRegProc(1);
  message.setT3412DurS(3240);
  message.setIsImsVoiceSupported(true);
  message.setSubsId(0);
  message.setIsEmergBearerSupported(true);
  WireWriter writer;
  message.writeTo(writer);
  return ByteString(writer.bytes());
}

constexpr int kRowsOfMetric = 9;

void endToEnd(benchmark::State& state, bench::Phone& phone) {
  const zelkor::KeyValueMessage event = test::metricEvent(kNasMetricId, nasPayload());
  int left = 0;
  const auto observation =
      NotificationCenter::defaultCenter().observe(notification::kNewZelkorMetric, [&](const auto&) {
        if (--left == 0) phone.main.stop();
      });
  for ([[maybe_unused]] auto _ : state) {
    left = kRowsOfMetric;
    phone.fake.zelkor.deliver(zelkor::kEventMetric, event);
    phone.main.run();
  }
}

void bareLoop(benchmark::State& state, sqlite3* database) {
  for ([[maybe_unused]] auto _ : state) {
    for (int i = 0; i < kRowsOfMetric; ++i) {
      sqlite3_stmt* statement = nullptr;
      sqlite3_prepare_v2(database, SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
      bench::bindShortRow(statement);
      if (sqlite3_step(statement) != SQLITE_DONE) std::abort();
      sqlite3_finalize(statement);
    }
  }
}

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  quorl::Site site;
  const auto add = [](const char* name, auto body) {
    benchmark::RegisterBenchmark(name, body)
        ->Unit(benchmark::kMicrosecond)
        ->UseRealTime()
        ->Iterations(200)
        ->Repetitions(quorl::kRepetitions)
        ->ReportAggregatesOnly();
  };
  add("metric/store", [&](benchmark::State& state) { quorl::endToEnd(state, site.phone); });
  add("metric/bare", [&](benchmark::State& state) { quorl::bareLoop(state, site.store->database().dbPointer()); });
  quorl::bench::MedianReporter reporter("store", "bare");
  benchmark::RunSpecifiedBenchmarks(&reporter);
  if (const auto ratio = reporter.ratio("metric"))
    fmt::print("\nratio of medians, one metric end to end to a bare loop over its rows\n  {:.2f}\n", ratio->real);
  return 0;
}
