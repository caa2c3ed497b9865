#include "telephony/HorvaneServiceFixture.h"

namespace quorl::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

using HorvaneServiceSelectionTest = HorvaneServiceTest;

TEST_F(HorvaneServiceSelectionTest, AbsentCarrierMapPostsNothingAtAll) {
  insertSim(1, "Testnet One");
  telephony.providers.reset();
  telephony.slots[1].cell.reset();
  hardware().setCurrentSubsId(7);
  start();
  EXPECT_TRUE(logged("HorvaneService - processCarrierInfo"));
  EXPECT_THAT(posted, IsEmpty());
  EXPECT_EQ(hardware().currentSubsId(), 7);
}

TEST_F(HorvaneServiceSelectionTest, SelectionIsPostedBeforeTheCarriers) {
  insertSim(1, "Testnet One");
  telephony.slots[1].cell.reset();
  start();
  EXPECT_THAT(posted, ElementsAre("subsIdSelectionChange", "carrierUpdate"));
}

TEST_F(HorvaneServiceSelectionTest, CarrierWithoutANameLeavesTheOldOne) {
  insertSim(1, "Testnet One");
  start();
  telephony.providers->insert_or_assign(simSlotKeyForSlot(1), HVCarrier{});
  monitor(1, true);
  EXPECT_EQ(carriers()[0].carrierName, "Testnet One");
}

TEST_F(HorvaneServiceSelectionTest, CarrierNameThatComesLateFillsTheRecord) {
  insertSim(1, "Testnet One");
  telephony.providers->clear();
  start();
  EXPECT_EQ(carriers()[0].carrierName, "");
  telephony.providers->insert_or_assign(simSlotKeyForSlot(1), HVCarrier{"Testnet One"});
  monitor(1, true);
  EXPECT_EQ(carriers()[0].carrierName, "Testnet One");
}

TEST_F(HorvaneServiceSelectionTest, FirstRecordsSlotDecidesWhileNoTabWasChosen) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  hardware().setCurrentSubsId(1);
  start();
  EXPECT_EQ(hardware().currentSubsId(), 0);
}

TEST_F(HorvaneServiceSelectionTest, EmptyListSelectsSubscription1) {
  insertSim(1, "Testnet One");
  start();
  EXPECT_EQ(hardware().currentSubsId(), 0);
  monitor(1, false);
  EXPECT_THAT(carriers(), IsEmpty());
  EXPECT_EQ(hardware().currentSubsId(), 1);
}

TEST_F(HorvaneServiceSelectionTest, TwoSimsCountAsAddedOnlyAfterACellMonitorUpdate) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  hardware().setTabSelectedTitle("Testnet Two");
  start();
  EXPECT_EQ(hardware().currentSubsId(), 0);  // the chosen tab is not looked at yet
  monitor(1, true);
  EXPECT_EQ(hardware().currentSubsId(), 1);
}

TEST_F(HorvaneServiceSelectionTest, LossOfASimLetsTheFirstRecordDecideAgain) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  hardware().setTabSelectedTitle("Testnet Two");
  start();
  monitor(1, true);
  monitor(2, false);
  EXPECT_THAT(slots(), ElementsAre(1));
  EXPECT_EQ(hardware().currentSubsId(), 0);
}

TEST_F(HorvaneServiceSelectionTest, ChosenTitleWithoutAMatchLeavesTheSelectionAndPostsNone) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  start();
  monitor(1, true);
  hardware().setTabSelectedTitle("Testnet Gone");
  hardware().setCurrentSubsId(7);
  posted.clear();
  telephony.slots[1].measurements.reset();
  monitor(1, true);
  EXPECT_EQ(hardware().currentSubsId(), 7);
  EXPECT_THAT(posted, ElementsAre("carrierUpdate"));
}

TEST_F(HorvaneServiceSelectionTest, CarriersOfTheChosenNameAreSelectedOneAfterTheOther) {
  insertSim(1, "Testnet");
  insertSim(2, "Testnet");
  start();
  monitor(1, true);
  hardware().setTabSelectedTitle("Testnet");
  posted.clear();
  telephony.slots[1].measurements.reset();
  monitor(1, true);
  EXPECT_THAT(posted, ElementsAre("subsIdSelectionChange", "subsIdSelectionChange", "carrierUpdate"));
  EXPECT_EQ(hardware().currentSubsId(), 1);
}

