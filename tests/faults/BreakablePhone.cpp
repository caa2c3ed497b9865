#include "faults/BreakablePhone.h"

#include <cstdio>
#include <fstream>
#include <iterator>
#include <utility>

#include <sqlite3.h>

#include "hosts/simulator/EpochTime.h"
#include "shell/NotificationNames.h"
#include "store/MetricStatements.h"
#include "store/PersistanceStore.h"

namespace quorl::test {

std::size_t ErrorLines::countContaining(std::string_view part) const {
  std::size_t lines = 0;
  for (const auto& [text, count] : counts_)
    if (text.find(part) != std::string::npos) lines += count;
  return lines;
}

BreakablePhone::BreakablePhone(HorvaneClientFactory* telephony)
    : host(telephony),
      capture({.folder = host.directory.path() / "Sondrel"}, *host.mainQueue, host.time, host.time),
      platform_{*host.mainQueue,
                *host.backgroundQueue,
                host.time,
                host.time,
                host.properties,
                resources,
                host.documents,
                host.strings,
                host.console,
                host.alerts,
                host.analytics,
                host.share,
                host.pasteboard,
                library,
                host.platform.telephony,
                &capture},
      previousLog_(installLogSink(errors)) {
  host.properties.texts["BasebandChipset"] = "ice15";
  host.properties.classes = {"Sondrel"};
  Platform::install(&platform_);
}

BreakablePhone::~BreakablePhone() {
  ends();
  installLogSink(previousLog_);
}

void BreakablePhone::launch() {
  observation_ =
      NotificationCenter::defaultCenter().observe(notification::kNewZelkorMetric, [this](const Notification& /*news*/) {
        EXPECT_TRUE(host.mainQueue->isCurrent());
        ++reportedRows;
      });
  application = std::make_unique<AppDelegate>();
  ApplicationLoop(*application).launch();
  sqlite3_exec(store().database().dbPointer(), "PRAGMA synchronous=OFF", nullptr, nullptr, nullptr);
  host.time.settle();
}

void BreakablePhone::showsDashboard() {
  metricsArrive(1);
  for (const char* attribute : {"timestamp", "reg_status"})
    store().executeDashboardStatement(SQLTable<Metric>::pinAttribute("LTE", attribute, 0),
                                      [](bool success, const auto& /*error*/) { EXPECT_TRUE(success); });
  screens().viewDidLoad();
  host.time.settle();
}

void BreakablePhone::ends() {
  application.reset();
  // What still waits belongs to objects that are gone.
  host.time.settle();
  observation_ = {};
  resetSharedObjects();
}

void BreakablePhone::becomesActive() {
  ApplicationLoop(*application).becomeActive();
  host.time.settle();
}

void BreakablePhone::metricArrives(const zelkor::KeyValueMessage& event) {
  EXPECT_TRUE(deliver(event)) << "the product does not listen";
  host.time.settle();
}

void BreakablePhone::metricsArrive(std::size_t count, std::chrono::milliseconds step) {
  for (std::size_t i = 0; i < count; ++i) {
    passes(step);
    metricArrives(nasEvent(simulator::millisecondsSince1970(host.time.now())));
  }
}

std::size_t BreakablePhone::storedRows() const {
  return static_cast<std::size_t>(
      std::stoul(RawDatabase(file()).column("SELECT count(*) FROM Metric WHERE metric_id = '3986700'").at(0)));
}

void figure(std::string_view what, std::size_t value) {
  std::printf("    %.*s: %zu\n", static_cast<int>(what.size()), what.data(), value);
}

std::string contentOf(const std::filesystem::path& file) {
  std::ifstream stream(file, std::ios::binary);
  return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

}  // namespace quorl::test
