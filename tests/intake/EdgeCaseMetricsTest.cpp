#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "intake/IntakeFixture.h"

namespace quorl::test {
namespace {

constexpr std::int64_t kRegisteredPlmnStatus = 827650;
constexpr std::int64_t kRatRetention = 827746;
constexpr std::int64_t kLteConnectionStats = 806743;
constexpr std::int64_t kNrOtaMsg = 806913;

class EdgeCaseMetricsTest : public IntakeTest {
 protected:
  static std::optional<MetricDictionary> decoded(std::int64_t metricId, const Payload& payload) {
    return MetricService::handleEdgeCaseMetrics(metricId, metricMessage(metricId, payload));
  }
  static Payload homeNetwork(std::uint64_t mcc, std::uint64_t mnc) { return Payload().number(1, mcc).number(2, mnc); }
};

TEST_F(EdgeCaseMetricsTest, TheHomeNetworkBecomesAText) {
  EXPECT_EQ(decoded(kRegisteredPlmnStatus, Payload().message(11, homeNetwork(310, 410)).number(12, 1)),
            dictionaryOf({{"subs_id", std::uint64_t{1}}, {"PLMN", textOf("310 410")}}));
}

TEST_F(EdgeCaseMetricsTest, TheCodesAreWrittenInDecimalWithoutPadding) {
  const auto answer = decoded(kRegisteredPlmnStatus, Payload().message(11, homeNetwork(1, 1)));
  EXPECT_EQ(answer, dictionaryOf({{"PLMN", textOf("1 1")}}));
}

TEST_F(EdgeCaseMetricsTest, OfSeveralHomeNetworksTheLastDecides) {
  EXPECT_EQ(
      decoded(kRegisteredPlmnStatus, Payload().message(11, homeNetwork(310, 410)).message(11, homeNetwork(262, 2))),
      dictionaryOf({{"PLMN", textOf("262 2")}}));
}

TEST_F(EdgeCaseMetricsTest, AnIncompleteLastHomeNetworkClearsWhatTheOthersHadSet) {
  for (const Payload& last : {Payload().number(1, 262), Payload().number(2, 2), Payload()}) {
    const auto answer = decoded(kRegisteredPlmnStatus, Payload().message(11, homeNetwork(310, 410)).message(11, last));
    ASSERT_TRUE(answer);
    EXPECT_EQ(answer->find("PLMN"), nullptr);
    ASSERT_NE(answer->find("ehplmn_list"), nullptr);
    EXPECT_EQ(answer->find("ehplmn_list")->get<MetricDictionaryList>()->size(), 2U);
  }
}

TEST_F(EdgeCaseMetricsTest, WithoutHomeNetworksTheDictionaryStays) {
  EXPECT_EQ(decoded(kRegisteredPlmnStatus, Payload().number(3, 310).number(12, 1)),
            dictionaryOf({{"h_MCC", std::uint64_t{310}}, {"subs_id", std::uint64_t{1}}}));
}

TEST_F(EdgeCaseMetricsTest, TheOtherNetworkListsStay) {
  const auto answer = decoded(kRegisteredPlmnStatus, Payload().message(10, homeNetwork(310, 410)));
  ASSERT_TRUE(answer);
  EXPECT_NE(answer->find("eplmn_list"), nullptr);
  EXPECT_EQ(answer->find("PLMN"), nullptr);
}

TEST_F(EdgeCaseMetricsTest, TheHomeNetworkIsStoredAsAnAttribute) {
  serviceStarts();
  metricArrives(kRegisteredPlmnStatus,
                Payload().number(1, 1700000000123).message(11, homeNetwork(310, 410)).number(12, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"timestamp=1700000000123 INT", "subs_id=1 INT", "PLMN=310 410 STRING"}));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"MISC/Registered Plmn Status"}));
  EXPECT_EQ(store.rows[0].collectedOn, Date(std::chrono::milliseconds(1700000000123)));
  EXPECT_FALSE(log.has("attribute value or value type is empty"));
}

TEST_F(EdgeCaseMetricsTest, AnIncompleteHomeNetworkStaysAListAndEndsTheWalk) {
  serviceStarts();
  metricArrives(kRegisteredPlmnStatus, Payload().message(11, Payload().number(1, 310)).number(12, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "MCC=310 INT", "subs_id=1 INT"}));
  EXPECT_TRUE(log.has("attribute value or value type is empty"));
}

TEST_F(EdgeCaseMetricsTest, RatRetentionIsDecodedByTheClassOfItsNeighbourAsMeant) {
  serviceStarts();
  metricArrives(kRatRetention, Payload().number(3, 1).number(10, 77));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"MISC/Cellular RatRetention"}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "lac=77 INT"}));
  EXPECT_EQ(store.rows[0].metricId, "827746");
}

