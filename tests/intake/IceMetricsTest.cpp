#include <limits>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "intake/IntakeFixture.h"

namespace quorl::test {
namespace {

constexpr std::int64_t kCaStatus = 0x3CD313;
constexpr std::int64_t kUmtsServingCell = 0x3CD102;
constexpr std::int64_t kUmtsNeighborCells = 0x3CD105;
constexpr std::int64_t kSimFiles = 0x3C0013;
constexpr std::int64_t kLteTxPower = 0x3CD302;
constexpr std::int64_t kComponentCarriers = 0x3CD30B;

class IceMetricsTest : public IntakeTest {
 protected:
  static MetricDictionary parsed(std::string_view hexId, const MetricDictionary& dictionary) {
    return MetricService::parseIceMetric(hexId, dictionary);
  }
  /// The value that a rule makes of one element's entry.
  static std::string converted(std::string_view hexId, std::string_view listKey, std::string_view key,
                               const MetricValue& value, std::string_view resultKey) {
    const MetricDictionary result = parsed(hexId, dictionaryOf({{listKey, listOf({dictionaryOf({{key, value}})})}}));
    const MetricValue* found = result.find(resultKey);
    return found == nullptr ? "none" : logText(*found);
  }
};

TEST_F(IceMetricsTest, CarriersAreConvertedFromHundredths) {
  const auto carrier = [](std::string_view key, const MetricValue& value) {
    return converted("3CD313", "scc_list", key, value, "0-section-" + std::string(key));
  };
  EXPECT_EQ(carrier("rsrp", integerOf(-9250)), "-92") << "toward zero";
  EXPECT_EQ(carrier("rsrp", integerOf(9299)), "92");
  EXPECT_EQ(carrier("rsrp", integerOf(-99)), "0");
  EXPECT_EQ(carrier("rssi", integerOf(-6512)), "-65");
  EXPECT_EQ(carrier("rsrq", integerOf(-1250)), "-12.5");
  EXPECT_EQ(carrier("rsrq", integerOf(-1200)), "-12.0") << "a computed float keeps its fraction";
  EXPECT_EQ(carrier("rsrq", integerOf(-1233)), "-12.33");
  EXPECT_EQ(carrier("rsrq", decodedFloat(-1250)), "-12.5");
  EXPECT_EQ(carrier("snr", integerOf(-1250)), "-1250") << "stays in hundredths";
}

TEST_F(IceMetricsTest, ABandwidthCodeBecomesMegahertzOrGoes) {
  const auto bandwidth = [](const MetricValue& value) {
    return converted("3CD313", "scc_list", "dl_bandwidth", value, "0-section-dl_bandwidth");
  };
  EXPECT_EQ(bandwidth(integerOf(0)), "1.4");
  EXPECT_EQ(bandwidth(integerOf(1)), "3.0");
  EXPECT_EQ(bandwidth(integerOf(2)), "5.0");
  EXPECT_EQ(bandwidth(integerOf(3)), "10.0");
  EXPECT_EQ(bandwidth(integerOf(4)), "15.0");
  EXPECT_EQ(bandwidth(integerOf(5)), "20.0");
  EXPECT_EQ(bandwidth(integerOf(6)), "none");
  EXPECT_EQ(bandwidth(integerOf(9)), "none");
  EXPECT_EQ(bandwidth(integerOf(-1)), "none");
  EXPECT_EQ(bandwidth(std::uint64_t{3}), "10.0");
  EXPECT_EQ(bandwidth(textOf("N50")), "N50") << "no integer";
}

TEST_F(IceMetricsTest, AValueOfAnotherKindStaysAsItIs) {
  EXPECT_EQ(converted("3CD313", "scc_list", "rsrp", textOf("-9250"), "0-section-rsrp"), "-9250");
  EXPECT_EQ(converted("3CD313", "scc_list", "rsrp", decodedFloat(-92.5F), "0-section-rsrp"), "-92.5");
  EXPECT_EQ(converted("3CD313", "scc_list", "rsrq", textOf("-1250"), "0-section-rsrq"), "-1250");
  EXPECT_EQ(converted("3CD009", "gsm_ncell_meas", "rxlev", textOf("35"), "rxlev"), "35");
  EXPECT_EQ(converted("3CD105", "meas_utra_result", "ecno", bytesOf("x"), "ecno"), "<1 bytes>");
}

TEST_F(IceMetricsTest, NeighborCellsAreShiftedAndScaled) {
  EXPECT_EQ(converted("3CD009", "gsm_ncell_meas", "rxlev", std::uint64_t{35}, "rxlev"), "-75");
  EXPECT_EQ(converted("3CD105", "meas_utra_result", "rscp", integerOf(20), "rscp"), "-96");
  EXPECT_EQ(converted("3CD105", "meas_utra_result", "ecno", std::uint64_t{10}, "ecno"), "-19.5");
  EXPECT_EQ(converted("3CD105", "meas_utra_result", "ecno", std::uint64_t{49}, "ecno"), "0.0");
  EXPECT_EQ(converted("3CD105", "meas_utra_result", "ecno", std::uint64_t{11}, "ecno"), "-19.0");
}

TEST_F(IceMetricsTest, StepsAtTheEndsOfTheIntegerRangeDoNotStopTheProcess) {
  EXPECT_EQ(
      converted("3CD009", "gsm_ncell_meas", "rxlev", integerOf(std::numeric_limits<std::int64_t>::min()), "rxlev"),
      "9223372036854775698");
  EXPECT_EQ(converted("3CD009", "gsm_ncell_meas", "rxlev", std::numeric_limits<std::uint64_t>::max(), "rxlev"),
            "18446744073709551615");
  EXPECT_EQ(
      converted("3CD313", "scc_list", "rsrp", integerOf(std::numeric_limits<std::int64_t>::min()), "0-section-rsrp"),
      "-92233720368547758");
}

TEST_F(IceMetricsTest, CarriersKeepApartByNumberedSectionsEachWithTheTimestamp) {
  EXPECT_EQ(parsed("3CD313", dictionaryOf({{"timestamp", std::uint64_t{1000}},
                                           {"scc_list", listOf({dictionaryOf({{"pci", 1}}), dictionaryOf({{"pci", 2}}),
                                                                dictionaryOf({{"pci", 3}})})},
                                           {"subs_id", 1}})),
            dictionaryOf({{"0-section-pci", 1},
                          {"0-section-timestamp", std::uint64_t{1000}},
                          {"1-section-pci", 2},
                          {"1-section-timestamp", std::uint64_t{1000}},
                          {"2-section-pci", 3},
                          {"2-section-timestamp", std::uint64_t{1000}},
                          {"subs_id", 1}}));
}

TEST_F(IceMetricsTest, WithoutTimestampTheCarriersGetNone) {
  EXPECT_EQ(parsed("3CD313", dictionaryOf({{"scc_list", listOf({dictionaryOf({{"pci", 1}})})}})),
            dictionaryOf({{"0-section-pci", 1}}));
}

TEST_F(IceMetricsTest, AnEmptyCarrierCostsTheOneBehindItAsMeant) {
  const auto carriers = [](std::initializer_list<MetricDictionary> elements) {
    return parsed("3CD313", dictionaryOf({{"timestamp", 7}, {"scc_list", listOf(elements)}}));
  };
  const MetricDictionary first = dictionaryOf({{"pci", 1}});
  const MetricDictionary second = dictionaryOf({{"pci", 2}});
  const MetricDictionary third = dictionaryOf({{"pci", 3}});
  // The empty one stands at place 1 and takes what stands there after the leading one went: the one behind it.
  EXPECT_EQ(carriers({MetricDictionary(), first, second}),
            dictionaryOf({{"1-section-pci", 2}, {"1-section-timestamp", 7}}));
  EXPECT_EQ(carriers({first, MetricDictionary(), second, third}),
            dictionaryOf(
                {{"0-section-pci", 1}, {"0-section-timestamp", 7}, {"2-section-pci", 3}, {"2-section-timestamp", 7}}));
  // At the end of the list there is nothing to take.
  EXPECT_EQ(carriers({first, MetricDictionary()}), dictionaryOf({{"0-section-pci", 1}, {"0-section-timestamp", 7}}));
  EXPECT_EQ(carriers({MetricDictionary(), MetricDictionary()}), MetricDictionary());
}

TEST_F(IceMetricsTest, ThePlainMergeLetsTheLastElementWinKeyByKey) {
  const MetricDictionary merged =
      parsed("3CD50D", dictionaryOf({{"timestamp", 7},
                                     {"bearer_context_count", 2},
                                     {"bearer_contexts", listOf({dictionaryOf({{"cid", 1}, {"apn", textOf("ims")}}),
                                                                 dictionaryOf({{"cid", 2}, {"nsapi", 6}})})},
                                     {"subs_id", 1}}));
  EXPECT_EQ(merged, dictionaryOf({{"cid", 2}, {"apn", textOf("ims")}, {"nsapi", 6}, {"subs_id", 1}}));
}

TEST_F(IceMetricsTest, ThePlainMergeIgnoresEmptyElements) {
  EXPECT_EQ(parsed("3CD30B", dictionaryOf({{"carrier_info", listOf({MetricDictionary(), dictionaryOf({{"a", 1}}),
                                                                    MetricDictionary()})}})),
            dictionaryOf({{"a", 1}}));
}

TEST_F(IceMetricsTest, TheModeOfTheTopLevelReplacesThatOfTheReceivers) {
  const auto merged = [](Entries top, const MetricDictionary& element) {
    MetricDictionary dictionary = dictionaryOf(top);
    dictionary.set("rx_info", listOf({element}));
    return parsed("3CD102", dictionary);
  };
  EXPECT_EQ(merged({{"connected_mode", true}}, dictionaryOf({{"rssi", -70}})),
            dictionaryOf({{"rssi", -70}, {"connected_mode", true}}));
  EXPECT_EQ(merged({{"connected_mode", true}}, dictionaryOf({{"connected_mode", false}, {"rssi", -70}})),
            dictionaryOf({{"rssi", -70}, {"connected_mode", true}}));
  EXPECT_EQ(merged({}, dictionaryOf({{"connected_mode", false}, {"rssi", -70}})), dictionaryOf({{"rssi", -70}}));
  EXPECT_EQ(merged({{"connected_mode", true}}, MetricDictionary()), MetricDictionary()) << "an empty element stays";
}

TEST_F(IceMetricsTest, EachRuleReadsItsOwnListAndDropsTheRestOfTheTopLevel) {
  const std::pair<std::string_view, std::string_view> rules[] = {
      {"3CD50D", "bearer_contexts"},  {"3CD30B", "carrier_info"}, {"3CD009", "gsm_ncell_meas"}, {"3CD102", "rx_info"},
      {"3CD105", "meas_utra_result"}, {"3C0013", "ef"},           {"3CD302", "tx_power_info"}};
  for (const auto& [hexId, listKey] : rules) {
    MetricDictionary dictionary = dictionaryOf({{"timestamp", 7}, {"other", 8}, {"subs_id", 1}});
    dictionary.set(listKey, listOf({dictionaryOf({{"a", 1}})}));
    for (const auto& [otherId, otherKey] : rules)
      if (otherKey != listKey) dictionary.set(otherKey, listOf({dictionaryOf({{"b", 2}})}));
    EXPECT_EQ(parsed(hexId, dictionary), dictionaryOf({{"a", 1}, {"subs_id", 1}})) << hexId;
  }
}

TEST_F(IceMetricsTest, WithoutAListOfDictionariesOnlyTheSubscriptionIdIsLeft) {
  for (const std::string_view hexId : MetricService::edgeCaseIceMetrics) {
    EXPECT_EQ(parsed(hexId, dictionaryOf({{"timestamp", 7}, {"subs_id", 1}})), dictionaryOf({{"subs_id", 1}}));
    for (const MetricValue& value : {integerOf(1), numbersOf({1}), numbersOf({}), textOf("x"), listOf({}),
                                     MetricValue(dictionaryOf({{"a", 1}}))}) {
      MetricDictionary dictionary = dictionaryOf({{"subs_id", 1}});
      for (const char* key : {"scc_list", "bearer_contexts", "carrier_info", "gsm_ncell_meas", "rx_info",
                              "meas_utra_result", "ef", "tx_power_info"})
        dictionary.set(key, value);
      EXPECT_EQ(parsed(hexId, dictionary), dictionaryOf({{"subs_id", 1}})) << hexId << ' ' << logText(value);
    }
  }
}

TEST_F(IceMetricsTest, ASubscriptionIdThatDoesNotFitIsLeftOut) {
  EXPECT_EQ(parsed("3CD50D", dictionaryOf({{"subs_id", integerOf(2147483648)}})), MetricDictionary());
  EXPECT_EQ(parsed("3CD50D", dictionaryOf({{"subs_id", textOf("1")}})), MetricDictionary());
  EXPECT_EQ(parsed("3CD50D", MetricDictionary()), MetricDictionary());
}

TEST_F(IceMetricsTest, AnIdWithoutRuleAnswersNothingAtAll) {
  EXPECT_EQ(parsed("3CD301", dictionaryOf({{"scc_list", listOf({dictionaryOf({{"a", 1}})})}, {"subs_id", 1}})),
            MetricDictionary());
  EXPECT_EQ(parsed("3cd313", dictionaryOf({{"subs_id", 1}})), MetricDictionary());
}

TEST_F(IceMetricsTest, TheDictionaryGivenStaysUnchanged) {
  const MetricDictionary dictionary = dictionaryOf(
      {{"timestamp", 7}, {"scc_list", listOf({dictionaryOf({{"rsrp", -9250}, {"dl_bandwidth", 9}})})}, {"subs_id", 1}});
  const MetricDictionary before = dictionary;
  parsed("3CD313", dictionary);
  EXPECT_EQ(dictionary, before);
}

TEST_F(IceMetricsTest, LogsTheId) {
  parsed("3CD313", MetricDictionary());
  EXPECT_EQ(log.lines(), (std::vector<LogLine>{{"metric-service", LogLevel::Default,
                                                "MetricService - parseIceMetric - metricID 3CD313"}}));
}

class IceDeviceTest : public IntakeTest {
 protected:
  IceDeviceTest() {
    deviceIsIce();
    serviceStarts();
  }
};

TEST_F(IceDeviceTest, ACaStatusWithThreeCarriers) {
  metricArrives(kCaStatus, Payload()
                               .number(1, 1700000000123)
                               .message(2, Payload().number(1, 1).number(6, 3).signedNumber(11, -9250))
                               .message(2, Payload().number(1, 2).number(6, 0).signedNumber(12, -1250))
                               .message(2, Payload().number(1, 3).number(6, 9).signedNumber(14, -6512))
                               .number(15, 1));
  EXPECT_EQ(rows(),
            (std::vector<std::string>{
                "0-section-index=1 INT", "0-section-dl_bandwidth=10.0 INT", "0-section-rsrp=-92 INT",
                "0-section-timestamp=1700000000123 INT", "1-section-index=2 INT", "1-section-dl_bandwidth=1.4 INT",
                "1-section-rsrq=-12.5 INT", "1-section-timestamp=1700000000123 INT", "2-section-index=3 INT",
                "2-section-rssi=-65 INT", "2-section-timestamp=1700000000123 INT", "subs_id=1 INT"}));
  EXPECT_EQ(store.rows[0].collectedOn, Date(std::chrono::milliseconds(1700000000123)))
      << "the date comes from what was decoded";
}

TEST_F(IceDeviceTest, ActiveBearersKeepTheSecondContext) {
  metricArrives(kActiveBearers, Payload()
                                    .number(2, 2)
                                    .message(3, Payload().number(1, 5).bytes(3, "ims"))
                                    .message(3, Payload().number(1, 6))
                                    .number(15, 1));
  const std::vector<std::string> written = rows();
  ASSERT_EQ(written.size(), 9U);
  EXPECT_EQ(std::vector<std::string>(written.begin(), written.begin() + 3),
            (std::vector<std::string>{"cid=6 INT", "apn=ims STRING", "subs_id=1 INT"}));
}

TEST_F(IceDeviceTest, AUmtsServingCellCarriesItsMode) {
  metricArrives(kUmtsServingCell,
                Payload().number(1, 5).number(2, 1).message(3, Payload().signedNumber(1, -70)).number(15, 0));
  EXPECT_EQ(rows(), (std::vector<std::string>{"rssi=-70 INT", "connected_mode=1 INT", "subs_id=0 INT"}));
}

TEST_F(IceDeviceTest, UmtsNeighborCellsGoToThreeRowsOfTheCatalogue) {
  metricArrives(kUmtsNeighborCells, Payload().message(2, Payload().number(4, 10).signedNumber(5, 20)).number(15, 1));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"UMTS/UMTS Neighbor Cell Meas", "UMTS/GSM Neighbor Cell Meas",
                                                   "UMTS/LTE Neighbor Cell Meas"}));
  EXPECT_EQ(rows("GSM Neighbor Cell Meas"),
            (std::vector<std::string>{"ecno=-19.5 INT", "rscp=-96 INT", "subs_id=1 INT"}));
}

