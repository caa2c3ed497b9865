#include <algorithm>
#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "ToolRun.h"
#include "hosts/simulator/CatalogueClass.h"
#include "hosts/simulator/Recording.h"
#include "intake/MetricGroupV2.h"
#include "messages/MetricCodable.h"
#include "recording/RecordingMaker.h"
#include "support/TemporaryDirectory.h"

namespace quorl::tool {
namespace {

using simulator::RecordedEvent;

struct Family {
  BasebandFamily family;
  std::string name;
  std::string configuration;
  std::int64_t triggerId;
};

const Family kFamilies[] = {{BasebandFamily::Mav, "mav", "resources/Quorl2.deviceconfig", 5202011},
                            {BasebandFamily::Ice, "ice", "resources/Quorl1.deviceconfig", 8323091}};

std::vector<RecordedEvent> shippedRecording(const Family& family) {
  const auto recording = simulator::readRecording(test::sourcePath("resources/recordings/" + family.name + ".jsonl"));
  EXPECT_TRUE(recording && recording->faults.empty()) << family.name;
  return recording ? recording->events : std::vector<RecordedEvent>();
}

std::optional<std::int64_t> subscriptionOf(const RecordedEvent& event, const MetricGroupV2& row) {
  const auto message = makeMessage(simulator::decodingClass(row));
  message->initWithData(event.payload);
  const auto dictionary = message->dictionaryRepresentation();
  EXPECT_TRUE(dictionary) << row.className;
  const MetricValue* value = dictionary ? dictionary->find("subs_id") : nullptr;
  return value == nullptr ? std::nullopt : value->integer();
}

TEST(ShippedRecordings, AreWhatTheMakerMakes) {
  for (const Family& family : kFamilies) EXPECT_EQ(shippedRecording(family), makeRecording(family.family, 1));
}

TEST(ShippedRecordings, HoldEveryDecodableMetricOfTheirFamilySeveralTimesForBothSubscriptions) {
  for (const Family& family : kFamilies) {
    const auto events = shippedRecording(family);
    std::set<std::int64_t> decodable;
    for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
      if (row.deviceType != family.name || makeMessage(simulator::decodingClass(row)) == nullptr) continue;
      decodable.insert(row.zelkorId);
      std::map<std::optional<std::int64_t>, int> bySubscription;
      int count = 0;
      for (const RecordedEvent& event : events) {
        if (event.metricID != row.zelkorId) continue;
        ++count;
        ++bySubscription[subscriptionOf(event, row)];
      }
      EXPECT_GE(count, 4) << row.className;
      // Some classes have no subscription at all.
      if (bySubscription.contains(std::nullopt)) continue;
      EXPECT_GE(bySubscription[0], 2) << row.className;
      EXPECT_GE(bySubscription[1], 2) << row.className;
    }
    for (const RecordedEvent& event : events)
      EXPECT_TRUE(decodable.contains(event.metricID.value_or(0))) << "not of the family " << family.name;
  }
}

TEST(ShippedRecordings, HoldSomeHundredEventsInOrderOverTenMinutes) {
  for (const Family& family : kFamilies) {
    const auto events = shippedRecording(family);
    EXPECT_GE(events.size(), 200U);
    EXPECT_LE(events.size(), 999U);
    std::uint64_t last = 0;
    for (const RecordedEvent& event : events) {
      EXPECT_GE(event.atMs.value_or(0), last);
      last = event.atMs.value_or(0);
    }
    EXPECT_GT(last, 540000U);
    EXPECT_LT(last, 600000U);
  }
}

TEST(RecordingMaker, GivesTheSameForTheSameSeedAndAnotherForAnother) {
  EXPECT_EQ(makeRecording(BasebandFamily::Mav, 7), makeRecording(BasebandFamily::Mav, 7));
  EXPECT_NE(makeRecording(BasebandFamily::Mav, 7), makeRecording(BasebandFamily::Mav, 8));
}

TEST(RecordingMaker, WritesTheShippedFileByteForByte) {
  const test::TemporaryDirectory directory;
  for (const Family& family : kFamilies) {
    const auto file = directory.path() / family.name;
    EXPECT_EQ(
        test::runTool({"make-recording", "--family", family.name, "--seed", "1", "--output", file.string()}).exitCode,
        0);
    EXPECT_EQ(test::readFile(file), test::readFile(test::sourcePath("resources/recordings/" + family.name + ".jsonl")));
  }
}

TEST(RecordingMaker, FailsWithoutAPlaceToWriteAndWithoutAFamily) {
  EXPECT_EQ(test::runTool({"make-recording", "--family", "mav", "--output", "/no/such/folder/x"}).exitCode, 1);
  EXPECT_EQ(test::runTool({"make-recording", "--family", "neither", "--output", "x"}).exitCode, 2);
}

TEST(Configurations, AskForTheMetricsOfTheirFamilyInTheOrderOfTheCatalogue) {
  for (const Family& family : kFamilies) {
    const auto configuration = nlohmann::json::parse(test::readFile(test::sourcePath(family.configuration)));
    EXPECT_EQ(configuration["applicationId"], 2);
    EXPECT_EQ(configuration["payloadType"], 0);
    EXPECT_EQ(configuration["profileId"], 0);
    EXPECT_EQ(configuration["triggers"][0]["triggerId"], family.triggerId);
    std::vector<std::int64_t> wanted;
    for (const MetricGroupV2& row : MetricGroupV2::metricGroupData())
      if (row.deviceType == family.name && std::find(wanted.begin(), wanted.end(), row.zelkorId) == wanted.end())
        wanted.push_back(row.zelkorId);
    EXPECT_EQ(configuration["metrics"].get<std::vector<std::int64_t>>(), wanted);
  }
}

}  // namespace
}  // namespace quorl::tool
