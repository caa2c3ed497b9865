#include <algorithm>
#include <chrono>
#include <cstdint>
#include <filesystem>
#include <iterator>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/CatalogueClass.h"
#include "hosts/simulator/ScenarioFiles.h"
#include "hosts/simulator/ScenarioRun.h"
#include "intake/MetricGroupV2.h"
#include "intake/MetricService.h"
#include "intake/ZelkorWrapper.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"
#include "simulator/network/TestScenarios.h"
#include "support/FakePlatform.h"
#include "support/RowsOnlyStore.h"

namespace quorl::simulator {
namespace {

using metrics::Family;
using std::chrono::minutes;

constexpr std::uint64_t kStartMs = 1767605400000;  // 2026-01-05 09:30:00 UTC

const char* nameOf(Family family) {
  return family == Family::Mav ? "mav" : "ice";
}

std::vector<RecordedEvent> eventsOf(const std::string& name, Family family, std::uint64_t seed, minutes length) {
  ScenarioRun run({network::shippedScenario(name), seed, family}, kStartMs);
  std::vector<RecordedEvent> events;
  run.advance(length, [&events](RecordedEvent event) { events.push_back(std::move(event)); });
  return events;
}

/// By id, the class that decodes it. The first row of an id is meant: what its payload was made for.
std::map<std::int64_t, std::string> decodableIds(Family family) {
  std::map<std::int64_t, std::string> ids;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData())
    if (row.deviceType == nameOf(family) && makeMessage(decodingClass(row)) != nullptr)
      ids.try_emplace(row.zelkorId, decodingClass(row));
  return ids;
}

/// What an event's payload holds as the class reads it; nothing if it cannot be read whole.
std::optional<MetricDictionary> decoded(const RecordedEvent& event, const std::string& className) {
  const auto message = makeMessage(className);
  message->initWithData(event.payload);
  return message->dictionaryRepresentation();
}

/// Counts rows by metric id.
class CountingStore final : public test::RowsOnlyStore {
 public:
  void insertMetric(Metric metric, WriteCompletion /*completion*/) override {
    ++rows[metric.metricId];
    EXPECT_TRUE(metric.subsId == 0 || metric.subsId == 1) << metric.metricId;
    EXPECT_FALSE(metric.attributeName.empty());
  }
  void fetchMetricContents(std::string_view /*metricTech*/, std::string_view /*metricName*/,
                           std::optional<std::string_view> /*attributeName*/, std::int32_t /*subsId*/,
                           MetricsCompletion /*completion*/) override {
    ADD_FAILURE() << "fetchMetricContents";
  }

