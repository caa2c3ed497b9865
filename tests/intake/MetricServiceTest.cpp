#include <algorithm>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "base/NotificationCenter.h"
#include "intake/IntakeFixture.h"
#include "intake/MetricService.h"
#include "shell/NotificationNames.h"
#include "support/PassingLibrary.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;
using zelkor::KeyValueMessage;

constexpr std::int64_t kNrRrcState = 806917;
constexpr std::int64_t kNrRadioLinkFailure = 806931;

using MetricServiceTest = IntakeTest;

/// State 2 of subscription 1 at 1700000000.123 seconds.
Payload nrRrcState() {
  return Payload().number(1, 1700000000123).number(2, 2).number(15, 1);
}

std::vector<LogLine> exceptionLine(std::int64_t metricId) {
  return {{"metric-service", LogLevel::Default,
           "MetricService - processMetric - exception - metricID " + std::to_string(metricId)}};
}

/// All lines of a metric but the first two: that of the channel, and that with which the service takes it up.
std::vector<LogLine> linesOfTheWalk(const LogRecorder& log) {
  std::vector<LogLine> lines = log.lines();
  EXPECT_GE(lines.size(), 2U);
  EXPECT_TRUE(lines.at(0).text.starts_with("received - metricId"));
  EXPECT_TRUE(lines.at(1).text.starts_with("MetricValidator - processMetric - metricId:"));
  lines.erase(lines.begin(), lines.begin() + 2);
  return lines;
}

/// Passes everything on and looks who is the delegate when events are turned on.
class WatchingLibrary final : public test::PassingLibrary {
 public:
  using PassingLibrary::PassingLibrary;

  void EventsOn(const std::shared_ptr<zelkor::client::Manager>& manager) override {
    hadDelegate = ZelkorWrapper::sharedInstance().delegate() != nullptr;
    PassingLibrary::EventsOn(manager);
  }

  std::optional<bool> hadDelegate;
};

TEST_F(MetricServiceTest, ConstructionListensBeforeItBecomesTheDelegateAndThenLogs) {
  WatchingLibrary library(host.zelkor);
  Platform platform{*host.mainQueue,     *host.backgroundQueue,
                    host.time,           host.time,
                    host.properties,     host.resources,
                    host.documents,      host.strings,
                    host.console,        host.alerts,
                    host.analytics,      host.share,
                    host.pasteboard,     library,
                    host.silentTelephony};
  Platform::install(&platform);
  service = MetricService::make(store, ZelkorWrapper::sharedInstance());
  EXPECT_EQ(library.hadDelegate, false);
  EXPECT_EQ(ZelkorWrapper::sharedInstance().delegate(), service);
  EXPECT_EQ(&service->zelkorShared(), &ZelkorWrapper::sharedInstance());
  EXPECT_EQ(host.zelkor.calls,
            (std::vector<std::string>{"CreateManager", "RegisterEventHandler kEventTrigger",
                                      "RegisterEventHandler kEventMetric", "EventsOff", "EventsOn"}));
  EXPECT_EQ(log.lines(), (std::vector<LogLine>{{"metric-service", LogLevel::Default, "MetricService -  init()"}}));
}

TEST_F(MetricServiceTest, TheTablesOfTheService) {
  EXPECT_EQ(MetricService::metricIDKey, "kKeyMetricID");
  EXPECT_EQ(MetricService::payloadKey, "kKeyPayload");
  EXPECT_EQ(MetricService::profileIDKey, "kKeyProfileID");
  EXPECT_EQ(MetricService::exceptionMetricIds, (std::array<std::int64_t, 4>{806743, 827746, 827650, 806913}));
  EXPECT_EQ(MetricService::edgeCaseIceMetrics,
            (std::array<std::string_view, 8>{"3CD313", "3CD50D", "3CD30B", "3CD009", "3CD102", "3CD105", "3C0013",
                                             "3CD302"}));
  EXPECT_EQ(MetricService::dlbwlookup, (std::array<float, 6>{1.4F, 3, 5, 10, 15, 20}));
}

TEST_F(MetricServiceTest, TheListOfNewIdsRepeatsOneAsMeant) {
  EXPECT_EQ(MetricService::newMetricHexIds,
            (std::array<std::string_view, 19>{"C4F57", "C5018", "C5019", "C7407", "C1002", "C300C", "C3E02", "C3E0B",
                                              "CA101", "CA103", "CA123", "CC006", "CC007", "CC008", "CC226", "C7505",
                                              "C500A", "C5004", "CC226"}));
}

