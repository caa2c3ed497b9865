#include <limits>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "intake/IntakeFixture.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;

constexpr Date kDate{1700000000123ms};
constexpr char kEndOfWalk[] = "attribute value or value type is empty";

class FlatteningTest : public IntakeTest {
 protected:
  static MetricDictionary flattened(const MetricDictionary& source) {
    MetricDictionary result;
    MetricService::flattenDictionaryIfNeeded(source, result);
    return result;
  }
};

TEST_F(FlatteningTest, ASubMessageOfIntegersGoesUpOneLevel) {
  EXPECT_EQ(flattened(dictionaryOf({{"old_state", dictionaryOf({{"tx_band", 41}, {"accessory", 0}})},
                                    {"timestamp", std::uint64_t{1000}}})),
            dictionaryOf({{"old_state_tx_band", 41}, {"old_state_accessory", 0}, {"timestamp", std::uint64_t{1000}}}));
}

TEST_F(FlatteningTest, BooleansAndWholeDecodedFloatsCountAsIntegers) {
  EXPECT_EQ(flattened(dictionaryOf({{"s", dictionaryOf({{"on", true}, {"level", decodedFloat(3)}})}})),
            dictionaryOf({{"s_on", true}, {"s_level", decodedFloat(3)}}));
}

TEST_F(FlatteningTest, ASubMessageWithAnythingElseStaysNested) {
  for (const MetricValue& other :
       {textOf("LTE"), textOf("41"), decodedFloat(2.5F), bytesOf("x"), MetricValue(dictionaryOf({{"a", 1}})),
        listOf({}), numbersOf({}), numbersOf({1}), computedFloat(3)}) {
    const MetricDictionary source = dictionaryOf({{"new_state", dictionaryOf({{"tx_band", 41}, {"other", other}})}});
    EXPECT_EQ(flattened(source), source) << logText(other);
  }
}

TEST_F(FlatteningTest, ReachesExactlyOneLevel) {
  const MetricDictionary source = dictionaryOf({{"outer", dictionaryOf({{"inner", dictionaryOf({{"value", 1}})}})}});
  EXPECT_EQ(flattened(source), source);
}

TEST_F(FlatteningTest, AnEmptySubMessageVanishesWithItsKey) {
  EXPECT_EQ(flattened(dictionaryOf({{"guti", MetricDictionary()}, {"subs_id", 1}})), dictionaryOf({{"subs_id", 1}}));
}

TEST_F(FlatteningTest, ListsStayAsTheyAre) {
  const MetricDictionary source =
      dictionaryOf({{"list", listOf({dictionaryOf({{"a", 1}})})}, {"numbers", numbersOf({7, 9})}});
  EXPECT_EQ(flattened(source), source);
}

TEST_F(FlatteningTest, ASubscriptionIdInsideBecomesAnAttributeOfTheParent) {
  EXPECT_EQ(flattened(dictionaryOf({{"old_state", dictionaryOf({{"subs_id", 1}, {"tx_band", 41}})}})),
            dictionaryOf({{"old_state_subs_id", 1}, {"old_state_tx_band", 41}}));
}

TEST_F(FlatteningTest, LogsTheSourceAndEachFlattenedSubMessage) {
  flattened(dictionaryOf({{"old_state", dictionaryOf({{"tx_band", 41}, {"accessory", 0}})}, {"subs_id", 1}}));
  EXPECT_EQ(log.lines(),
            (std::vector<LogLine>{
                {"metric-service", LogLevel::Default,
                 "MetricService - flattenDictionaryIfNeeded - metricDictionary [old_state: [tx_band: 41, accessory: "
                 "0], subs_id: 1]"},
                {"metric-service", LogLevel::Default, "flattened : [(\"tx_band\", 41), (\"accessory\", 0)]"}}));
}

