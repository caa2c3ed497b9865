#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "intake/ValueConversion.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"

namespace quorl {
namespace {

using test::LogLine;

class ValueConversionTest : public ::testing::Test {
 protected:
  void deviceHasChipset(const std::string& chipset) {
    host.properties.texts["BasebandChipset"] = chipset;
    HardwareManager::resetShared();
  }

  test::FakePlatform host;
};

TEST_F(ValueConversionTest, OnAMavBasebandABandwidthCountsResourceBlocks) {
  deviceHasChipset("mav20");
  EXPECT_EQ(processValue("dl_bw", "6"), "1.4 MHz");
  EXPECT_EQ(processValue("dl_bw", "15"), "3 MHz");
  EXPECT_EQ(processValue("dl_bw", "25"), "5 MHz");
  EXPECT_EQ(processValue("dl_bw", "50"), "10 MHz");
  EXPECT_EQ(processValue("dl_bw", "75"), "15 MHz");
  EXPECT_EQ(processValue("dl_bw", "100"), "20 MHz");
}

TEST_F(ValueConversionTest, OnAnyOtherBasebandItCountsTwiceAsMany) {
  for (const char* chipset : {"ice7", "unknown"}) {
    deviceHasChipset(chipset);
    EXPECT_EQ(processValue("dl_bw", "50"), "5 MHz");
    EXPECT_EQ(processValue("dl_bw", "200"), "20 MHz");
    EXPECT_EQ(processValue("dl_bw", "13"), "1.4 MHz") << "halves round toward zero";
    EXPECT_EQ(processValue("dl_bw", "-13"), " MHz");
  }
}

TEST_F(ValueConversionTest, TheFamilyIsSearchedInLowerCaseUnlikeElsewhere) {
  deviceHasChipset("MAV20");
  EXPECT_FALSE(HardwareManager::shared().isMavDevice());
  EXPECT_EQ(processValue("dl_bw", "50"), "10 MHz");
}

TEST_F(ValueConversionTest, OnlyThreeKeysAreBandwidths) {
  deviceHasChipset("mav20");
  EXPECT_EQ(processValue("kHVCellMonitorBandwidth", "50"), "10 MHz");
  EXPECT_EQ(processValue("ul_bw", "50"), "10 MHz");
  EXPECT_EQ(processValue("dl_bandwidth", "50"), "50");
  EXPECT_EQ(processValue("DL_BW", "50"), "50");
  EXPECT_EQ(processValue("0-section-dl_bw", "50"), "50");
  EXPECT_EQ(processValue("rat", "LTE"), "LTE");
}

TEST_F(ValueConversionTest, ABandwidthOfZeroStays) {
  deviceHasChipset("mav20");
  EXPECT_EQ(processValue("dl_bw", "0"), "0");
  EXPECT_EQ(processValue("dl_bw", "00"), " MHz");
}

TEST_F(ValueConversionTest, AnUnknownBandwidthReadsAsABareUnitAsMeant) {
  deviceHasChipset("mav20");
  for (const char* value : {"7", "", "fifty", "50.0", " 50", "50 ", "-50", "99999999999999999999", "+", "+-50"})
    EXPECT_EQ(processValue("dl_bw", value), " MHz") << '"' << value << '"';
  EXPECT_EQ(processValue("dl_bw", "+50"), "10 MHz");
}

TEST_F(ValueConversionTest, ASectionedNameShowsItsLastPiece) {
  EXPECT_EQ(processAttributeName("0-section-rsrp", "-92"), "rsrp");
  EXPECT_EQ(processAttributeName("12-section-dl_bandwidth", "10.0"), "dl_bandwidth");
  EXPECT_EQ(processAttributeName("0-section-a-b", "1"), "b");
  EXPECT_EQ(processAttributeName("0-section-", "1"), "");
}

TEST_F(ValueConversionTest, ANameWithoutSectionStays) {
  EXPECT_EQ(processAttributeName("rsrp", "-92"), "rsrp");
  EXPECT_EQ(processAttributeName("a-b", "1"), "a-b");
  EXPECT_EQ(processAttributeName("section_rsrp", "1", "1"), "section_rsrp");
}

TEST_F(ValueConversionTest, ASectionFollowsThePieceDirectly) {
  EXPECT_EQ(processAttributeName("0-section-rsrp", "-92", "1"), "rsrpCA 1");
}

TEST_F(ValueConversionTest, BothConversionsLogTheSameLineWithItsTwoBlanks) {
  deviceHasChipset("mav20");
  HardwareManager::shared();
  const test::LogRecorder log;
  processValue("dl_bw", "50");
  processAttributeName("0-section-rsrp", "-92");
  EXPECT_EQ(log.lines(),
            (std::vector<LogLine>{
                {"formatting", LogLevel::Default, "Preprocess - processValue -  key: dl_bw value: 50"},
                {"formatting", LogLevel::Default, "Preprocess - processValue -  key: 0-section-rsrp value: -92"}}));
}

}  // namespace
}  // namespace quorl