TEST_F(MetricServiceTest, AMetricBecomesOneRowForEachAttribute) {
  serviceStarts();
  metricArrives(kNrRrcState, nrRrcState());
  ASSERT_EQ(store.rows.size(), 3U);
  for (const Metric& row : store.rows) {
    EXPECT_EQ(row.metricTech, "5G");
    EXPECT_EQ(row.metricName, "Nr Rrc State");
    EXPECT_EQ(row.metricId, "806917");
    EXPECT_EQ(row.attributeName, row.attributeNameNonLocalized);
    EXPECT_EQ(row.collectedOn, Date(1700000000123ms));
    EXPECT_EQ(row.subsId, 1);
    EXPECT_FALSE(row.graphable);
    EXPECT_FALSE(row.isBookmarked);
    EXPECT_EQ(row.sectionNumber, std::nullopt);
  }
  EXPECT_EQ(rows(), (std::vector<std::string>{"timestamp=1700000000123 INT", "state=2 INT", "subs_id=1 INT"}));
  EXPECT_NE(store.rows[0].id, store.rows[1].id);
}

TEST_F(MetricServiceTest, EveryLineOfTheRoadOfAMetric) {
  serviceStarts();
  metricArrives(kNrRrcState, Payload().number(2, 2).number(15, 1));
  EXPECT_EQ(
      log.lines(),
      (std::vector<LogLine>{
          {"metric-related", LogLevel::Default, "received - metricId 806917, initialTimestamp: 1767605412"},
          {"metric-related", LogLevel::Default,
           "MetricValidator - processMetric - metricId: C5005 - metric dictionary: {kKeyMetricID = 806917; "
           "kKeyPayload = <4 bytes>}"},
          {"metric-service", LogLevel::Default, "MetricService - processMetric - ClassFromName CellularNrRrcState"},
          {"metric-related", LogLevel::Default,
           "marker: validator - metric name: %@, dictionary: %@, metricName: 5GNr Rrc State, dictionaryCount: 2"},
          {"metric-service", LogLevel::Default,
           "MetricService - flattenDictionaryIfNeeded - metricDictionary [state: 2, subs_id: 1]"},
          {"metric-service", LogLevel::Default, "subsId  ---> 1"},
          {"metric-service", LogLevel::Default,
           "metricTech: 5G, metricName: Nr Rrc State, attributeName: state, attributeValue: 2, attibuteValueType: "
           "INT)"},
          {"database", LogLevel::Default,
           "MetricService - insertMetricToDatabase - metricTech 5G - metricName Nr Rrc State"},
          {"metric-service", LogLevel::Default,
           "metricTech: 5G, metricName: Nr Rrc State, attributeName: subs_id, attributeValue: 1, attibuteValueType: "
           "INT)"},
          {"database", LogLevel::Default,
           "MetricService - insertMetricToDatabase - metricTech 5G - metricName Nr Rrc State"}}));
}