TEST_F(IceDeviceTest, SimFilesKeepTheLastFileWithoutItsContent) {
  metricArrives(kSimFiles, Payload()
                               .number(1, 5)
                               .message(2, Payload().number(1, 0x6F07).bytes(2, "\x08\x49"))
                               .message(2, Payload().number(1, 0x6FAD).bytes(2, "\x01"))
                               .number(15, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"ef_id=28589 INT", "subs_id=1 INT"}));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"Device Info/SIM Files"}));
  EXPECT_EQ(unknownValueLines(), (std::vector<std::string>{"unknown attributevalue  ---> <1 bytes>"}));
}

TEST_F(IceDeviceTest, LteTxPowerKeepsTheLastFrameAndHasNoTimestamp) {
  metricArrives(kLteTxPower, Payload()
                                 .number(1, 1700000000123)
                                 .message(2, Payload().signedNumber(1, -8).signedNumber(2, -12).number(3, 4))
                                 .message(2, Payload().signedNumber(2, 23).number(3, 5))
                                 .bytes(3, "call")
                                 .number(10, 3)
                                 .number(15, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"dpcch_tx_power=-8 INT", "total_tx_power=23 INT", "frame_index=5 INT",
                                              "subs_id=1 INT"}));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"LTE/Tx Power"}));
  EXPECT_EQ(store.rows[0].collectedOn, Date(std::chrono::milliseconds(1700000000123)));
}