TEST_F(FlatteningTest, NoLineCarriesTheContentOfAByteString) {
  flattened(dictionaryOf({{"imei", bytesOf("secret")}}));
  EXPECT_EQ(
      log.texts(),
      (std::vector<std::string>{"MetricService - flattenDictionaryIfNeeded - metricDictionary [imei: <6 bytes>]"}));
}

class CollectionDateTest : public IntakeTest {};

TEST_F(CollectionDateTest, CountsMilliseconds) {
  EXPECT_EQ(MetricService::collectionDate(dictionaryOf({{"timestamp", std::uint64_t{1700000000123}}})), kDate);
  EXPECT_EQ(MetricService::collectionDate(dictionaryOf({{"timestamp", std::uint64_t{0}}})), Date());
  EXPECT_EQ(MetricService::collectionDate(dictionaryOf({{"timestamp", integerOf(-1)}})), Date(-1ms));
}

TEST_F(CollectionDateTest, AnythingButAnIntegerLeavesTheCurrentTime) {
  for (const MetricValue& value : {textOf("1700000000123"), decodedFloat(2.5F), computedFloat(1000), bytesOf("x"),
                                   numbersOf({1}), MetricValue(std::numeric_limits<std::uint64_t>::max())})
    EXPECT_EQ(MetricService::collectionDate(dictionaryOf({{"timestamp", value}})), host.time.now()) << logText(value);
  EXPECT_EQ(MetricService::collectionDate(MetricDictionary()), host.time.now());
}

TEST_F(CollectionDateTest, AnInstantBeyondAllDatesIsTheLastOne) {
  const Date farthest =
      MetricService::collectionDate(dictionaryOf({{"timestamp", integerOf(std::numeric_limits<std::int64_t>::max())}}));
  EXPECT_GT(farthest, Date(std::chrono::years(200000)));
  EXPECT_LT(
      MetricService::collectionDate(dictionaryOf({{"timestamp", integerOf(std::numeric_limits<std::int64_t>::min())}})),
      Date(-std::chrono::years(200000)));
}

class MetricRowsTest : public IntakeTest {
 protected:
  MetricRowsTest() { serviceStarts(); }

  void isWritten(const MetricDictionary& dictionary) { service->insertMetricToDatabase(dictionary, kGroup, kDate); }
  /// The row of one value, as "value TYPE"; "none" when there is none.
  std::string rowOf(const MetricValue& value) {
    store.rows.clear();
    isWritten(dictionaryOf({{"x", value}, {"subs_id", 1}}));
    for (const Metric& row : store.rows)
      if (row.attributeName == "x") return row.attributeValue + " " + row.attributeValueType;
    return "none";
  }
  std::size_t endsOfWalk() const { return log.count(kEndOfWalk); }

  static constexpr MetricGroupV2 kGroup{"5G", "Nr Rach Attempt", 806915, "CellularNrRachAttempt", "mav"};
};

TEST_F(MetricRowsTest, Integers) {
  EXPECT_EQ(rowOf(integerOf(-3)), "-3 INT");
  EXPECT_EQ(rowOf(integerOf(std::numeric_limits<std::int64_t>::min())), "-9223372036854775808 INT");
  EXPECT_EQ(rowOf(std::uint64_t{18446744073709551615U}), "18446744073709551615 INT");
  EXPECT_EQ(rowOf(true), "1 INT");
  EXPECT_EQ(rowOf(false), "0 INT");
}

TEST_F(MetricRowsTest, FloatsAreOfTypeIntAsMeant) {
  EXPECT_EQ(rowOf(decodedFloat(2.5F)), "2.5 INT");
  EXPECT_EQ(rowOf(decodedFloat(0.1F)), "0.1 INT");
  EXPECT_EQ(rowOf(decodedFloat(-12.25F)), "-12.25 INT");
}