TEST_F(MetricServiceTest, AMetricIsHandledTheSameWhenNobodyListensToTheLog) {
  serviceStarts();
  const auto recorder = installLogSink(nullptr);
  metricArrives(kNrRrcState, nrRrcState());
  installLogSink(recorder);
  EXPECT_EQ(rows().size(), 3U);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(MetricServiceTest, WithoutTimestampTheTimeOfProcessingIsTaken) {
  serviceStarts();
  host.time.setNow(Date(1767605412987ms));
  metricArrives(kNrRrcState, Payload().number(2, 2).number(15, 1));
  ASSERT_EQ(store.rows.size(), 2U);
  EXPECT_EQ(store.rows[0].collectedOn, Date(1767605412987ms));
}

TEST_F(MetricServiceTest, AllRowsOfAMetricHaveOneTimeThoughTheClockGoesOn) {
  serviceStarts();
  const Date arrival = host.time.now();
  store.onInsert = [this] { host.time.setNow(host.time.now() + 1s); };
  metricArrives(806919, Payload()  // with elements, and their elements in turn
                            .number(3, 9)
                            .message(6, Payload().number(1, 1).message(3, Payload().number(1, 5)))
                            .number(15, 1));
  ASSERT_EQ(store.rows.size(), 6U);
  for (const Metric& row : store.rows) EXPECT_EQ(row.collectedOn, arrival) << row.attributeName;
}

TEST_F(MetricServiceTest, AMetricWithoutUsableIdIsDropped) {
  serviceStarts();
  KeyValueMessage noId;
  noId.set("kKeyPayload", ByteString(nrRrcState().data()));
  KeyValueMessage bytesId = noId;
  bytesId.set("kKeyMetricID", ByteString("806917"));
  KeyValueMessage nullId = noId;
  nullId.set("kKeyMetricID", std::monostate());
  for (const KeyValueMessage& message : {noId, bytesId, nullId}) {
    log.clear();
    service->metricsDidUpdate(message);
    EXPECT_EQ(log.lines(), (std::vector<LogLine>{{"metric-related", LogLevel::Default,
                                                  "Metric validator - processMetric - invalid metricId"}}));
  }
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(MetricServiceTest, AnIdOnNoRowOfTheCatalogueLeavesOneLine) {
  serviceStarts();
  for (const auto& [id, hex] :
       std::initializer_list<std::pair<std::int64_t, std::string>>{{806916, "C5004"},
                                                                   {3952165, "3C4E25"},
                                                                   {5, " 5"},
                                                                   {0, " 0"},
                                                                   {806917 + (std::int64_t{1} << 32), "1000C5005"}}) {
    log.clear();
    service->metricsDidUpdate(metricMessage(id, nrRrcState()));
    EXPECT_EQ(log.texts(), (std::vector<std::string>{"MetricValidator - processMetric - metricId: " + hex +
                                                     " - metric dictionary: " + "{kKeyMetricID = " +
                                                     std::to_string(id) + "; kKeyPayload = <11 bytes>}"}));
  }
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(MetricServiceTest, ANegativeIdIsNoReasonToStop) {
  serviceStarts();
  service->metricsDidUpdate(metricMessage(-806917, nrRrcState()));
  EXPECT_TRUE(store.rows.empty());
  EXPECT_EQ(log.lines().size(), 1U);
}

TEST_F(MetricServiceTest, ATriggerEventDoesNothing) {
  serviceStarts();
  host.zelkor.deliver(zelkor::kEventTrigger, metricMessage(kNrRrcState, nrRrcState()));
  host.time.settle();
  EXPECT_TRUE(store.rows.empty());
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(MetricServiceTest, AnIdOnThreeRowsGivesThreeSetsOfRows) {
  deviceIsIce();
  serviceStarts();
  metricArrives(kActiveBearers, Payload().number(1, 1700000000123).message(3, Payload().number(1, 5)).number(15, 1));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"LTE/Active Bearers", "UMTS/Active Bearers", "GSM/Active Bearers"}));
  const std::vector<std::string> once{"cid=5 INT", "subs_id=1 INT"};
  std::vector<std::string> thrice;
  for (int i = 0; i < 3; ++i) thrice.insert(thrice.end(), once.begin(), once.end());
  EXPECT_EQ(rows(), thrice);
}

TEST_F(MetricServiceTest, AnIceMetricOnAnyOtherDeviceIsStoredAsDecoded) {
  for (const char* chipset : {"mav20", "other"}) {
    resetSharedObjects();
    deviceIs(chipset);
    serviceStarts();
    store.rows.clear();
    metricArrives(kActiveBearers,
                  Payload().number(1, 1700000000123).number(2, 1).message(3, Payload().number(1, 5)).number(15, 1));
    EXPECT_FALSE(log.has("MetricService - parseIceMetric - metricID 3CD50D")) << chipset;
    const std::vector<std::string> written = rows();
    ASSERT_EQ(written.size(), 3U * 5) << chipset;
    EXPECT_EQ(std::vector<std::string>(written.begin(), written.begin() + 5),
              (std::vector<std::string>{"timestamp=1700000000123 INT", "bearer_context_count=1 INT", "subs_id=1 INT",
                                        "cid=5 INT", "subs_id=1 INT"}));
  }
}

TEST_F(MetricServiceTest, ADeviceOfBothFamiliesAppliesTheIceRules) {
  deviceIs("mav-ice");
  serviceStarts();
  metricArrives(kActiveBearers, Payload().number(1, 1700000000123).message(3, Payload().number(1, 5)).number(15, 1));
  EXPECT_TRUE(log.has("MetricService - parseIceMetric - metricID 3CD50D"));
  const std::vector<std::string> written = rows();
  ASSERT_EQ(written.size(), 3U * 2);
  EXPECT_EQ(std::vector<std::string>(written.begin(), written.begin() + 2),
            (std::vector<std::string>{"cid=5 INT", "subs_id=1 INT"}));
}

TEST_F(MetricServiceTest, ARowWithoutClassIsLoggedAndTheNextMetricIsHandled) {
  serviceStarts();
  metricArrives(802315, nrRrcState());
  EXPECT_EQ(linesOfTheWalk(log), exceptionLine(802315));
  EXPECT_TRUE(store.rows.empty());
  metricArrives(kNrRrcState, nrRrcState());
  EXPECT_EQ(rows().size(), 3U);
}

TEST_F(MetricServiceTest, EachRowWithoutClassLogsForItself) {
  deviceIsIce();
  serviceStarts();
  metricArrives(3985417, Payload().number(15, 1));
  std::vector<LogLine> expected;
  for (int i = 0; i < 3; ++i) expected.push_back(exceptionLine(3985417).front());
  EXPECT_EQ(linesOfTheWalk(log), expected);
  EXPECT_FALSE(log.has("MetricService - parseIceMetric - metricID 3CD009"))
      << "the rule of this id is never reached: its rows name no class";
}

TEST_F(MetricServiceTest, TheRadioLinkFailureIsDecodedByTwoClassesAsMeant) {
  serviceStarts();
  // Tags 2 and 15 belong to the one class, 6 and 11 to the other.
  metricArrives(kNrRadioLinkFailure, Payload().number(2, 4).number(6, 0).signedNumber(11, -101).number(15, 1));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"5G/Nr R. LinkFailure", "5G/Nr Radio Link Failure"}));
  EXPECT_EQ(rows("Nr R. LinkFailure"), (std::vector<std::string>{"subs_id=0 INT", "last_rsrp=-101 INT"}));
  EXPECT_EQ(rows("Nr Radio Link Failure"), (std::vector<std::string>{"state=4 INT", "subs_id=1 INT"}));
}