TEST_F(IceDeviceTest, ComponentCarriersNameTheirBandwidthUnconverted) {
  metricArrives(kComponentCarriers, Payload()
                                        .number(1, 5)
                                        .number(2, 1300)
                                        .number(5, 100)
                                        .message(11, Payload().number(1, 1300).number(2, 3).number(3, 3))
                                        .message(11, Payload().number(1, 3100).number(2, 5).number(3, 7))
                                        .number(15, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"dl_earfcn=3100 INT", "dl_bandwidth=LTE_BW_20M STRING",
                                              "dl_rf_band=7 INT", "subs_id=1 INT"}));
  EXPECT_EQ(rowGroups(), (std::vector<std::string>{"LTE/Component Carrier Info"}));
}

TEST_F(IceDeviceTest, WithoutElementsOneRowIsWritten) {
  metricArrives(kCaStatus, Payload().number(1, 1700000000123).number(15, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"subs_id=1 INT"}));
}

TEST_F(IceDeviceTest, WithoutSubscriptionIdNoneIs) {
  metricArrives(kCaStatus, Payload().number(1, 5).message(2, Payload().number(1, 1)));
  EXPECT_TRUE(store.rows.empty());
}

TEST_F(IceDeviceTest, OtherIceMetricsAreStoredAsDecoded) {
  metricArrives(3986700,
                Payload().number(1, 1000).number(2, 2).message(6, Payload().number(1, 300).number(2, 5)).number(15, 1));
  EXPECT_EQ(rows(), (std::vector<std::string>{"timestamp=1000 INT", "reg_status=KREG_STATUS_LIMITED_SERVICE STRING",
                                              "subs_id=1 INT", "guti_mmegi=300 INT", "guti_mmec=5 INT"}));
}

}  // namespace
}  // namespace quorl::test