TEST_F(EdgeCaseMetricsTest, LteConnectionStatsAreDecodedThoughTheCatalogueSpellsTheirClassWrongly) {
  const auto answer = decoded(kLteConnectionStats, Payload().number(1, 5).number(2, 12));
  ASSERT_TRUE(answer);
  EXPECT_EQ(*answer, dictionaryOf({{"timestamp", std::uint64_t{5}}, {"duration", std::uint64_t{12}}}));
}

TEST_F(EdgeCaseMetricsTest, AnNrOtaMessageLosesFourKeys) {
  serviceStarts();
  metricArrives(
      kNrOtaMsg,
      Payload().number(2, 1).number(4, 101).number(5, 640000).number(16, 50).number(17, 9).number(18, 78).number(24,
                                                                                                                 2));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "freq=640000 INT", "cell_id=9 INT"}));
}

TEST_F(EdgeCaseMetricsTest, AnNrOtaMessageOfOnlyThoseKeysIsNoEmptyDecodeAndGivesNoRow) {
  serviceStarts();
  metricArrives(kNrOtaMsg, Payload().number(4, 101).number(16, 50));
  EXPECT_TRUE(store.rows.empty());
  EXPECT_FALSE(log.has("dictionary is empty  ---> Optional(806913)"));
}

TEST_F(EdgeCaseMetricsTest, TheEdgePathLogsItsOwnLineAndNoneOfTheGeneralPath) {
  serviceStarts();
  metricArrives(kNrOtaMsg, Payload().number(2, 1));
  std::vector<LogLine> lines = log.lines();
  ASSERT_GE(lines.size(), 5U);
  lines.resize(5);
  EXPECT_EQ(lines,
            (std::vector<LogLine>{
                {"metric-related", LogLevel::Default, "received - metricId 806913, initialTimestamp: 1767605412"},
                {"metric-related", LogLevel::Default,
                 "MetricValidator - processMetric - metricId: C5001 - metric dictionary: {kKeyMetricID = "
                 "806913; kKeyPayload = <2 bytes>}"},
                {"metric-service", LogLevel::Default, "exception metric 806913"},
                {"metric-service", LogLevel::Default,
                 "MetricService - flattenDictionaryIfNeeded - metricDictionary [subs_id: 1]"},
                {"metric-service", LogLevel::Default, "subsId  ---> 1"}}));
}

TEST_F(EdgeCaseMetricsTest, AnIdWithoutRuleAnswersNothingAndTheLineEndsWithABlank) {
  EXPECT_EQ(decoded(806917, Payload().number(15, 1)), std::nullopt);
  EXPECT_EQ(log.lines(), (std::vector<LogLine>{{"metric-service", LogLevel::Default, "exception metric 806917"},
                                               {"metric-related", LogLevel::Default,
                                                "handleEdgeCaseMetrics - unable to process metricId: 806917 "}}));
}

TEST_F(EdgeCaseMetricsTest, EveryExceptionIdHasARule) {
  for (const std::int64_t metricId : MetricService::exceptionMetricIds) {
    EXPECT_TRUE(decoded(metricId, Payload().number(1, 5))) << metricId;
    EXPECT_FALSE(log.has("handleEdgeCaseMetrics - unable to process metricId: " + std::to_string(metricId) + " "));
  }
}

TEST_F(EdgeCaseMetricsTest, WithoutPayloadTheDictionaryIsThatOfAnEmptyMessage) {
  zelkor::KeyValueMessage message;
  EXPECT_EQ(MetricService::handleEdgeCaseMetrics(kNrOtaMsg, message), MetricDictionary());
  message.set("kKeyPayload", std::int64_t{3});
  EXPECT_EQ(MetricService::handleEdgeCaseMetrics(kNrOtaMsg, message), MetricDictionary());
}

TEST_F(EdgeCaseMetricsTest, AnEmptyEdgeCaseMetricIsNotTakenForTheEndOfTheMatterButGivesNoRow) {
  serviceStarts();
  metricArrives(kNrOtaMsg, Payload());
  EXPECT_EQ(log.texts("metric-service"),
            (std::vector<std::string>{"exception metric 806913",
                                      "MetricService - flattenDictionaryIfNeeded - metricDictionary [:]"}));
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(EdgeCaseMetricsTest, APayloadThatCannotBeReadWholeIsDroppedAndTheProcessGoesOn) {
  serviceStarts();
  for (const std::int64_t metricId : MetricService::exceptionMetricIds) {
    log.clear();
    metricArrives(metricId, Payload().number(1, 5).key(2, 0).raw("\xFF"));
    EXPECT_EQ(log.texts("metric-service"), (std::vector<std::string>{"exception metric " + std::to_string(metricId)}));
  }
  EXPECT_TRUE(store.rows.empty());
  metricArrives(kNrOtaMsg, Payload().number(2, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT"}));
}

TEST_F(EdgeCaseMetricsTest, TheExceptionsHoldOnAnIceDeviceToo) {
  deviceIsIce();
  serviceStarts();
  metricArrives(kNrOtaMsg, Payload().number(2, 1).number(16, 50));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT"}));
}

}  // namespace
}  // namespace quorl::test