TEST_F(MetricRowsTest, AWholeFloatLosesItsFractionUnlessARuleComputedIt) {
  EXPECT_EQ(rowOf(decodedFloat(3)), "3 INT");
  EXPECT_EQ(rowOf(computedFloat(3)), "3.0 INT");
  EXPECT_EQ(rowOf(computedFloat(10)), "10.0 INT");
  EXPECT_EQ(rowOf(computedFloat(1.4F)), "1.4 INT");
}

TEST_F(MetricRowsTest, ATextWithASlashOrAColonIsADateWhateverItMeans) {
  EXPECT_EQ(rowOf(textOf("12:30")), "12:30 DATE");
  EXPECT_EQ(rowOf(textOf("1/2")), "1/2 DATE");
  EXPECT_EQ(rowOf(textOf("(unknown: 7)")), "(unknown: 7) DATE");
  EXPECT_EQ(rowOf(textOf("/")), "/ DATE");
  EXPECT_EQ(rowOf(textOf("SYS_MODE_LTE")), "SYS_MODE_LTE STRING");
  EXPECT_EQ(rowOf(textOf("2026-01-05")), "2026-01-05 STRING");
  EXPECT_EQ(rowOf(textOf("41")), "41 STRING");
}

TEST_F(MetricRowsTest, AByteStringAndANumberListCostOnlyThemselves) {
  isWritten(dictionaryOf({{"plmn", bytesOf("abc")}, {"rx_beam_id", numbersOf({7, 9})}, {"subs_id", 1}, {"tac", 4711}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "tac=4711 INT"}));
  EXPECT_EQ(unknownValueLines(), (std::vector<std::string>{"unknown attributevalue  ---> <3 bytes>",
                                                           "unknown attributevalue  ---> [7, 9]"}));
  EXPECT_EQ(endsOfWalk(), 0U);
}

TEST_F(MetricRowsTest, AnEmptyByteStringIsUnknownToo) {
  isWritten(dictionaryOf({{"plmn", bytesOf("")}, {"subs_id", 1}}));
  EXPECT_EQ(unknownValueLines(), (std::vector<std::string>{"unknown attributevalue  ---> <0 bytes>"}));
  EXPECT_EQ(endsOfWalk(), 0U);
}

