// One metric end to end: delivered at the baseband channel, decoded, flattened, and every row of it reported as stored,
// beside a bare loop that inserts as many rows with the same statement, in the same run. On /dev/shm, so that the disk
// does not hide what the product adds. At the end the ratio of the medians is printed.

#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>

#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <sqlite3.h>

#include "StoreBench.h"
#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "base/SerialQueue.h"
#include "intake/ZelkorWrapper.h"
#include "messages/classes/nas_context.h"
#include "messages/wire/WireWriter.h"
#include "shell/NotificationNames.h"
#include "store/MetricStatements.h"
#include "store/PersistanceStore.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

constexpr std::int64_t kNasMetricId = 3986700;
constexpr int kRepetitions = 21;

/// An Ice phone with real queues whose main queue is the bench's thread.
struct Phone {
  Phone() {
    fake.properties.texts["BasebandChipset"] = "ice";
    directory = std::filesystem::path("/dev/shm") / ("quorl-bench-" + Uuid::make().string());
    std::filesystem::create_directory(directory);
    fake.documents.directory = directory;
    Platform::install(&platform);
    store = std::make_unique<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
  }
  ~Phone() {
    store.reset();
    std::filesystem::remove_all(directory);
  }

  test::FakePlatform fake;
  ThreadQueueFactory queues;
  LoopQueue main{"main"};
  Platform platform{main,           main,           queues,          fake.time,    fake.properties,
                    fake.resources, fake.documents, fake.strings,    fake.console, fake.alerts,
                    fake.analytics, fake.share,     fake.pasteboard, fake.zelkor,  fake.silentTelephony};
  std::filesystem::path directory;
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

void endToEnd(benchmark::State& state, Phone& phone) {
  zelkor::KeyValueMessage event;
  event.set(zelkor::kKeyMetricID, kNasMetricId);
  event.set(zelkor::kKeyPayload, nasPayload());
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

void bareLoop(benchmark::State& state, Phone& phone) {
  sqlite3* const database = phone.store->database().dbPointer();
  for ([[maybe_unused]] auto _ : state) {
    for (int i = 0; i < kRowsOfMetric; ++i) {
      sqlite3_stmt* statement = nullptr;
      sqlite3_prepare_v2(database, SQLTable<Metric>::insertMetric, -1, &statement, nullptr);
      for (const int index : {1, 2, 3, 4, 5, 7}) sqlite3_bind_text(statement, index, "is_ims_voice", -1, SQLITE_STATIC);
      sqlite3_bind_int(statement, 6, 0);
      sqlite3_bind_int(statement, 8, 0);
      sqlite3_bind_text(statement, 9, "2026-01-05 09:30:12", -1, SQLITE_STATIC);
      if (sqlite3_step(statement) != SQLITE_DONE) std::abort();
      sqlite3_finalize(statement);
    }
  }
}

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  quorl::Phone phone;
  const auto add = [](const char* name, auto body) {
    benchmark::RegisterBenchmark(name, body)
        ->Unit(benchmark::kMicrosecond)
        ->UseRealTime()
        ->Iterations(200)
        ->Repetitions(quorl::kRepetitions)
        ->ReportAggregatesOnly();
  };
  add("metric/store", [&](benchmark::State& state) { quorl::endToEnd(state, phone); });
  add("metric/bare", [&](benchmark::State& state) { quorl::bareLoop(state, phone); });
  quorl::bench::MedianReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  if (const auto ratio = reporter.ratio("metric"))
    fmt::print("\nratio of medians, one metric end to end to a bare loop over its rows\n  {:.2f}\n", ratio->real);
  return 0;
}