  std::map<std::string, int> rows;
};

class DrivesOfAFamily : public testing::TestWithParam<Family> {
 protected:
  /// An hour of each drive but the hostile one.
  static std::vector<RecordedEvent> allDrives() {
    std::vector<RecordedEvent> events;
    for (const char* name : {"city", "motorway", "tunnel", "weak-indoor", "dual-sim", "busy"}) {
      auto more = eventsOf(name, GetParam(), 1, minutes(60));
      std::move(more.begin(), more.end(), std::back_inserter(events));
    }
    return events;
  }
};

TEST_P(DrivesOfAFamily, HoldEveryDecodableMetricInAnHourAndTheProductTakesThem) {
  test::FakePlatform platform;
  platform.properties.texts["BasebandChipset"] = nameOf(GetParam());
  CountingStore store;
  const auto service = MetricService::make(store, ZelkorWrapper::sharedInstance());
  const auto ids = decodableIds(GetParam());
  std::map<std::int64_t, int> counts;
  for (const RecordedEvent& event : allDrives()) {
    ASSERT_TRUE(event.metricID && ids.contains(*event.metricID)) << "a metric that is not in the family";
    if (++counts[*event.metricID] <= 50) service->processMetric(event.message());
  }
  for (const auto& [id, className] : ids) {
    EXPECT_GE(counts[id], 1) << id << " " << className;
    // Some classes have no subscription; no row comes of those, and that is meant.
    const auto message = makeMessage(className);
    const auto& fields = message->table().fields;
    const bool hasSubscription =
        std::any_of(fields.begin(), fields.end(), [](const auto& field) { return field.key == "subs_id"; });
    EXPECT_EQ(store.rows[std::to_string(id)] > 0, hasSubscription) << id << " " << className;
  }
}

/// Least and greatest values of attributes by their keys, in the units of the messages.
struct Range {
  std::int64_t least;
  std::int64_t greatest;
};
const std::map<std::string, Range> kRanges = {
    {"rsrp", {-15600, -31}},
    {"rsrq", {-4300, 20}},
    {"cell_rsrp", {-156, -31}},
    {"rscp", {-156, 91}},
    {"nbr_rsrp", {-156, -31}},
    {"nbr_rsrq", {-43, 20}},
    {"ecno", {-43, 49}},
    {"rxlev", {0, 63}},
    {"sinr", {-23, 40}},
    {"snr", {-23, 40}},
    {"rssi", {-15600, 0}},
    {"total_tx_power", {-57, 24}},
    {"last_tx_power", {-57, 24}},
    {"phy_cell_id", {0, 1007}},
    {"pci", {0, 503}},
    {"psc", {0, 511}},
    {"bsic", {0, 63}},
    {"cell_pci", {0, 1007}},
    {"dl_bandwidth", {0, 5}},
    {"subs_id", {0, 1}},
    {"num_subs", {0, 2}},
    {"call_duration", {0, 3600}},
    {"retx_counter", {0, 200}},
    {"max_ue_rank", {1, 4}},
    {"max_schd_mimo_lyr", {1, 4}},
    {"s_rxlev", {-60, 100}},
    {"mmec", {0, 255}},
    {"rac", {0, 255}},
    {"length", {0, 5000}},
    {"scc0_bandwidth", {0, 5}},
    {"nr5g_total_num_ccs", {1, 8}},
    {"lte_total_num_ccs", {1, 8}},
};

void expectRanges(const MetricDictionary& dictionary, const std::string& className, std::set<std::string>& seen) {
  for (const MetricEntry& entry : dictionary.entries()) {
    const std::string key(entry.key.view());
    if (const auto* nested = entry.value.get<MetricDictionary>()) expectRanges(*nested, className, seen);
    if (const auto* list = entry.value.get<MetricDictionaryList>())
      for (const MetricDictionary& each : *list) expectRanges(each, className, seen);
    const auto range = kRanges.find(key);
    if (range == kRanges.end()) continue;
    if (entry.value.get<Text>() != nullptr) continue;        // an enumerator's name
    if (entry.value.get<NumberList>() != nullptr) continue;  // several of them, as text
    const auto value = entry.value.integer();
    ASSERT_TRUE(value) << className << " " << key;
    EXPECT_GE(*value, range->second.least) << className << " " << key;
    EXPECT_LE(*value, range->second.greatest) << className << " " << key;
    seen.insert(key);
  }
}

TEST_P(DrivesOfAFamily, KeepTheirValuesInTheRangesOfMeasurements) {
  const auto ids = decodableIds(GetParam());
  std::set<std::string> seen;
  for (const RecordedEvent& event : allDrives()) {
    const std::string& className = ids.at(*event.metricID);
    const auto dictionary = decoded(event, className);
    ASSERT_TRUE(dictionary) << className;
    expectRanges(*dictionary, className, seen);
    if (testing::Test::HasFailure()) return;
  }
  EXPECT_GT(seen.size(), 10U);
}

TEST_P(DrivesOfAFamily, ShowBandwidthsThatTheDisplayKnows) {
  const std::int64_t factor = GetParam() == Family::Mav ? 1 : 2;
  const std::set<std::int64_t> known = {6, 15, 25, 50, 75, 100};
  const auto ids = decodableIds(GetParam());
  int shown = 0;
  for (const RecordedEvent& event : eventsOf("city", GetParam(), 1, minutes(20))) {
    const auto dictionary = decoded(event, ids.at(*event.metricID));
    ASSERT_TRUE(dictionary);
    for (const char* key : {"dl_bw", "ul_bw"}) {
      const MetricValue* value = dictionary->find(key);
      if (value == nullptr) continue;
      EXPECT_TRUE(known.contains(*value->integer() / factor)) << key << " " << *value->integer();
      ++shown;
    }
  }
  EXPECT_GT(shown, 10);
}

TEST_P(DrivesOfAFamily, CarryTheTimeAtWhichTheyCome) {
  const auto ids = decodableIds(GetParam());
  std::uint64_t last = 0;
  for (const RecordedEvent& event : eventsOf("motorway", GetParam(), 3, minutes(10))) {
    const auto dictionary = decoded(event, ids.at(*event.metricID));
    ASSERT_TRUE(dictionary);
    const MetricValue* timestamp = dictionary->find("timestamp");
    ASSERT_NE(timestamp, nullptr);
    EXPECT_EQ(timestamp->integer(), static_cast<std::int64_t>(kStartMs + *event.atMs));
    EXPECT_GE(*event.atMs, last);
    last = *event.atMs;
    EXPECT_EQ(event.triggerRef, 9999);
    EXPECT_EQ(event.profileID, 0);
    EXPECT_EQ(event.appID, 2);
  }
  EXPECT_GT(last, 500000U);
}

TEST_P(DrivesOfAFamily, ComeAtPlausibleRates) {
  const auto events = eventsOf("city", GetParam(), 1, minutes(60));
  std::map<std::uint64_t, int> bySecond;
  for (const RecordedEvent& event : events) ++bySecond[*event.atMs / 1000];
  const auto busiest = std::max_element(bySecond.begin(), bySecond.end(),
                                        [](const auto& a, const auto& b) { return a.second < b.second; });
  EXPECT_GE(busiest->second, 20) << "some tens a second";
  EXPECT_LE(busiest->second, 120);
  const auto average = [](const std::vector<RecordedEvent>& some) { return static_cast<double>(some.size()) / 3600; };
  EXPECT_GT(average(events), 0.5);
  EXPECT_LT(average(events), 30);
  const double busy = average(eventsOf("busy", GetParam(), 1, minutes(60)));
  EXPECT_GT(busy, 10) << "some tens a second, all the time";
  EXPECT_LT(busy, 60);
}

TEST_P(DrivesOfAFamily, AreQuietOnAPhoneThatLiesStill) {
  network::Scenario scenario = network::shippedScenario("city");
  scenario.route.resize(1);
  scenario.steps.clear();
  for (network::Sim& sim : scenario.sims) sim.sessionsPerHour = sim.callsPerHour = 0;
  ScenarioRun run({std::move(scenario), 1, GetParam()}, kStartMs);
  int count = 0;
  run.advance(minutes(5), [](const RecordedEvent&) {});
  run.advance(minutes(60), [&count](const RecordedEvent&) { ++count; });
  EXPECT_GT(count, 360) << "some tenths a second";
  EXPECT_LT(count, 3600);
}

TEST_P(DrivesOfAFamily, AreTheSameForTheSameSeedHoweverTheTimeIsCut) {
  const auto whole = eventsOf("city", GetParam(), 5, minutes(5));
  ScenarioRun run({network::shippedScenario("city"), 5, GetParam()}, kStartMs);
  std::vector<RecordedEvent> pieces;
  for (int i = 0; i < 3000; ++i)
    run.advance(std::chrono::milliseconds(100), [&pieces](RecordedEvent event) { pieces.push_back(std::move(event)); });
  ASSERT_EQ(whole.size(), pieces.size());
  EXPECT_TRUE(whole == pieces);
  EXPECT_FALSE(whole == eventsOf("city", GetParam(), 6, minutes(5)));
}

/// FNV-1a over the lines of a recording.
std::uint64_t hashOf(const std::vector<RecordedEvent>& events) {
  std::uint64_t hash = 0xCBF29CE484222325U;
  for (const RecordedEvent& event : events)
    for (const char octet : recordingLine(event) + "\n")
      hash = (hash ^ static_cast<unsigned char>(octet)) * 0x100000001B3U;
  return hash;
}

TEST_P(DrivesOfAFamily, AreTheSameOnEveryMachine) {
  // What the world does or what is reported of it has changed if this fails; then the new number is right.
  const std::uint64_t expected = GetParam() == Family::Mav ? 18354503685558370936U : 1864902892851590140U;
  EXPECT_EQ(hashOf(eventsOf("city", GetParam(), 1, minutes(10))), expected);
}

TEST_P(DrivesOfAFamily, ASnapshotBringsWhatIsSoNowForBothSims) {
  ScenarioRun run({network::shippedScenario("dual-sim"), 1, GetParam()}, kStartMs);
  run.advance(minutes(2), [](const RecordedEvent&) {});
  const auto ids = decodableIds(GetParam());
  std::vector<std::int64_t> wanted;
  for (const auto& [id, className] : ids) wanted.push_back(id);
  std::map<std::int64_t, std::set<std::int64_t>> brought;
  run.snapshot(wanted, [&](const RecordedEvent& event) {
    EXPECT_EQ(event.atMs, 120000U);
    const auto dictionary = decoded(event, ids.at(*event.metricID));
    ASSERT_TRUE(dictionary);
    const MetricValue* subsId = dictionary->find("subs_id");
    brought[*event.metricID].insert(subsId != nullptr ? subsId->integer().value_or(-1) : -1);
  });
  const std::set<std::int64_t> both = {0, 1};
  EXPECT_GE(brought.size(), 7U);
  if (GetParam() == Family::Mav) {
    EXPECT_EQ(brought[827648], both) << "service status";
    EXPECT_FALSE(brought[803010].empty()) << "LTE serving cell";
  } else {
    EXPECT_EQ(brought[3986701], both) << "bearers";
    EXPECT_FALSE(brought[3948738].empty()) << "LTE serving cell";
  }
  int others = 0;
  const std::int64_t none[] = {1};
  run.snapshot(none, [&others](const RecordedEvent&) { ++others; });
  EXPECT_EQ(others, 0) << "only what is wanted";
}

TEST_P(DrivesOfAFamily, AHostileMinuteHasDamagedOversizedAndMassesOfMetrics) {
  const auto events = eventsOf("hostile", GetParam(), 1, minutes(1));
  EXPECT_GT(events.size(), 5000U);
  const auto ids = decodableIds(GetParam());
  int unreadable = 0;
  std::size_t longest = 0;
  for (const RecordedEvent& event : events) {
    ASSERT_TRUE(ids.contains(*event.metricID));
    longest = std::max(longest, event.payload->view().size());
    if (event.payload->view().size() > 100000) continue;
    unreadable += decoded(event, ids.at(*event.metricID)) ? 0 : 1;
  }
  EXPECT_GT(unreadable, 20);
  EXPECT_GT(longest, 1000000U);
}

INSTANTIATE_TEST_SUITE_P(Families, DrivesOfAFamily, testing::Values(Family::Mav, Family::Ice),
                         [](const auto& parameter) { return std::string(nameOf(parameter.param)); });

TEST(ScenarioFiles, AreFoundByNameAndByPath) {
  const std::vector<std::filesystem::path> resources = {"/no/such/folder", QUORL_SOURCE_DIR "/resources"};
  EXPECT_TRUE(findScenario("city", resources));
  EXPECT_TRUE(findScenario(QUORL_SOURCE_DIR "/resources/scenarios/city.scenario", {}));
  const auto names = scenarioNames(resources);
  EXPECT_TRUE(std::is_sorted(names.begin(), names.end()));
  EXPECT_NE(std::find(names.begin(), names.end(), "dual-sim"), names.end());
  for (const std::string& name : names) EXPECT_TRUE(findScenario(name, resources)) << name;
}

TEST(ScenarioFiles, OneThatIsNotThereNamesThoseThatAre) {
  const auto missing = findScenario("moon", {QUORL_SOURCE_DIR "/resources"});
  ASSERT_FALSE(missing);
  ASSERT_EQ(missing.error().size(), 1U);
  EXPECT_TRUE(missing.error()[0].starts_with("there is no scenario \"moon\", but busy, city, ")) << missing.error()[0];
  EXPECT_FALSE(findScenario("./moon.scenario", {}));
  EXPECT_EQ(findScenario("city", {}).error()[0], "there is no scenario \"city\", as the shipped ones are missing");
}

}  // namespace
}  // namespace quorl::simulator