TEST_F(MetricServiceTest, ARowWithoutSubscriptionIdWritesNothingAndTheNextRowGoesOn) {
  serviceStarts();
  metricArrives(kNrRadioLinkFailure, Payload().number(2, 4).signedNumber(11, -101).number(15, 1));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"5G/Nr Radio Link Failure"}));
}

TEST_F(MetricServiceTest, AFirstRowThatDecodesNothingKeepsTheSecondFromItsTurn) {
  serviceStarts();
  metricArrives(kNrRadioLinkFailure, Payload().number(2, 4).number(15, 1));
  EXPECT_TRUE(log.has("dictionary is empty  ---> Optional(806931)"));
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(MetricServiceTest, WithoutSubscriptionIdAMetricIsDroppedWithoutALineOfItsOwn) {
  serviceStarts();
  metricArrives(kNrRrcState, Payload().number(1, 1700000000123).number(2, 2));
  EXPECT_TRUE(store.rows.empty());
  const auto lines = linesOfTheWalk(log);
  ASSERT_EQ(lines.size(), 3U);
  EXPECT_TRUE(lines.back().text.starts_with("MetricService - flattenDictionaryIfNeeded"));
}

TEST_F(MetricServiceTest, ASubscriptionIdBeyond32SignedBitsDropsTheMetric) {
  serviceStarts();
  metricArrives(kNrRrcState, Payload().number(2, 2).number(15, 0x80000000));
  EXPECT_TRUE(store.rows.empty());
  metricArrives(kNrRrcState, Payload().number(2, 2).number(15, 0x7FFFFFFF));
  ASSERT_EQ(store.rows.size(), 2U);
  EXPECT_EQ(store.rows[0].subsId, 2147483647);
}

TEST_F(MetricServiceTest, AnEmptyDictionaryEndsTheMetricEvenWhereRowsAreLeft) {
  deviceIsIce();
  serviceStarts();
  metricArrives(kActiveBearers, Payload());
  EXPECT_EQ(
      linesOfTheWalk(log),
      (std::vector<LogLine>{{"metric-service", LogLevel::Default,
                             "MetricService - processMetric - ClassFromName KCellularActivatedBearerContexts"},
                            {"metric-service", LogLevel::Default, "dictionary is empty  ---> Optional(3986701)"}}));
}

TEST_F(MetricServiceTest, AMissingOrWrongPayloadReadsLikeAnEmptyOne) {
  serviceStarts();
  KeyValueMessage message;
  message.set("kKeyMetricID", kNrRrcState);
  metricArrives(message);
  EXPECT_TRUE(log.has("dictionary is empty  ---> Optional(806917)"));
  log.clear();
  message.set("kKeyPayload", std::int64_t{7});
  metricArrives(message);
  EXPECT_TRUE(log.has("dictionary is empty  ---> Optional(806917)"));
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(MetricServiceTest, AnEmptyPayloadOfAClassWithANumberListIsNoEmptyDictionary) {
  serviceStarts();
  metricArrives(816135, Payload());
  EXPECT_TRUE(
      log.has("marker: validator - metric name: %@, dictionary: %@, metricName: MISCCellular Health monitor, "
              "dictionaryCount: 1"));
  EXPECT_FALSE(log.has("dictionary is empty  ---> Optional(816135)"));
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(MetricServiceTest, APayloadThatCannotBeReadWholeLeavesTheExceptionLineAndNoRow) {
  serviceStarts();
  metricArrives(kNrRrcState, nrRrcState().key(14, 2).varint(100).raw("short"));
  EXPECT_EQ(linesOfTheWalk(log), exceptionLine(kNrRrcState));
  EXPECT_TRUE(store.rows.empty());
  metricArrives(kNrRrcState, nrRrcState());
  EXPECT_EQ(rows().size(), 3U);
}

TEST_F(MetricServiceTest, WhatAnEarlierRowHasWrittenStaysWhenALaterOneFails) {
  serviceStarts();
  // Tag 14 is bytes in the second class only; the first skips it as a number.
  metricArrives(kNrRadioLinkFailure, Payload().number(6, 1).number(14, 90));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"5G/Nr R. LinkFailure"}));
  EXPECT_TRUE(log.has(exceptionLine(kNrRadioLinkFailure).front()));
}

