#include <limits>

#include <gtest/gtest.h>

#include "messages/Wire.h"
#include "messages/classes/cdma.h"
#include "messages/classes/lte_carrier_aggregation.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/wcdma_connection.h"
#include "messages/classes/wcdma_statistics.h"

namespace quorl {
namespace {

/// The value of a key that must be there, as one kind.
template <typename T>
const T& value(const MetricDictionary& dictionary, std::string_view key) {
  const MetricValue* found = dictionary.find(key);
  if (found == nullptr || found->get<T>() == nullptr) throw std::logic_error(std::string(key));
  return *found->get<T>();
}

TEST(MessageDictionaryTest, UnsignedKindsAreUnsignedNumbersOfTheirWidth) {
  KCellularEmmContext context;
  context.setTimestamp(std::numeric_limits<std::uint64_t>::max());
  context.setSubsId(std::numeric_limits<std::uint32_t>::max());
  const auto dictionary = *context.dictionaryRepresentation();
  EXPECT_EQ(value<std::uint64_t>(dictionary, "timestamp"), std::numeric_limits<std::uint64_t>::max());
  EXPECT_EQ(value<std::uint64_t>(dictionary, "subs_id"), std::numeric_limits<std::uint32_t>::max());
}

TEST(MessageDictionaryTest, SignedKindsAreSignedNumbers) {
  CellularLteRachAttempt attempt;
  attempt.setPMax(std::numeric_limits<std::int32_t>::min());
  attempt.setRsrp(-140);
  const auto dictionary = *attempt.dictionaryRepresentation();
  EXPECT_EQ(value<std::int64_t>(dictionary, "p_max"), std::numeric_limits<std::int32_t>::min());
  EXPECT_EQ(value<std::int64_t>(dictionary, "rsrp"), -140);
}

TEST(MessageDictionaryTest, BoolIsABooleanNumber) {
  KCellularEmmContext context;
  context.setIsImsVoiceSupported(true);
  const auto dictionary = *context.dictionaryRepresentation();
  EXPECT_TRUE(value<bool>(dictionary, "is_ims_voice_supported"));
  EXPECT_EQ(dictionary.find("is_ims_voice_supported")->integer(), 1);
}

TEST(MessageDictionaryTest, EnumerationIsItsNameOrTellsThatItIsUnknown) {
  KCellularEmmContext context;
  context.setRegStatus(KREG_STATUS_SUSPENDED);
  context.setRejectCause(1);
  const auto dictionary = *context.dictionaryRepresentation();
  EXPECT_EQ(value<Text>(dictionary, "reg_status"), "KREG_STATUS_SUSPENDED");
  EXPECT_EQ(value<Text>(dictionary, "reject_cause"), "(unknown: 1)");
}

TEST(MessageDictionaryTest, AUmtsHistoryNamesItsStatesAsLteDoesAsMeant) {
  CellularUmtsRrcStateHist history;
  auto state = makeMessageRef<StateHist>();
  state->setRrcState(4);
  history.addStateHist(state);
  EXPECT_EQ(test::dictionaryText(history), "[state_hist: [[rrc_state: LTE_RRC_CONNECTED]]]");
}

TEST(MessageDictionaryTest, ByteStringAndTextAreTheirOwnContent) {
  BearerContext bearer;
  bearer.setApn(Text("internet"));
  bearer.setPdpAddr(ByteString(std::string_view("\x0A\x00\x00\x01", 4)));
  const auto dictionary = *bearer.dictionaryRepresentation();
  EXPECT_EQ(value<Text>(dictionary, "apn"), "internet");
  EXPECT_EQ(value<ByteString>(dictionary, "pdp_addr"), *bearer.pdpAddr());
}

TEST(MessageDictionaryTest, ChildrenAreDictionaries) {
  KCellularEmmContext context;
  auto guti = makeMessageRef<Guti>();
  guti->setMTmsi(4);
  context.setGuti(guti);
  auto area = makeMessageRef<KCellularTrackingAreaId>();
  area->setTac(7);
  context.addTaiList(area);
  context.addTaiList(makeMessageRef<KCellularTrackingAreaId>());
  const auto dictionary = *context.dictionaryRepresentation();
  EXPECT_EQ(logText(value<MetricDictionary>(dictionary, "guti")), "[m_tmsi: 4]");
  const auto& areas = value<MetricDictionaryList>(dictionary, "tai_list");
  ASSERT_EQ(areas.size(), 2U);
  EXPECT_EQ(logText(areas[0]), "[tac: 7]");
  EXPECT_TRUE(areas[1].empty());
}

TEST(MessageDictionaryTest, EmptyListIsThereAndEmptyArrayIsNotAsMeant) {
  const CellMetric metric;
  EXPECT_EQ(test::dictionaryText(metric),
            "[sf_scheduled_by_state: [], size_tb_total_by_state: [], sf_scheduled_by_type: [], "
            "size_tb_total_by_type: [], ul_sf_scheduled_by_state: [], ul_size_tb_total_by_state: [], "
            "ul_sf_scheduled_by_type: [], ul_size_tb_total_by_type: []]");
  EXPECT_EQ(test::dictionaryText(KCellularEmmContext()), "[:]");
}

TEST(MessageDictionaryTest, ArrayThatWasClearedIsNotThere) {
  KCellularEmmContext context;
  context.addTaiList(makeMessageRef<KCellularTrackingAreaId>());
  context.clearTaiLists();
  EXPECT_EQ(test::dictionaryText(context), "[:]");
}

TEST(MessageDictionaryTest, ListsAreNumbers) {
  CellMetric metric;
  metric.addSizeTbTotalByState(std::numeric_limits<std::uint64_t>::max());
  const auto dictionary = *metric.dictionaryRepresentation();
  const auto& numbers = value<NumberList>(dictionary, "size_tb_total_by_state");
  EXPECT_FALSE(numbers.isSigned);
  EXPECT_EQ(numbers.bits, (std::vector<std::uint64_t>{std::numeric_limits<std::uint64_t>::max()}));
}

TEST(MessageDictionaryTest, DictionaryIsIndependentOfTheMessage) {
  MetricDictionary dictionary;
  {
    BearerContext bearer;
    bearer.setApn(Text("internet"));
    bearer.setCid(3);
    dictionary = *bearer.dictionaryRepresentation();
  }
  EXPECT_EQ(logText(dictionary), "[cid: 3, apn: internet]");
}

TEST(MessageDictionaryTest, DescriptionIsTheClassAndTheDictionary) {
  Guti guti;
  EXPECT_EQ(guti.description(), "<Guti> [:]");
  guti.setMmegi(1);
  EXPECT_EQ(guti.description(), "<Guti> [mmegi: 1]");
}

TEST(MessageDictionaryTest, DescriptionOfAMessageWithoutDictionaryShowsNone) {
  Guti guti;
  test::read(guti, "08");
  EXPECT_EQ(guti.description(), "<Guti> (null)");
}

}  // namespace
}  // namespace quorl
