#include <algorithm>
#include <map>
#include <set>
#include <string>

#include <gtest/gtest.h>

#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

namespace quorl {
namespace {

constexpr const char* kMetricMessages[] = {
    "CellularCallCount",
    "CellularCallEndDetails",
    "CellularCdmaCellInfo",
    "CellularCdmaTxRxHist",
    "CellularCdmaTxRxHistV2",
    "CellularCsCallGwlPageRespFail",
    "CellularFallback",
    "CellularGsmWcdmaCellInfo",
    "CellularHealthMonitor",
    "CellularLmapoOosHist",
    "CellularLqmDataStall",
    "CellularLqmStateChange",
    "CellularLteCdrxConfig",
    "CellularLteCellMetric",
    "CellularLteConnectionStats",
    "CellularLteIratCount",
    "CellularLteOtaMsg",
    "CellularLtePagingCycle",
    "CellularLteRachAttempt",
    "CellularLteRrcState",
    "CellularLteRrcStateHist",
    "CellularLteRsrpRsrqSinrHist",
    "CellularLteScellInfo",
    "CellularLteSysInfoBlocks",
    "CellularLteTxCapHist",
    "CellularLteTxRxLevelHist",
    "CellularNrBeamSwitch",
    "CellularNrConnectionStats",
    "CellularNrEndcUsageStats",
    "CellularNrEpsFallbackCallFastReturnStats",
    "CellularNrOtaMsg",
    "CellularNrRachAttempt",
    "CellularNrRadioLinkFailure",
    "CellularNrRrcConnCount",
    "CellularNrRrcResume",
    "CellularNrRrcState",
    "CellularNrSDMActivation",
    "CellularNrScellInfo",
    "CellularNrScgAddition",
    "CellularNrScgRemoval",
    "CellularNrSdmEndcRelease",
    "CellularNrSysInfoBlocks",
    "CellularNrUlPdcpStats",
    "CellularRatLacSrvInfo",
    "CellularRegAttempt",
    "CellularRegisteredPlmnStatus",
    "CellularRfTunerEvent",
    "CellularServiceStatus",
    "CellularServiceStatusHist",
    "CellularSimHplmn",
    "CellularSysOprtMode",
    "CellularUmtsRrcStateHist",
    "CellularVoiceCallEvent",
    "CellularWcdmaRachAttempt",
    "CellularWcdmaRlcThroughput",
    "CellularWcdmaRrcConnCount",
    "CellularWcdmaRrcState",
    "CellularWcdmaTxRxHist",
    "CellularWcdmaTxRxHistV2",
    "KCellularActivatedBearerContexts",
    "KCellularEmmContext",
    "KCellularGmmContext",
    "KCellularGsmCsRfMeasurement",
    "KCellularGsmGprsConfig",
    "KCellularGsmGrrEventMeasCr",
    "KCellularGsmIdleConfig",
    "KCellularGsmIdleScellMeasurement",
    "KCellularGsmScellInfo",
    "KCellularLteCarrierAggregationStatus",
    "KCellularLteCdrxConfig",
    "KCellularLteComponentCarrierInfo",
    "KCellularLteNbrEutraCellMeas",
    "KCellularLteNbrInterRatCellMeas",
    "KCellularLteRrcState",
    "KCellularLteRsrpRsrqSinr",
    "KCellularLteScellInfo",
    "KCellularLteSelReselCellInfo",
    "KCellularLteServingCellMeasurement",
    "KCellularLteTxPower",
    "KCellularMmCommonInfo",
    "KCellularMmContext",
    "KCellularSimCardFiles",
    "KCellularWcdmaCellInfo",
    "KCellularWcdmaNbrCellMeas",
    "KCellularWcdmaRrcConfiguration",
    "KCellularWcdmaRrcConnectionState",
    "KCellularWcdmaScellMeasurement",
    "KCellularWcdmaSelReselCellInfo",
    "KCellularWcdmaTxPower",
};

TEST(MessageRegistryTest, EveryClassIsMadeByItsName) {
  ASSERT_EQ(allMessageTables().size(), 158U);
  for (const MessageTable* table : allMessageTables()) {
    const auto message = makeMessage(table->className);
    ASSERT_NE(message, nullptr) << table->className;
    EXPECT_EQ(&message->table(), table);
  }
}

TEST(MessageRegistryTest, NamesAreAscendingWithoutDoubles) {
  const auto tables = allMessageTables();
  EXPECT_EQ(std::adjacent_find(tables.begin(), tables.end(),
                               [](const auto* a, const auto* b) { return a->className >= b->className; }),
            tables.end());
}

TEST(MessageRegistryTest, NamesOfTheCatalogueWithoutAClassStayWithout) {
  for (const char* name :
       {"CellularCsCallPageRespFail", "CellularLTEConnectionStats", "CellularRatRetention", "CellularVoiceLastCallEnd",
        "CellularWcdmaRachattempt", "kCellularGsmCsRfMeasurement", "kCellularGsmGprsConfig",
        "kCellularGsmGrrEventMeasCr", "kCellularGsmIdleConfig", "kCellularGsmIdleScellMeasurement"})
    EXPECT_EQ(makeMessage(name), nullptr) << name;
}

TEST(MessageRegistryTest, OnlyTheExactNameCounts) {
  for (const char* name : {"", "guti", "Gut", "Guti ", "quorl::Guti", "MetricCodable"})
    EXPECT_EQ(makeMessage(name), nullptr) << name;
}

TEST(MessageRegistryTest, MetricMessagesBeginWithTheirTimestampAndNoOtherHasOne) {
  const std::set<std::string_view> metricMessages(std::begin(kMetricMessages), std::end(kMetricMessages));
  EXPECT_EQ(metricMessages.size(), 89U);
  std::size_t found = 0;
  for (const MessageTable* table : allMessageTables()) {
    const FieldEntry& first = table->fields.front();
    const bool isMetric = metricMessages.contains(table->className);
    EXPECT_EQ(first.key == "timestamp", isMetric) << table->className;
    if (!isMetric) continue;
    ++found;
    EXPECT_EQ(first.tag, 1U) << table->className;
    EXPECT_EQ(first.kind, FieldKind::UInt64) << table->className;
  }
  EXPECT_EQ(found, metricMessages.size());
}

TEST(MessageRegistryTest, SharedKeysHaveOneKindInEveryClass) {
  for (const MessageTable* table : allMessageTables()) {
    if (table->fields.front().key != "timestamp") continue;
    for (const FieldEntry& field : table->fields) {
      if (field.key == "subs_id" || field.key == "num_subs" || field.key == "ps_pref" || field.key == "version") {
        EXPECT_EQ(field.kind, FieldKind::UInt32) << table->className << '.' << field.key;
      } else if (field.key == "plmn") {
        EXPECT_EQ(field.kind, FieldKind::Bytes) << table->className;
      }
      if (field.key == "version") {
        EXPECT_TRUE(field.tag == 2 || field.tag == 64 || field.tag == 124) << table->className;
      }
    }
  }
}

TEST(MessageRegistryTest, TheSubscriptionOfTheIceLteMessagesHasOneTagInAllButThree) {
  std::map<std::string_view, std::uint32_t> others;
  for (const MessageTable* table : allMessageTables()) {
    if (!table->className.starts_with("KCellularLte")) continue;
    const auto field = std::find_if(table->fields.begin(), table->fields.end(),
                                    [](const FieldEntry& candidate) { return candidate.key == "subs_id"; });
    ASSERT_NE(field, table->fields.end()) << table->className;
    if (field->tag != 15) others[table->className] = field->tag;
  }
  EXPECT_EQ(others, (std::map<std::string_view, std::uint32_t>{{"KCellularLteRsrpRsrqSinr", 2},
                                                               {"KCellularLteScellInfo", 127},
                                                               {"KCellularLteSelReselCellInfo", 127}}));
}

}  // namespace
}  // namespace quorl
