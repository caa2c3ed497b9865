#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "telephony/CellDictionary.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::Pair;

constexpr std::int64_t operator""_i(unsigned long long value) {
  return static_cast<std::int64_t>(value);
}

std::string show(const HVCellValue& value) {
  if (const auto* text = std::get_if<std::string>(&value)) return "text " + *text;
  if (const auto* number = std::get_if<std::int64_t>(&value)) return "integer " + std::to_string(*number);
  return "unknown " + std::get<HVUnknownValue>(value).typeName;
}

/// The merged dictionary in readable form, in its order.
std::vector<std::pair<std::string, std::string>> merge(HVCellDictionary cell, std::optional<std::int64_t> rsrp = -95) {
  HVCellInfo info;
  info.legacyInfo.emplace().emplace_back(std::move(cell));
  std::vector<std::pair<std::string, std::string>> result;
  const auto merged = mergedCellDictionary(info, {rsrp, ""});
  if (!merged) return {{"no dictionary", ""}};
  for (const auto& [key, value] : *merged) result.emplace_back(key, show(value));
  return result;
}

TEST(CellDictionaryTest, RsrpIsTheMeasurementsAndNotTheCells) {
  EXPECT_THAT(merge({{"kHVCellMonitorRSRP", 7_i}}, -101),
              ElementsAre(Pair("kHVCellMonitorRSRP", "integer -101"), Pair("PLMN", "text 0 0")));
}

TEST(CellDictionaryTest, MeasurementWithoutRsrpRemovesTheEntryAndNoOther) {
  EXPECT_THAT(merge({{"kHVCellMonitorRSRP", -80_i}, {"kHVCellMonitorTAC", 12_i}}, std::nullopt),
              ElementsAre(Pair("kHVCellMonitorTAC", "integer 12"), Pair("PLMN", "text 0 0")));
}

TEST(CellDictionaryTest, MeasurementAddsNoRsrpThatTheCellDidNotHave) {
  EXPECT_THAT(merge({{"kHVCellMonitorTAC", 12_i}}, -80),
              ElementsAre(Pair("kHVCellMonitorTAC", "integer 12"), Pair("PLMN", "text 0 0")));
}

TEST(CellDictionaryTest, RsrqAndSectorPositionAreDroppedWhateverTheirType) {
  EXPECT_THAT(merge({{"kHVCellMonitorRSRQ", -11_i},
                     {"kHVCellMonitorSectorLat", std::string("0.5")},
                     {"kHVCellMonitorSectorLong", HVUnknownValue{"double"}}}),
              ElementsAre(Pair("PLMN", "text 0 0")));
}

TEST(CellDictionaryTest, IntegerMccAndMncAreDrawnTogetherUnderPlmn) {
  EXPECT_THAT(merge({{"kHVCellMonitorMNC", 1_i}, {"kHVCellMonitorMCC", 310_i}}),
              ElementsAre(Pair("PLMN", "text 310 1")));
}

TEST(CellDictionaryTest, CellWithoutMccAndMncStillHasThePlmn0And0) {
  EXPECT_THAT(merge({}), ElementsAre(Pair("PLMN", "text 0 0")));
}

TEST(CellDictionaryTest, MccAsTextStaysAnOrdinaryEntryAndPlmnShows0InItsPlace) {
  EXPECT_THAT(merge({{"kHVCellMonitorMCC", std::string("001")}, {"kHVCellMonitorMNC", 1_i}}),
              ElementsAre(Pair("kHVCellMonitorMCC", "text 001"), Pair("PLMN", "text 0 1")));
}

TEST(CellDictionaryTest, MncOfUnknownKindStaysAnOrdinaryEntry) {
  EXPECT_THAT(merge({{"kHVCellMonitorMCC", 1_i}, {"kHVCellMonitorMNC", HVUnknownValue{"double"}}}),
              ElementsAre(Pair("kHVCellMonitorMNC", "unknown double"), Pair("PLMN", "text 1 0")));
}

TEST(CellDictionaryTest, OtherEntriesKeepTheirOrderAndPlmnComesLast) {
  EXPECT_THAT(
      merge({{"kHVCellMonitorTAC", 5_i}, {"kHVCellMonitorMCC", 1_i}, {"kHVCellMonitorCellId", std::string("a")}}),
      ElementsAre(Pair("kHVCellMonitorTAC", "integer 5"), Pair("kHVCellMonitorCellId", "text a"),
                  Pair("PLMN", "text 1 0")));
}

TEST(CellDictionaryTest, PlmnOfTheClientGivesWayToOurs) {
  EXPECT_THAT(merge({{"PLMN", std::string("99999")}}), ElementsAre(Pair("PLMN", "text 0 0")));
}

TEST(CellDictionaryTest, OnlyTheFirstDictionaryCounts) {
  HVCellInfo info;
  info.legacyInfo = {{HVCellDictionary{}, HVCellDictionary{{"kHVCellMonitorTAC", 5_i}}}};
  EXPECT_EQ(mergedCellDictionary(info, {-90, ""})->size(), 1U);
}

TEST(CellDictionaryTest, NoListOrAFirstElementThatIsNoDictionaryGivesNothing) {
  EXPECT_FALSE(mergedCellDictionary({}, {-90, ""}));
  HVCellInfo info;
  info.legacyInfo = {{std::nullopt, HVCellDictionary{}}};
  EXPECT_FALSE(mergedCellDictionary(info, {-90, ""}));
}

TEST(CellDictionaryDeathTest, EmptyListIsAFaultOfTheClient) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  HVCellInfo info;
  info.legacyInfo.emplace();
  EXPECT_DEATH(mergedCellDictionary(info, {-90, ""}),
               "Fatal error: HorvaneService: the telephony client sent cell info with an empty list");
}

}  // namespace
}  // namespace quorl
