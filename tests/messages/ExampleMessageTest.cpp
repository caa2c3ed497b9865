#include <gtest/gtest.h>

#include "messages/Wire.h"
#include "messages/classes/gsm.h"
#include "messages/classes/nas_context.h"

namespace quorl {
namespace {

using test::dictionaryText;
using test::read;
using test::written;

constexpr char kPayload[] = "08 E8 07 10 02 32 05 08 AC 02 10 05 38 07 50 01 78 01";

TEST(ExampleMessageTest, EmmContextReadsFromItsBytes) {
  KCellularEmmContext context;
  ASSERT_TRUE(read(context, kPayload));

  EXPECT_EQ(context.timestamp(), 1000U);
  EXPECT_EQ(context.regStatus(), KREG_STATUS_LIMITED_SERVICE);
  EXPECT_EQ(context.rejectCause(), KCellularEmmContext::EMM_CAUSE_EPS_SERVICES_NOT_ALLOWED);
  EXPECT_TRUE(context.isImsVoiceSupported());
  EXPECT_EQ(context.subsId(), 1U);
  EXPECT_TRUE(context.hasTimestamp());
  EXPECT_TRUE(context.hasRegStatus());
  EXPECT_TRUE(context.hasRejectCause());
  EXPECT_TRUE(context.hasIsImsVoiceSupported());
  EXPECT_TRUE(context.hasSubsId());

  ASSERT_TRUE(context.hasGuti());
  EXPECT_EQ(context.guti()->mmegi(), 300U);
  EXPECT_EQ(context.guti()->mmec(), 5U);
  EXPECT_TRUE(context.guti()->hasMmegi());
  EXPECT_TRUE(context.guti()->hasMmec());
  EXPECT_FALSE(context.guti()->hasMTmsi());

  EXPECT_FALSE(context.hasUpdateStatus());
  EXPECT_EQ(context.updateStatus(), 0);
}

TEST(ExampleMessageTest, EmmContextHasAnEntryForEachPresentField) {
  KCellularEmmContext context;
  ASSERT_TRUE(read(context, kPayload));
  EXPECT_EQ(dictionaryText(context),
            "[timestamp: 1000, reg_status: KREG_STATUS_LIMITED_SERVICE, guti: [mmegi: 300, mmec: 5], "
            "reject_cause: EMM_CAUSE_EPS_SERVICES_NOT_ALLOWED, is_ims_voice_supported: true, subs_id: 1]");
}

TEST(ExampleMessageTest, EmmContextBuiltWithSettersWritesItsBytes) {
  KCellularEmmContext context;
  // Not the order of the table: that of the writing does not depend on it.
  context.setSubsId(1);
  context.setIsImsVoiceSupported(true);
  context.setRejectCause(7);
  auto guti = makeMessageRef<Guti>();
  guti->setMmec(5);
  guti->setMmegi(300);
  context.setGuti(guti);
  context.setRegStatus(2);
  context.setTimestamp(1000);
  EXPECT_EQ(written(context), kPayload);
}

TEST(ExampleMessageTest, PackedTransmitPowersReadInBothForms) {
  KCellularGsmCsRfMeasurement packed;
  KCellularGsmCsRfMeasurement unpacked;
  ASSERT_TRUE(read(packed, "2A 02 05 04"));
  ASSERT_TRUE(read(unpacked, "28 05 28 04"));
  EXPECT_EQ(dictionaryText(packed), "[cs_tx_pwr: [-3, 2]]");
  EXPECT_EQ(dictionaryText(unpacked), "[cs_tx_pwr: [-3, 2]]");
  EXPECT_TRUE(packed.isEqual(unpacked));
}

TEST(ExampleMessageTest, TransmitPowersAreWrittenPacked) {
  KCellularGsmCsRfMeasurement measurement;
  measurement.addCsTxPwr(-3);
  measurement.addCsTxPwr(2);
  EXPECT_EQ(written(measurement), "2A 02 05 04");
}

}  // namespace
}  // namespace quorl
