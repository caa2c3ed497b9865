#include "telephony/HorvaneServiceFixture.h"

namespace quorl::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::Pair;

using HorvaneServiceRowsTest = HorvaneServiceTest;

TEST_F(HorvaneServiceRowsTest, CellInfoErrorIsLoggedAndGivesNoRows) {
  insertSim(1, "Testnet One");
  telephony.slots[1].cellError = HVError{"no cell"};
  start();
  EXPECT_TRUE(logged("HorvaneService - fetchCellInfo error: no cell "));
  EXPECT_FALSE(logged("incoming subscription slot  ---> 1"));
  EXPECT_THAT(store.inserted, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, AbsentCellInfoEndsSilently) {
  insertSim(1, "Testnet One");
  telephony.slots[1].cell.reset();
  start();
  EXPECT_THAT(log.texts(log_category::kHorvaneService),
              ElementsAre("HorvaneService - init", "HorvaneService - processCarrierInfo"));
  EXPECT_THAT(store.inserted, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, MeasurementIsAskedForOnlyAfterTheCellInfoCame) {
  insertSim(2, "Testnet Two");
  service = HorvaneService::make(store);
  platform.mainQueue->step();
  telephony.calls.clear();
  // The worker delivers the cell; nothing is asked before the main queue takes it up.
  auto& worker = static_cast<SteppedQueue&>(*telephony.worker);
  worker.step();
  EXPECT_THAT(telephony.calls, IsEmpty());
  EXPECT_FALSE(logged("incoming subscription slot  ---> 2"));
  platform.mainQueue->step();
  EXPECT_TRUE(logged("incoming subscription slot  ---> 2"));
  EXPECT_THAT(telephony.calls, ElementsAre("getSignalStrengthMeasurements 2"));
}

TEST_F(HorvaneServiceRowsTest, MeasurementAnswersAreTakenUpOnTheMainQueue) {
  insertSim(1, "Testnet One");
  service = HorvaneService::make(store);
  platform.mainQueue->step();
  auto& worker = static_cast<SteppedQueue&>(*telephony.worker);
  while (worker.step()) continue;
  EXPECT_THAT(platform.console.lines, IsEmpty());
  EXPECT_THAT(store.inserted, IsEmpty());
  settle();
  EXPECT_THAT(store.inserted, Not(IsEmpty()));
  EXPECT_TRUE(allOnMain);
}

TEST_F(HorvaneServiceRowsTest, FailedMeasurementIsPrintedAndStoresNothing) {
  insertSim(1, "Testnet One");
  telephony.slots[1].measurementsError = HVError{"no radio"};
  telephony.slots[1].measurements.reset();
  start();
  EXPECT_THAT(platform.console.lines, ElementsAre("error occurred no radio", "error occurred no radio"));
  EXPECT_THAT(store.inserted, IsEmpty());
  EXPECT_THAT(store.reads, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, AbsentMeasurementWithoutAnErrorIsPrintedAndStoresNothing) {
  insertSim(1, "Testnet One");
  telephony.slots[1].measurements.reset();
  start();
  EXPECT_THAT(platform.console.lines, ElementsAre("error occurred ", "error occurred "));
  EXPECT_THAT(store.inserted, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, CellRowsCarryEverythingThatTheTableWants) {
  insertSim(2, "Testnet Two");
  telephony.slots[2].cell =
      cellOf({{"kHVCellMonitorCellId", std::int64_t{4711}}, {"kHVCellMonitorCellType", std::string("serving")}});
  start();
  ASSERT_EQ(store.inserted.size(), 3U);
  const Metric& id = store.inserted[0];
  EXPECT_EQ(id.metricTech, "RAT");
  EXPECT_EQ(id.metricName, "Cell Info");
  EXPECT_EQ(id.attributeName, "kHVCellMonitorCellId");
  EXPECT_EQ(id.attributeNameNonLocalized, "kHVCellMonitorCellId");
  EXPECT_EQ(id.attributeValue, "4711");
  EXPECT_EQ(id.attributeValueType, "INT");
  EXPECT_EQ(id.collectedOn, platform.time.now());
  EXPECT_EQ(id.metricId, "Cell Info");
  EXPECT_EQ(id.subsId, 1);
  EXPECT_TRUE(id.graphable);
  EXPECT_FALSE(id.isBookmarked);
  EXPECT_FALSE(id.sectionNumber);
  const Metric& type = store.inserted[1];
  EXPECT_EQ(type.attributeValue, "serving");
  EXPECT_EQ(type.attributeValueType, "STRING");
  EXPECT_FALSE(type.graphable);
  EXPECT_NE(id.id, type.id);
  EXPECT_EQ(store.inserted[2].attributeName, "PLMN");
  EXPECT_EQ(store.inserted[2].attributeValueType, "STRING");
}

TEST_F(HorvaneServiceRowsTest, MeasuredRsrpIsStoredAndTheOneOfTheCellIsNot) {
  insertSim(1, "Testnet One");
  telephony.slots[1].cell = cellOf({{"kHVCellMonitorRSRP", std::int64_t{-44}}});
  start();
  EXPECT_THAT(store.values("Cell Info"), ElementsAre(Pair("kHVCellMonitorRSRP", "-91"), Pair("PLMN", "0 0")));
}

TEST_F(HorvaneServiceRowsTest, ValueOfUnknownKindIsLoggedAndWrittenWithEmptyTypeAndValue) {
  insertSim(1, "Testnet One");
  telephony.slots[1].cell = cellOf({{"kHVCellMonitorBandInfo", HVUnknownValue{"double"}}});
  start();
  EXPECT_TRUE(logged("unknown type  ---> double"));
  ASSERT_FALSE(store.inserted.empty());
  EXPECT_EQ(store.inserted[0].attributeName, "kHVCellMonitorBandInfo");
  EXPECT_EQ(store.inserted[0].attributeValue, "");
  EXPECT_EQ(store.inserted[0].attributeValueType, "");
}

TEST_F(HorvaneServiceRowsTest, BuilderLogsALineForEveryRow) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1}}}, HVBandDictionary{{"LTE", {1, 3}}}};
  start();
  EXPECT_EQ(log.count("HorvaneService - cellInfoDBBuilder"), store.inserted.size());
  EXPECT_EQ(store.inserted.size(), 4U);
  EXPECT_TRUE(logged("HorvaneService - cellInfoDBBuilder"));
}