TEST_F(HorvaneServiceSelectionTest, CellMonitorUpdateFillsAnEmptyList) {
  start();
  telephony.slots[2].measurements = HVSignalStrengthMeasurements{-92, ""};
  monitor(2, true, cellOf({}));
  ASSERT_EQ(carriers().size(), 1U);
  EXPECT_EQ(carriers()[0].simSlot, 2);
  EXPECT_EQ(carriers()[0].simSlotKey, "0000000100000002");
  EXPECT_TRUE(carriers()[0].isSimPresent);
  EXPECT_EQ(hardware().currentSubsId(), 1);
}

TEST_F(HorvaneServiceSelectionTest, CellMonitorUpdateOfAnEmptySlotLeavesAnEmptyListEmpty) {
  start();
  monitor(1, false);
  EXPECT_THAT(carriers(), IsEmpty());
}

TEST_F(HorvaneServiceSelectionTest, NewcomerBesideOneRecordBecomesTheFirst) {
  insertSim(1, "Testnet One");
  start();
  insertSim(2, "Testnet Two");
  monitor(2, true);
  EXPECT_THAT(slots(), ElementsAre(2, 1));
  EXPECT_EQ(hardware().currentSubsId(), 1);
}

TEST_F(HorvaneServiceSelectionTest, UpdateOfAKnownSlotAddsNoRecord) {
  insertSim(1, "Testnet One");
  start();
  monitor(1, true);
  EXPECT_THAT(slots(), ElementsAre(1));
}

TEST_F(HorvaneServiceSelectionTest, ListOfTwoGetsNoThirdRecord) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  start();
  monitor(3, true);
  EXPECT_THAT(slots(), ElementsAre(1, 2));
}

TEST_F(HorvaneServiceSelectionTest, SlotThatLostItsSimLeavesTheList) {
  insertSim(1, "Testnet One");
  insertSim(2, "Testnet Two");
  start();
  monitor(1, false);
  EXPECT_THAT(slots(), ElementsAre(2));
  EXPECT_EQ(hardware().currentSubsId(), 1);
}

TEST_F(HorvaneServiceSelectionTest, CellMonitorUpdateStoresItsOwnCellAndAsksForCarriersThenForBands) {
  internalBuild();
  insertSim(1, "Testnet One");
  start();
  telephony.calls.clear();
  store.inserted.clear();
  monitor(1, true, cellOf({{"kHVCellMonitorTAC", std::int64_t{9}}}));
  EXPECT_THAT(telephony.calls, ElementsAre("getSignalStrengthMeasurements 1", "subscriberProviders", "getBandInfo 1"));
  EXPECT_THAT(store.values("Cell Info"), ElementsAre(std::pair("kHVCellMonitorTAC", "9"), std::pair("PLMN", "0 0")));
}

TEST_F(HorvaneServiceSelectionTest, CellMonitorUpdateIsLoggedWithoutTheCellsIdentity) {
  start();
  monitor(1, true, cellOf({{"kHVCellMonitorCellId", std::int64_t{123456789}}}));
  monitor(2, false, HVCellInfo{});
  EXPECT_TRUE(logged("context  ---> slot 1, SIM present and info ---> cell of 1 entries"));
  EXPECT_TRUE(logged("context  ---> slot 2, SIM absent and info ---> no cell"));
}

TEST_F(HorvaneServiceSelectionTest, ConnectionStateIsLoggedAndDoesNothingElse) {
  start();
  telephony.calls.clear();
  telephony.tell([](HorvaneClientDelegate& delegate) {
    delegate.connectionStateChanged(HVServiceSubscriptionContext(2, true), HVDataConnectionType::Internet,
                                    HVDataConnectionStatus::Connected);
  });
  settle();
  EXPECT_TRUE(logged("context  ---> slot 2, SIM present and connection ---> Internet and statusinfo Connected"));
  EXPECT_THAT(posted, IsEmpty());
  EXPECT_THAT(telephony.calls, IsEmpty());
}

}  // namespace
}  // namespace quorl::test
