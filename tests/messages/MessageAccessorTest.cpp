#include <limits>
#include <stdexcept>
#include <type_traits>

#include <gtest/gtest.h>

#include "messages/MessageTable.h"
#include "messages/Wire.h"
#include "messages/classes/call_end.h"
#include "messages/classes/gsm.h"
#include "messages/classes/lte_neighbors.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/lte_serving_cell.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/nr_cell.h"
#include "messages/classes/rf_health.h"
#include "messages/classes/service_status.h"
#include "messages/classes/voice_call.h"
#include "messages/classes/wcdma_statistics.h"

namespace quorl {
namespace {

TEST(MessageAccessorTest, NewMessageHasNothing) {
  const KCellularEmmContext context;
  EXPECT_FALSE(context.hasTimestamp());
  EXPECT_EQ(context.timestamp(), 0U);
  EXPECT_FALSE(context.hasGuti());
  EXPECT_EQ(context.guti().get(), nullptr);
  EXPECT_EQ(context.taiListsCount(), 0U);
  EXPECT_FALSE(context.taiLists().isSet());
}

TEST(MessageAccessorTest, SettingAScalarSetsItsFlagAlone) {
  Guti guti;
  guti.setMmec(0);
  EXPECT_TRUE(guti.hasMmec());
  EXPECT_FALSE(guti.hasMmegi());
  EXPECT_FALSE(guti.hasMTmsi());
}

TEST(MessageAccessorTest, ClearedFlagLeavesTheValueToAPlainGetter) {
  Guti guti;
  guti.setMmegi(5);
  guti.setHasMmegi(false);
  EXPECT_FALSE(guti.hasMmegi());
  EXPECT_EQ(guti.mmegi(), 5U);
}

TEST(MessageAccessorTest, ClearedFlagMakesAnEnumerationReadAsItsDefault) {
  CellularServiceStatus status;
  EXPECT_EQ(status.srvStatus(), SYS_SRV_STATUS_NONE);
  status.setSrvStatus(SYS_SRV_STATUS_SRV);
  EXPECT_EQ(status.srvStatus(), SYS_SRV_STATUS_SRV);
  status.setHasSrvStatus(false);
  EXPECT_EQ(status.srvStatus(), -1);
}

TEST(MessageAccessorTest, EightLevelsOfTheWcdmaHistogramHaveADefault) {
  CellularWcdmaTxRxHist hist;
  EXPECT_EQ(hist.minRxLevelDbm(), -121);
  EXPECT_EQ(hist.minSecRxLevelDbm(), -121);
  EXPECT_EQ(hist.minRxLevelIdleDbm(), -121);
  EXPECT_EQ(hist.minSecRxLevelIdleDbm(), -121);
  EXPECT_EQ(hist.minTxLevelDbm(), -56);
  EXPECT_EQ(hist.minSecTxLevelDbm(), -56);
  EXPECT_EQ(hist.minAcTxLevelDbm(), -56);
  EXPECT_EQ(hist.minAdTxLevelDbm(), -56);
  hist.setMinRxLevelDbm(-100);
  EXPECT_EQ(hist.minRxLevelDbm(), -100);
  hist.setHasMinRxLevelDbm(false);
  EXPECT_EQ(hist.minRxLevelDbm(), -121);
}

TEST(MessageAccessorTest, MoreThanThirtyTwoFlagsAreKeptApart) {
  CellularVoiceCallEvent event;
  ASSERT_GT(event.table().fields.size(), 64U);
  event.setTimestamp(1);
  EXPECT_EQ(test::dictionaryText(event).substr(0, 14), "[timestamp: 1,");
  KCellularGsmIdleConfig config;
  config.setSubsId(2);
  EXPECT_EQ(test::dictionaryText(config), "[subs_id: 2]");
  config.setSi2TerNeeded(1);
  config.setHasSubsId(false);
  EXPECT_EQ(test::dictionaryText(config), "[si_2_ter_needed: 1]");
}

TEST(MessageAccessorTest, EnumerationNamesAndValues) {
  const KCellularEmmContext context;
  EXPECT_EQ(context.regStatusAsString(2), "KREG_STATUS_LIMITED_SERVICE");
  EXPECT_EQ(context.regStatusAsString(100), "KREG_STATUS_SUSPENDED");
  EXPECT_EQ(context.regStatusAsString(13), "(unknown: 13)");
  EXPECT_EQ(context.regStatusAsString(-7), "(unknown: -7)");
  EXPECT_EQ(context.regStatusAsString(std::numeric_limits<std::int32_t>::min()), "(unknown: -2147483648)");
  EXPECT_EQ(context.regStatusAsString(std::numeric_limits<std::int32_t>::max()), "(unknown: 2147483647)");
  EXPECT_EQ(context.StringAsRegStatus("KREG_STATUS_SUSPENDED"), 100);
  EXPECT_EQ(context.StringAsRegStatus("KREG_STATUS_LIMITED"), 0);
}

TEST(MessageAccessorTest, NameThatIsNotInTheEnumerationGivesItsDefault) {
  EXPECT_EQ(RbData().StringAsRlcMode("TM"), 1) << "begins with 1, which is its default";
  EXPECT_EQ(RbData().StringAsRlcMode("UM"), 2);
  const CellularServiceStatus status;
  EXPECT_EQ(status.StringAsSrvStatus(""), -1);
  EXPECT_EQ(status.StringAsSrvStatus("SYS_SRV_STATUS_CMAS_ONLY_MODE"), 101);
}

TEST(MessageAccessorTest, SystemEnumerationsHaveTheDefaultMinusOne) {
  const CellularServiceStatus status;
  EXPECT_EQ(status.srvDomainAsString(status.srvDomain()), "SYS_SRV_DOMAIN_NONE");
  EXPECT_EQ(status.roamStatusAsString(status.roamStatus()), "SYS_ROAM_STATUS_NONE");
  EXPECT_EQ(status.StringAsSrvDomain("?"), -1);
  EXPECT_EQ(status.StringAsRoamStatus("?"), -1);
  const CellularSysOprtMode mode;
  EXPECT_EQ(mode.modeAsString(mode.mode()), "SYS_OPRT_MODE_NONE");
  EXPECT_EQ(mode.StringAsMode("?"), -1);
}

TEST(MessageAccessorTest, SystemModeHasGapsAndTwoNamesForLte) {
  const EnumTable& table = enum_table::SYS_MODE;
  EXPECT_EQ(table.name(13), "(unknown: 13)");
  EXPECT_EQ(table.name(14), "(unknown: 14)");
  EXPECT_EQ(table.name(1), "SYS_MODE_LTE_V2");
  EXPECT_EQ(table.name(9), "SYS_MODE_LTE");
  EXPECT_EQ(table.value("SYS_MODE_LTE_V2"), 1);
  EXPECT_EQ(table.value("SYS_MODE_LTE"), 9);
}

TEST(MessageAccessorTest, SystemBandHasNoTwoAndNothingBetween19And40) {
  const EnumTable& table = enum_table::SYS_BAND;
  EXPECT_EQ(table.name(2), "(unknown: 2)");
  for (std::int32_t band = 20; band < 40; ++band)
    EXPECT_EQ(table.name(band), Text("(unknown: " + std::to_string(band) + ")"));
  EXPECT_EQ(table.name(19).view().substr(0, 9), "SYS_BAND_");
  EXPECT_EQ(table.name(40).view().substr(0, 9), "SYS_BAND_");
}

TEST(MessageAccessorTest, MisspeltEnumeratorsAreKeptAsMeant) {
  EXPECT_EQ(enum_table::MODULATION.name(6), "MODULATION_UNKOWN");
  EXPECT_EQ(CellularHealthMonitor::HEALTH_MONITO_FREQUENT_LTE_RACH_FAILURES, 10);
}

TEST(MessageAccessorTest, CallDirectionsDifferInTheirOrderAsMeant) {
  EXPECT_EQ(enum_table::CM_CALL_DIRECTION.name(0), "CM_CALL_DIRECTION_UNKNOWN");
  EXPECT_EQ(enum_table::VOICE_CALL_DIRECTION.name(0), "VOICE_CALL_DIRECTION_MT");
}

TEST(MessageAccessorTest, ReferencesAreReplacedAndTakenAway) {
  BearerContext bearer;
  bearer.setApn(Text("a"));
  EXPECT_TRUE(bearer.hasApn());
  EXPECT_EQ(bearer.apn(), Text("a"));
  bearer.setApn(std::nullopt);
  EXPECT_FALSE(bearer.hasApn());

  KCellularEmmContext context;
  const auto guti = makeMessageRef<Guti>();
  context.setGuti(guti);
  EXPECT_EQ(context.guti(), guti);
  guti->setMmec(1);
  EXPECT_EQ(context.guti()->mmec(), 1U) << "the message is shared";
  context.setGuti(nullptr);
  EXPECT_FALSE(context.hasGuti());
}

TEST(MessageAccessorTest, ArrayIsMadeByTheFirstAddAndOutlivesItsClearing) {
  KCellularEmmContext context;
  context.clearTaiLists();
  EXPECT_FALSE(context.taiLists().isSet());
  const auto area = makeMessageRef<KCellularTrackingAreaId>();
  context.addTaiList(area);
  EXPECT_TRUE(context.taiLists().isSet());
  EXPECT_EQ(context.taiListAtIndex(0), area);
  context.clearTaiLists();
  EXPECT_TRUE(context.taiLists().isSet());
  EXPECT_EQ(context.taiListsCount(), 0U);
}

TEST(MessageAccessorTest, ArrayCanBeSetAsAWhole) {
  KCellularEmmContext context;
  MessageArray<KCellularTrackingAreaId> areas;
  areas.add(makeMessageRef<KCellularTrackingAreaId>());
  context.setTaiLists(areas);
  EXPECT_EQ(context.taiListsCount(), 1U);
  EXPECT_EQ(context.taiListAtIndex(0), areas.atIndex(0));
  context.setTaiLists({});
  EXPECT_FALSE(context.taiLists().isSet());
}

TEST(MessageAccessorTest, IndexPastTheArrayIsARangeErrorOfTheArray) {
  KCellularEmmContext context;
  EXPECT_THROW(context.taiListAtIndex(0), std::out_of_range);
  context.addTaiList(makeMessageRef<KCellularTrackingAreaId>());
  EXPECT_NO_THROW(context.taiListAtIndex(0));
  EXPECT_THROW(context.taiListAtIndex(1), std::out_of_range);
}

TEST(MessageAccessorTest, NoneCannotBeAddedToAnArray) {
  KCellularEmmContext context;
  EXPECT_THROW(context.addTaiList(nullptr), std::invalid_argument);
  EXPECT_EQ(context.taiListsCount(), 0U);
}

TEST(MessageAccessorTest, ClassOfTheElementsIsToldByTheClass) {
  EXPECT_EQ(&KCellularEmmContext::taiListType(), &KCellularTrackingAreaId::kTable);
  EXPECT_EQ(CellularNrBeamSwitch::thenewBeamInfoType().className, "ServingCellBeamInfo");
}

TEST(MessageAccessorTest, ListOfScalars) {
  KCellularGsmCsRfMeasurement measurement;
  EXPECT_EQ(measurement.csTxPwrsCount(), 0U);
  EXPECT_EQ(measurement.csTxPwrs(), nullptr);
  measurement.addCsTxPwr(-3);
  measurement.addCsTxPwr(2);
  EXPECT_EQ(measurement.csTxPwrsCount(), 2U);
  EXPECT_EQ(measurement.csTxPwrs()[0], -3);
  EXPECT_EQ(measurement.csTxPwrAtIndex(1), 2);
  const std::int32_t values[] = {7, 8, 9};
  measurement.setCsTxPwrs(values, 3);
  EXPECT_EQ(measurement.csTxPwrsCount(), 3U);
  EXPECT_EQ(measurement.csTxPwrAtIndex(0), 7);
  measurement.clearCsTxPwrs();
  EXPECT_EQ(measurement.csTxPwrsCount(), 0U);
}

TEST(MessageAccessorTest, IndexPastAListIsARangeErrorWithIndexAndCount) {
  KCellularGsmCsRfMeasurement measurement;
  measurement.addCsTxPwr(1);
  try {
    measurement.csTxPwrAtIndex(4);
    FAIL() << "no range error";
  } catch (const std::out_of_range& error) {
    EXPECT_STREQ(error.what(), "idx (4) is out of range (1)");
  }
}

TEST(MessageAccessorTest, MembersAreStoredInTheirNaturalWidth) {
  static_assert(std::is_same_v<decltype(Guti().mmegi()), std::uint32_t>);
  static_assert(std::is_same_v<decltype(KCellularEmmContext().timestamp()), std::uint64_t>);
  static_assert(std::is_same_v<decltype(CellularLteRachAttempt().pMax()), std::int32_t>);
  static_assert(std::is_same_v<decltype(CellularLteRachAttempt().rsrp()), std::int32_t>);
  static_assert(std::is_same_v<decltype(KCellularEmmContext().regStatus()), std::int32_t>);
  // The virtual table, the reference count and its padding; flags; three numbers.
  EXPECT_EQ(sizeof(Guti), 16U + 4U + 3U * 4U);
}

TEST(MessageAccessorTest, MemberNamesAreTheCamelCasedKeys) {
  KCellularLteSelReselCellInfo info;
  info.setQRxLevMin(-1);
  info.setQHyst(1);
  info.setSNonIntraSearchP(2);
  info.setThreshServingLowP(3);
  EXPECT_EQ(test::dictionaryText(info),
            "[multi_band_info: [], QRxLevMin: -1, Q_hyst: 1, S_non_intra_search_P: 2, Thresh_serving_lowP: 3, "
            "intra_freq_pci: []]");
  KCellularGsmIdleScellMeasurement measurement;
  measurement.setIdleRxlevDBm(-90);
  EXPECT_EQ(test::dictionaryText(measurement), "[idle_rxlev_dBm: -90]");
}

TEST(MessageAccessorTest, TwoMemberNamesStandApartFromTheirKeysAsMeant) {
  CellularNrBeamSwitch beams;
  beams.addThenewBeamInfo(makeMessageRef<ServingCellBeamInfo>());
  EXPECT_EQ(beams.thenewBeamInfosCount(), 1U);
  EXPECT_EQ(test::dictionaryText(beams), "[new_beam_info: [[rx_beam_id: []]]]");
  CellularRfTunerEvent event;
  event.setThenewState(makeMessageRef<TunerState>());
  EXPECT_NE(test::dictionaryText(event).find("new_state: [:]"), std::string::npos);
}

TEST(MessageAccessorTest, PluralsThatAreNotFormedWithAnS) {
  CellularLmapoOosHist hist;
  hist.addOosStateDurationMs(5);
  EXPECT_EQ(hist.oosStateDurationMsCount(), 1U);
  EXPECT_EQ(hist.oosStateDurationMsAtIndex(0), 5U);
  KCellularActivatedBearerContexts contexts;
  contexts.addBearerContexts(makeMessageRef<BearerContext>());
  EXPECT_EQ(contexts.bearerContextsCount(), 1U);
  KCellularGsmGrrEventMeasCr measurement;
  measurement.addGsmNcellMeas(makeMessageRef<GsmNcellMeas>());
  EXPECT_EQ(measurement.gsmNcellMeasCount(), 1U);
}

TEST(MessageAccessorTest, FieldsOfOneNameInTwoClassesAreSeparate) {
  CellularVoiceCallEvent event;
  event.setCallId(Text("7"));
  CellularCallEndDetails details;
  details.setCallId(7);
  EXPECT_EQ(event.callId(), Text("7"));
  EXPECT_EQ(details.callId(), 7U);
}

TEST(MessageAccessorTest, SubscriptionHasTheTagOfItsClass) {
  const auto tagOf = [](const MessageTable& table) {
    for (const FieldEntry& field : table.fields)
      if (field.key == "subs_id") return field.tag;
    return 0U;
  };
  EXPECT_EQ(tagOf(KCellularLteScellInfo::kTable), 127U);
  EXPECT_EQ(tagOf(KCellularLteSelReselCellInfo::kTable), 127U);
  EXPECT_EQ(tagOf(KCellularLteRsrpRsrqSinr::kTable), 2U);
  EXPECT_EQ(tagOf(KCellularLteRrcState::kTable), 15U);
}

}  // namespace
}  // namespace quorl