TEST_F(HorvaneServiceRowsTest, EachInsertedRowIsPostedOnceOnTheMainQueue) {
  insertSim(1, "Testnet One");
  start();
  ASSERT_EQ(newMetrics.size(), store.inserted.size());
  for (std::size_t i = 0; i < newMetrics.size(); ++i) EXPECT_EQ(newMetrics[i].id, store.inserted[i].id);
  EXPECT_TRUE(allOnMain);
}

TEST_F(HorvaneServiceRowsTest, FailedInsertIsAnErrorInTheLogAndPostsNothing) {
  insertSim(1, "Testnet One");
  store.insertError = SQLiteError{SQLiteError::Case::Prepare, "disk full"};
  start();
  EXPECT_EQ(errors("error occurred while inserting  ---> Prepare(message: \"disk full\")"), 2U);
  EXPECT_THAT(newMetrics, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, TheListsIndexIsPassedAsSubscriptionIdOfTheReads) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  telephony.slots[1].cellError = HVError{"none"};
  start();
  // One merge, of the second SIM, reads for both records.
  std::vector<std::pair<std::string, int>> asked;
  for (const auto& read : store.reads) {
    EXPECT_EQ(read.metricTech, "RAT");
    EXPECT_FALSE(read.attributeName);
    asked.emplace_back(read.metricName, read.subsId);
  }
  EXPECT_THAT(asked, ElementsAre(Pair("Cell Info", 0), Pair("Active Bands", 0), Pair("Supported Bands", 0),
                                 Pair("Cell Info", 1), Pair("Active Bands", 1), Pair("Supported Bands", 1)));
}

TEST_F(HorvaneServiceRowsTest, SingleSimInTheSecondSlotReadsByIndex0SoThatItsListsStayEmpty) {
  insertSim(2, "Testnet Two");
  start();
  monitor(2, true);
  ASSERT_EQ(carriers().size(), 1U);
  EXPECT_EQ(carriers()[0].simSlotKey, "0000000100000002");
  EXPECT_THAT(carriers()[0].cellInfo, IsEmpty());
  EXPECT_EQ(hardware().currentSubsId(), 1);
  EXPECT_THAT(store.inserted, Not(IsEmpty()));
  for (const Metric& row : store.inserted) EXPECT_EQ(row.subsId, 1);
  EXPECT_THAT(store.reads, Not(IsEmpty()));
  for (const auto& read : store.reads) EXPECT_EQ(read.subsId, 0);
}

TEST_F(HorvaneServiceRowsTest, ReadRowsArriveInTheRecord) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1}}}, HVBandDictionary{{"LTE", {1, 3}}}};
  start();
  monitor(1, true);
  ASSERT_EQ(carriers().size(), 1U);
  EXPECT_EQ(carriers()[0].simSlotKey, "0000000100000001");
  EXPECT_EQ(carriers()[0].cellInfo.size(), 2U);
  ASSERT_EQ(carriers()[0].activeBands.size(), 1U);
  EXPECT_EQ(carriers()[0].activeBands[0].attributeValue, "1");
  ASSERT_EQ(carriers()[0].supportedBands.size(), 1U);
  EXPECT_EQ(carriers()[0].supportedBands[0].attributeValue, "1,3");
}

TEST_F(HorvaneServiceRowsTest, EmptyReadIsAnErrorInTheLogWithItsOwnSpellingOfOccured) {
  insertSim(1, "Testnet One");
  start();
  EXPECT_EQ(errors("error occured  ---> nil"), 2U);  // no bands on this build
}