TEST_F(MetricServiceTest, TheServiceDoesNotWaitForTheStore) {
  serviceStarts();
  metricArrives(kNrRrcState, nrRrcState());
  metricArrives(kNrRrcState, nrRrcState());
  EXPECT_EQ(store.rows.size(), 6U);
}

class MetricInsertTest : public IntakeTest {
 protected:
  MetricInsertTest() {
    observation_ =
        NotificationCenter::defaultCenter().observe(notification::kNewZelkorMetric, [this](const Notification& news) {
          const auto* row = news.entry<Metric>(notification::kMetricObjectKey);
          ASSERT_NE(row, nullptr);
          announced.push_back(*row);
        });
    serviceStarts();
  }

  std::vector<Metric> announced;

 private:
  NotificationCenter::Observation observation_;
};

TEST_F(MetricInsertTest, ARowIsAnnouncedOnceItHasBeenInserted) {
  metricArrives(kNrRrcState, nrRrcState());
  EXPECT_TRUE(announced.empty());
  store.completesNext(true);
  ASSERT_EQ(announced.size(), 1U);
  const Metric& row = announced[0];
  EXPECT_EQ(row.id, store.rows[0].id);
  EXPECT_EQ(row.metricTech, "5G");
  EXPECT_EQ(row.metricName, "Nr Rrc State");
  EXPECT_EQ(row.attributeName, "timestamp");
  EXPECT_EQ(row.attributeValue, "1700000000123");
  EXPECT_EQ(row.attributeValueType, "INT");
  EXPECT_EQ(row.subsId, 1);
  store.completesAll();
  EXPECT_EQ(announced.size(), 3U);
}

TEST_F(MetricInsertTest, AFailedInsertIsLoggedAndOnlyThatRowIsLost) {
  metricArrives(kNrRrcState, nrRrcState());
  log.clear();
  store.completesNext(false, SQLiteError{SQLiteError::Case::Prepare, "database is locked"});
  EXPECT_EQ(log.lines(),
            (std::vector<LogLine>{{"metric-service", LogLevel::Error,
                                   "error occurred while inserting  ---> Optional(Prepare(message: \"database is "
                                   "locked\"))"}}));
  EXPECT_TRUE(announced.empty());
  store.completesAll();
  EXPECT_EQ(announced.size(), 2U);
}

TEST_F(MetricInsertTest, AFailureWithoutErrorIsLoggedAsNone) {
  metricArrives(kNrRrcState, nrRrcState());
  store.completesNext(false);
  EXPECT_TRUE(log.has({"metric-service", LogLevel::Error, "error occurred while inserting  ---> nil"}));
}

TEST_F(MetricInsertTest, ACompletionMayOutliveTheService) {
  metricArrives(kNrRrcState, nrRrcState());
  service.reset();
  store.completesAll();
  EXPECT_EQ(announced.size(), 3U);
}

}  // namespace
}  // namespace quorl::test