TEST_F(MetricRowsTest, ASubMessageLosesItsKeyAndWritesItsOwnSubscriptionId) {
  isWritten(dictionaryOf({{"subs_id", 1}, {"new_state", dictionaryOf({{"rat", textOf("LTE")}, {"tx_band", 41}})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "rat=LTE STRING", "tx_band=41 INT", "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 1U);
}

TEST_F(MetricRowsTest, ASubMessagesOwnSubscriptionIdIsOverwritten) {
  isWritten(dictionaryOf({{"subs_id", 1}, {"state", dictionaryOf({{"subs_id", 0}, {"rat", textOf("LTE")}})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "subs_id=1 INT", "rat=LTE STRING"}));
}

TEST_F(MetricRowsTest, TheFirstNestedValueEndsTheWalkOnceItsRowsAreWritten) {
  isWritten(dictionaryOf({{"first", dictionaryOf({{"a", textOf("A")}})},
                          {"second", dictionaryOf({{"b", textOf("B")}})},
                          {"subs_id", 1},
                          {"tac", 4711}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "tac=4711 INT", "a=A STRING", "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 1U);
}

TEST_F(MetricRowsTest, EachElementOfAListWritesRowsOfTheSameNames) {
  isWritten(dictionaryOf(
      {{"subs_id", 1},
       {"cells", listOf({dictionaryOf({{"pci", 101}}), dictionaryOf({{"pci", 102}}), MetricDictionary()})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "pci=101 INT", "subs_id=1 INT", "pci=102 INT",
                                              "subs_id=1 INT", "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 1U);
}

TEST_F(MetricRowsTest, TheElementsOfAListAreFlattened) {
  isWritten(dictionaryOf(
      {{"subs_id", 1}, {"cells", listOf({dictionaryOf({{"id", dictionaryOf({{"mcc", 310}, {"mnc", 410}})}})})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "id_mcc=310 INT", "id_mnc=410 INT", "subs_id=1 INT"}));
}

TEST_F(MetricRowsTest, ASubMessageInsideASubMessageIsWrittenWhole) {
  isWritten(dictionaryOf(
      {{"subs_id", 1},
       {"outer", dictionaryOf({{"name", textOf("n")}, {"inner", dictionaryOf({{"value", textOf("v")}})}})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "name=n STRING", "subs_id=1 INT", "value=v STRING",
                                              "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 2U);
}

TEST_F(MetricRowsTest, TheWalkFlattensNoSubMessage) {
  isWritten(dictionaryOf({{"subs_id", 1}, {"s", dictionaryOf({{"tx_band", 41}})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "tx_band=41 INT", "subs_id=1 INT"}));
  store.rows.clear();
  isWritten(dictionaryOf(
      {{"subs_id", 1}, {"outer", dictionaryOf({{"name", textOf("n")}, {"inner", dictionaryOf({{"value", 1}})}})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "name=n STRING", "subs_id=1 INT", "value=1 INT",
                                              "subs_id=1 INT"}));
}

TEST_F(MetricRowsTest, AnElementsOwnSubscriptionIdIsOverwritten) {
  isWritten(dictionaryOf({{"subs_id", 1}, {"cells", listOf({dictionaryOf({{"subs_id", 0}, {"pci", 101}})})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "subs_id=1 INT", "pci=101 INT"}));
  for (const Metric& row : store.rows) EXPECT_EQ(row.subsId, 1);
}

TEST_F(MetricRowsTest, AnElementWhoseWalkEndsEarlyCostsTheNextOneNothing) {
  isWritten(dictionaryOf({{"subs_id", 1},
                          {"cells", listOf({dictionaryOf({{"pci", 101}, {"state", textOf("")}}),
                                            dictionaryOf({{"pci", 102}, {"beams", numbersOf({})}}),
                                            dictionaryOf({{"pci", 103}, {"state", textOf("IDLE")}})})}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT", "pci=101 INT", "subs_id=1 INT", "pci=102 INT",
                                              "subs_id=1 INT", "pci=103 INT", "state=IDLE STRING", "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 3U);
}

TEST_F(MetricRowsTest, EmptyListsAndTextsEndTheWalkWithoutARow) {
  for (const MetricValue& value : {numbersOf({}), listOf({}), textOf("")}) {
    store.rows.clear();
    log.clear();
    isWritten(dictionaryOf({{"empty", value}, {"subs_id", 1}}));
    EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT"}));
    EXPECT_EQ(endsOfWalk(), 1U);
    EXPECT_TRUE(log.has({"metric-service", LogLevel::Default, kEndOfWalk}));
    EXPECT_TRUE(unknownValueLines().empty());
  }
}

TEST_F(MetricRowsTest, PlainAttributesAreMetAheadOfWhatEndsTheWalk) {
  isWritten(dictionaryOf({{"empty", textOf("")},
                          {"cells", listOf({dictionaryOf({{"pci", 101}})})},
                          {"plmn", bytesOf("abc")},
                          {"state", textOf("IDLE")},
                          {"subs_id", 1}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"state=IDLE STRING", "subs_id=1 INT", "pci=101 INT", "subs_id=1 INT"}));
  EXPECT_EQ(unknownValueLines().size(), 1U);
}

TEST_F(MetricRowsTest, WithoutUsableSubscriptionIdNothingHappensAndNothingIsLogged) {
  isWritten(MetricDictionary());
  isWritten(dictionaryOf({{"tac", 4711}}));
  for (const MetricValue& value : {textOf("1"), decodedFloat(0.5F), computedFloat(1), integerOf(2147483648),
                                   integerOf(-2147483649), MetricValue(MetricDictionary()), bytesOf("1")})
    isWritten(dictionaryOf({{"subs_id", value}, {"tac", 4711}}));
  EXPECT_TRUE(store.rows.empty());
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(MetricRowsTest, ASubscriptionIdMayBeNegativeOrABoolean) {
  isWritten(dictionaryOf({{"subs_id", integerOf(-2147483648)}}));
  isWritten(dictionaryOf({{"subs_id", true}}));
  ASSERT_EQ(store.rows.size(), 2U);
  EXPECT_EQ(store.rows[0].subsId, -2147483647 - 1);
  EXPECT_EQ(store.rows[1].subsId, 1);
}

TEST_F(MetricRowsTest, GraphableAttributesAreMarked) {
  static constexpr MetricGroupV2 kStats{"5G", "Nr ConnectionStats", 806934, "CellularNrConnectionStats", "mav"};
  service->insertMetricToDatabase(dictionaryOf({{"duration_of_conn", 12}, {"subs_id", 0}}), kStats, kDate);
  ASSERT_EQ(store.rows.size(), 2U);
  EXPECT_TRUE(store.rows[0].graphable);
  EXPECT_FALSE(store.rows[1].graphable);
}

TEST_F(MetricRowsTest, ATimestampThatIsNoIntegerIsStillAnAttribute) {
  isWritten(dictionaryOf({{"timestamp", textOf("now")}, {"subs_id", 1}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{"timestamp=now STRING", "subs_id=1 INT"}));
}

TEST_F(MetricRowsTest, ARachAttemptAsADictionary) {
  isWritten(dictionaryOf(
      {{"timestamp", std::uint64_t{1700000000123}},
       {"num_attempt", 2},
       {"subs_id", 1},
       {"last_tx_power", -3},
       {"plmn", bytesOf("\x13\x00\x14")},
       {"serving_cell_beam_info",
        listOf(
            {dictionaryOf({{"cell_pci", 101}, {"ssb_index", 4}, {"rx_beam_id", numbersOf({7, 9})}, {"cell_rsrp", -92}}),
             dictionaryOf({{"cell_pci", 102}, {"ssb_index", 5}, {"cell_rsrp", -97}})})},
       {"tac", 4711}}));
  EXPECT_EQ(rows(), (std::vector<std::string>{
                        "timestamp=1700000000123 INT", "num_attempt=2 INT", "subs_id=1 INT", "last_tx_power=-3 INT",
                        "tac=4711 INT", "cell_pci=101 INT", "ssb_index=4 INT", "cell_rsrp=-92 INT", "subs_id=1 INT",
                        "cell_pci=102 INT", "ssb_index=5 INT", "cell_rsrp=-97 INT", "subs_id=1 INT"}));
  EXPECT_EQ(unknownValueLines().size(), 2U);
  EXPECT_EQ(endsOfWalk(), 1U);
  for (const Metric& row : store.rows) {
    EXPECT_EQ(row.metricTech, "5G");
    EXPECT_EQ(row.metricName, "Nr Rach Attempt");
    EXPECT_EQ(row.metricId, "806915");
    EXPECT_EQ(row.subsId, 1);
    EXPECT_EQ(row.collectedOn, kDate);
    EXPECT_FALSE(row.graphable);
  }
}

TEST_F(MetricRowsTest, TheSameRachAttemptAsAPayload) {
  metricArrives(806915,
                Payload()
                    .number(1, 1700000000123)
                    .number(3, 2)
                    .signedNumber(9, -3)
                    .number(10, 4711)
                    .bytes(14, "\x13")
                    .number(15, 1)
                    .message(22, Payload().number(1, 101).number(2, 4).number(3, 7).number(3, 9).plainNumber(6, -92))
                    .message(22, Payload().number(1, 102).number(2, 5).plainNumber(6, -97)));
  EXPECT_EQ(rows(), (std::vector<std::string>{
                        "timestamp=1700000000123 INT", "num_attempt=2 INT", "last_tx_power=-3 INT", "tac=4711 INT",
                        "subs_id=1 INT", "cell_pci=101 INT", "ssb_index=4 INT", "cell_rsrp=-92 INT", "subs_id=1 INT",
                        "cell_pci=102 INT", "ssb_index=5 INT", "cell_rsrp=-97 INT", "subs_id=1 INT"}));
  EXPECT_EQ(unknownValueLines(), (std::vector<std::string>{"unknown attributevalue  ---> <1 bytes>",
                                                           "unknown attributevalue  ---> [7, 9]"}));
  // The second beam's list is empty and ends the walk of its element; the beams end that of the message.
  EXPECT_EQ(endsOfWalk(), 2U);
}

TEST_F(MetricRowsTest, TheTunerEventFlattensTheStateOfIntegersAndNotTheOtherOne) {
  metricArrives(816389, Payload()
                            .number(1, 1700000000123)
                            .message(3, Payload().number(2, 41).number(7, 0))
                            .message(4, Payload().number(1, 9).number(2, 41))
                            .number(15, 1));
  const std::vector<std::string> written = rows();
  ASSERT_EQ(written.size(), 7U);
  EXPECT_EQ(written[0], "timestamp=1700000000123 INT");
  EXPECT_EQ(written[1], "subs_id=1 INT");
  EXPECT_EQ(written[2], "old_state_tx_band=41 INT");
  EXPECT_EQ(written[3], "old_state_accessory=0 INT");
  EXPECT_TRUE(written[4].starts_with("rat="));
  EXPECT_EQ(written[5], "tx_band=41 INT");
  EXPECT_EQ(written[6], "subs_id=1 INT");
  EXPECT_EQ(endsOfWalk(), 1U);
}

TEST_F(MetricRowsTest, AListInTheElementsOfAListWritesItsRowsBehindThoseOfItsElement) {
  const auto bearer = [](std::uint64_t id) { return Payload().number(1, id); };
  metricArrives(806919, Payload()
                            .number(1, 1700000000123)
                            .number(3, 9)
                            .message(6, Payload().number(1, 1).message(3, bearer(1)).message(3, bearer(2)))
                            .message(6, Payload().number(2, 2).message(3, bearer(3)))
                            .number(15, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"timestamp=1700000000123 INT", "reason=9 INT", "subs_id=1 INT",  //
                                              "integrity_algo=ALGO_SNOW3G STRING", "subs_id=1 INT",            //
                                              "drb_id=1 INT", "subs_id=1 INT", "drb_id=2 INT", "subs_id=1 INT",
                                              "ciphering_algo=ALGO_AES STRING", "subs_id=1 INT",  //
                                              "drb_id=3 INT", "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 3U) << "the message's, and that of each element";
}

TEST_F(MetricRowsTest, AListInASubMessageWritesItsRowsBehindThoseOfTheSubMessage) {
  const auto neighbor = [](std::uint64_t uarfcn) { return Payload().number(1, uarfcn).signedNumber(2, -115); };
  metricArrives(3986190,
                Payload()
                    .number(13, 4)
                    .message(27, Payload().number(1, 2).message(4, neighbor(10700)).message(4, neighbor(10725)))
                    .message(28, Payload().number(1, 3).message(4, Payload().number(1, 62)))  // its turn does not come
                    .number(127, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"Q_hyst=4 INT", "subs_id=1 INT",         //
                                              "t_reselection=2 INT", "subs_id=1 INT",  //
                                              "uarfcn=10700 INT", "q_rxlev_min=-115 INT", "subs_id=1 INT",
                                              "uarfcn=10725 INT", "q_rxlev_min=-115 INT", "subs_id=1 INT"}));
  EXPECT_EQ(endsOfWalk(), 2U);
}

}  // namespace
}  // namespace quorl::test