TEST_F(HorvaneServiceRowsTest, FailedReadIsLoggedAndTheBandsKeepTheirOldRows) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1}}}, std::nullopt};
  start();
  store.readError = SQLiteError{SQLiteError::Case::EmptyQueryResult, ""};
  monitor(1, true);
  monitor(1, true);
  EXPECT_EQ(errors("error occured  ---> EmptyQueryResult"), 6U);
  EXPECT_EQ(carriers()[0].activeBands.size(), 1U);
  EXPECT_THAT(carriers()[0].cellInfo, IsEmpty());  // emptied before the read on purpose
}

TEST_F(HorvaneServiceRowsTest, CellWithoutADictionaryWritesNoRowsAndStillReads) {
  insertSim(1, "Testnet One");
  telephony.slots[1].cell = HVCellInfo{};
  start();
  EXPECT_THAT(store.inserted, IsEmpty());
  EXPECT_EQ(store.reads.size(), 3U);
}

TEST_F(HorvaneServiceRowsTest, ReadThatCompletesAfterTheListShrankIsDropped) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  store.holdsReads = true;
  start();
  monitor(1, false);
  EXPECT_THAT(slots(), ElementsAre(2));
  store.release();
  settle();
  store.holdsReads = false;
  monitor(2, true);
  EXPECT_THAT(slots(), ElementsAre(2));
}

TEST_F(HorvaneServiceRowsTest, ReadThatCompletesAfterTearDownIsDroppedWithoutAWord) {
  insertSim(1, "Testnet One");
  store.holdsReads = true;
  start();
  service.reset();
  log.clear();
  store.release();
  settle();
  EXPECT_THAT(log.texts(log_category::kHorvaneService), IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, BuildThatIsNeitherInternalNorCarrierNeverAsksForBands) {
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1}}}, std::nullopt};
  start();
  monitor(1, true);
  EXPECT_EQ(calls("getBandInfo 1"), 0U);
  EXPECT_THAT(store.values("Active Bands"), IsEmpty());
  EXPECT_THAT(carriers()[0].activeBands, IsEmpty());
  EXPECT_THAT(carriers()[0].supportedBands, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, CarrierBuildStoresBandRowsActiveBeforeSupported) {
  platform.properties.booleans["CarrierInstallCapability"] = true;
  insertSim(2, "Testnet Two");
  telephony.slots[2].bands =
      HVBandInfo{HVBandDictionary{{"NR", {78}}, {"LTE", {}}}, HVBandDictionary{{"LTE", {1, 3, 20}}}};
  telephony.slots[2].cellError = HVError{"none"};
  start();
  std::vector<std::string> rows;
  for (const Metric& row : store.inserted) {
    rows.push_back(row.metricName + ": " + row.attributeName + "=" + row.attributeValue);
    EXPECT_EQ(row.metricTech, "RAT");
    EXPECT_EQ(row.metricId, row.metricName);
    EXPECT_EQ(row.attributeNameNonLocalized, row.attributeName);
    EXPECT_EQ(row.attributeValueType, "STRING");
    EXPECT_EQ(row.subsId, 1);
    EXPECT_FALSE(row.graphable);
  }
  EXPECT_THAT(rows, ElementsAre("Active Bands: NR=78", "Active Bands: LTE=", "Supported Bands: LTE=1,3,20"));
  EXPECT_THAT(store.reads, IsEmpty());  // the next cell picks them up
}

TEST_F(HorvaneServiceRowsTest, AbsentBandDictionaryIsSkippedAndTheOtherStored) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{std::nullopt, HVBandDictionary{{"LTE", {7}}}};
  start();
  EXPECT_THAT(store.values("Active Bands"), IsEmpty());
  EXPECT_THAT(store.values("Supported Bands"), ElementsAre(Pair("LTE", "7")));
}

TEST_F(HorvaneServiceRowsTest, FailedBandRecordIsDroppedWithoutAWord) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].cell.reset();
  start();
  EXPECT_EQ(calls("getBandInfo 1"), 1U);
  EXPECT_THAT(log.texts(log_category::kHorvaneService),
              ElementsAre("HorvaneService - init", "HorvaneService - processCarrierInfo"));
  EXPECT_THAT(platform.console.lines, ElementsAre("measurements rsrp -91"));
  EXPECT_THAT(store.inserted, IsEmpty());
}

TEST_F(HorvaneServiceRowsTest, BandRecordThatMeetsAnEmptyListIsNotStored) {
  internalBuild();
  insertSim(1, "Testnet One");
  telephony.slots[1].bands = HVBandInfo{HVBandDictionary{{"LTE", {1}}}, std::nullopt};
  telephony.slots[1].measurements.reset();
  start();
  const std::size_t before = store.inserted.size();
  monitor(1, false);  // asks for the bands of the slot that just emptied the list
  EXPECT_EQ(calls("getBandInfo 1"), 2U);
  EXPECT_EQ(store.inserted.size(), before);
}

}  // namespace
}  // namespace quorl::test
