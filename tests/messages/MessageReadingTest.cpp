#include <limits>

#include <gtest/gtest.h>

#include "messages/Wire.h"
#include "messages/classes/call_end.h"
#include "messages/classes/gsm.h"
#include "messages/classes/lte_carrier_aggregation.h"
#include "messages/classes/lte_neighbors.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/nr_connection.h"
#include "messages/classes/service_status.h"
#include "messages/classes/sim.h"
#include "support/LogRecorder.h"

namespace quorl {
namespace {

using test::bytes;
using test::dictionaryText;
using test::LogRecorder;
using test::read;

TEST(MessageReadingTest, EmptyPayloadIsAMessageWithEveryFieldAbsent) {
  KCellularGsmCsRfMeasurement measurement;
  EXPECT_TRUE(read(measurement, ""));
  EXPECT_FALSE(measurement.hasTimestamp());
  EXPECT_EQ(dictionaryText(measurement), "[cs_tx_pwr: []]");
}

TEST(MessageReadingTest, NoPayloadReadsLikeAnEmptyOne) {
  KCellularGsmCsRfMeasurement measurement;
  measurement.initWithData(std::nullopt);
  EXPECT_TRUE(measurement.isReadWhole());
  EXPECT_EQ(dictionaryText(measurement), "[cs_tx_pwr: []]");
}

TEST(MessageReadingTest, InitWithDataReadsThePayload) {
  Guti guti;
  guti.initWithData(ByteString(bytes("08 AC 02")));
  EXPECT_TRUE(guti.isReadWhole());
  EXPECT_EQ(guti.mmegi(), 300U);
}

TEST(MessageReadingTest, AMessageThatCannotBeReadWholeAnswersNoDictionary) {
  Guti guti;
  guti.initWithData(ByteString(bytes("08 01 10")));
  EXPECT_FALSE(guti.isReadWhole());
  EXPECT_EQ(guti.dictionaryRepresentation(), std::nullopt);
  EXPECT_EQ(guti.mmegi(), 1U) << "what was read stays";
}

TEST(MessageReadingTest, EndOfAGroupEndsTheMessageAndTheRestIsIgnored) {
  Guti guti;
  // The rest could not be read.
  EXPECT_TRUE(read(guti, "08 01 0C 10 80"));
  EXPECT_EQ(guti.mmegi(), 1U);
  EXPECT_FALSE(guti.hasMmec());
}

TEST(MessageReadingTest, EndOfAGroupAsFirstKeyGivesAnEmptyMessage) {
  Guti guti;
  EXPECT_TRUE(read(guti, "04"));
  EXPECT_EQ(dictionaryText(guti), "[:]");
}

TEST(MessageReadingTest, EndOfAGroupInAChildEndsTheChildAndTheParentReadsOnRightBehindIt) {
  KCellularEmmContext context;
  // Behind the end of the group the child has two more bytes, which the parent takes for its subs_id.
  EXPECT_TRUE(read(context, "32 05 08 01 0C 78 02"));
  EXPECT_EQ(context.guti()->mmegi(), 1U);
  EXPECT_EQ(context.subsId(), 2U);
}

TEST(MessageReadingTest, ValueThatEndsTooEarlyLeavesTheFlagSetAndTheValueZero) {
  Guti guti;
  guti.setMmegi(9);
  EXPECT_FALSE(read(guti, "08 FF"));
  EXPECT_TRUE(guti.hasMmegi());
  EXPECT_EQ(guti.mmegi(), 0U);
}

TEST(MessageReadingTest, EveryScalarKindKeepsItsFlagWhenItsValueEndsTooEarly) {
  KCellularEmmContext context;
  EXPECT_FALSE(read(context, "08 80"));
  EXPECT_TRUE(context.hasTimestamp());
  KCellularEmmContext other;
  EXPECT_FALSE(read(other, "10 80"));
  EXPECT_TRUE(other.hasRegStatus());
  EXPECT_EQ(other.regStatus(), 0);
  KCellularEmmContext third;
  EXPECT_FALSE(read(third, "50 80"));
  EXPECT_TRUE(third.hasIsImsVoiceSupported());
  EXPECT_FALSE(third.isImsVoiceSupported());
  CellularLteRachAttempt attempt;
  EXPECT_FALSE(read(attempt, "48 80"));
  EXPECT_TRUE(attempt.hasRsrp());
  EXPECT_EQ(attempt.rsrp(), 0);
  CellularLteRachAttempt another;
  EXPECT_FALSE(read(another, "40"));
  EXPECT_TRUE(another.hasPMax());
}

TEST(MessageReadingTest, KeyThatEndsTooEarlyFails) {
  Guti guti;
  EXPECT_FALSE(read(guti, "08 01 80"));
  EXPECT_EQ(guti.mmegi(), 1U);
}

TEST(MessageReadingTest, OverLongVarintReadsAsZeroAndReadingGoesOn) {
  Guti guti;
  EXPECT_TRUE(read(guti, "08 FF FF FF FF FF FF FF FF FF FF 10 05"));
  EXPECT_TRUE(guti.hasMmegi());
  EXPECT_EQ(guti.mmegi(), 0U);
  EXPECT_EQ(guti.mmec(), 5U);
}

TEST(MessageReadingTest, Uint32OfTenBytesKeepsItsLowBits) {
  Guti guti;
  EXPECT_TRUE(read(guti, "08 85 80 80 80 F0 FF FF FF FF 01"));
  EXPECT_EQ(guti.mmegi(), 5U);
}

TEST(MessageReadingTest, Uint64TakesItsExtremes) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "08 FF FF FF FF FF FF FF FF FF 01"));
  EXPECT_EQ(context.timestamp(), std::numeric_limits<std::uint64_t>::max());
}

TEST(MessageReadingTest, Int32IsPlainAndSint32IsZigzag) {
  CellularLteRachAttempt attempt;
  EXPECT_TRUE(read(attempt, "40 FF FF FF FF FF FF FF FF FF 01 48 01"));
  EXPECT_EQ(attempt.pMax(), -1);
  EXPECT_EQ(attempt.rsrp(), -1);
  EXPECT_TRUE(read(attempt, "40 01 48 02"));
  EXPECT_EQ(attempt.pMax(), 1);
  EXPECT_EQ(attempt.rsrp(), 1);
}

TEST(MessageReadingTest, BoolIsTrueForEveryVarintButZero) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "50 02"));
  EXPECT_TRUE(context.isImsVoiceSupported());
  EXPECT_TRUE(read(context, "50 80 80 80 80 80 01"));
  EXPECT_TRUE(context.isImsVoiceSupported()) << "the low 32 bits alone would be 0";
  EXPECT_TRUE(read(context, "50 00"));
  EXPECT_FALSE(context.isImsVoiceSupported());
  EXPECT_TRUE(context.hasIsImsVoiceSupported());
}

TEST(MessageReadingTest, ValueOutsideTheEnumerationIsKeptAndShown) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "10 0D 38 FF FF FF FF FF FF FF FF FF 01"));
  EXPECT_EQ(context.regStatus(), 13);
  EXPECT_EQ(dictionaryText(context), "[reg_status: (unknown: 13), reject_cause: (unknown: -1)]");
}

TEST(MessageReadingTest, NegativeEnumeratorHasItsName) {
  CellularServiceStatus status;
  status.setSrvStatus(SYS_SRV_STATUS_NONE);
  CellularServiceStatus again;
  const std::string payload = test::written(status);
  EXPECT_TRUE(read(again, payload));
  EXPECT_EQ(again.srvStatus(), -1);
  EXPECT_NE(dictionaryText(again).find("SYS_SRV_STATUS_NONE"), std::string::npos);
}

TEST(MessageReadingTest, LastOfTwoScalarsWins) {
  Guti guti;
  EXPECT_TRUE(read(guti, "08 01 08 02"));
  EXPECT_EQ(guti.mmegi(), 2U);
}

TEST(MessageReadingTest, LastOfTwoByteStringsAndTextsWins) {
  BearerContext bearer;
  EXPECT_TRUE(read(bearer, "1A 01 61 1A 02 62 63 2A 01 01 2A 00"));
  EXPECT_EQ(bearer.apn(), Text("bc"));
  EXPECT_EQ(bearer.pdpAddr(), ByteString());
}

TEST(MessageReadingTest, LastOfTwoChildrenWinsWithoutMerging) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "32 02 08 01 32 02 10 02"));
  EXPECT_FALSE(context.guti()->hasMmegi());
  EXPECT_EQ(context.guti()->mmec(), 2U);
}

TEST(MessageReadingTest, RepeatedChildrenAreAddedInTheirOrder) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "2A 02 10 01 78 03 2A 00 2A 02 10 02"));
  ASSERT_EQ(context.taiListsCount(), 3U);
  EXPECT_EQ(context.taiListAtIndex(0)->tac(), 1U);
  EXPECT_FALSE(context.taiListAtIndex(1)->hasTac());
  EXPECT_EQ(context.taiListAtIndex(2)->tac(), 2U);
  EXPECT_EQ(context.subsId(), 3U);
}

TEST(MessageReadingTest, ReadingAgainAddsToWhatIsThere) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "10 01 2A 02 10 01"));
  EXPECT_TRUE(read(context, "78 02 2A 02 10 02"));
  EXPECT_TRUE(context.hasRegStatus());
  EXPECT_EQ(context.taiListsCount(), 2U);
}

TEST(MessageReadingTest, PackedAndUnpackedElementsUnderOneTagAreAppendedAsTheyCome) {
  KCellularLteSelReselCellInfo info;
  EXPECT_TRUE(read(info, "10 01 12 03 02 AC 02 10 04"));
  EXPECT_EQ(dictionaryText(info), "[multi_band_info: [1, 2, 300, 4], intra_freq_pci: []]");
}

TEST(MessageReadingTest, FieldThatIsNotPackedReadsAPackedRunToo) {
  CellMetric metric;
  EXPECT_TRUE(read(metric, "2A 02 01 02 28 03 32 0B 05 FF FF FF FF FF FF FF FF FF 01"));
  EXPECT_EQ(metric.sfScheduledByStatesCount(), 3U);
  EXPECT_EQ(metric.sfScheduledByStateAtIndex(2), 3U);
  EXPECT_EQ(metric.sizeTbTotalByStateAtIndex(1), std::numeric_limits<std::uint64_t>::max());
}

TEST(MessageReadingTest, EmptyPackedRunAddsNothing) {
  KCellularGsmCsRfMeasurement measurement;
  EXPECT_TRUE(read(measurement, "2A 00 78 01"));
  EXPECT_EQ(measurement.csTxPwrsCount(), 0U);
  EXPECT_EQ(measurement.subsId(), 1U);
}

TEST(MessageReadingTest, PackedRunWithATruncatedElementFailsAndAddsZeroForIt) {
  KCellularGsmCsRfMeasurement measurement;
  EXPECT_FALSE(read(measurement, "2A 02 05 80 78 01"));
  ASSERT_EQ(measurement.csTxPwrsCount(), 2U);
  EXPECT_EQ(measurement.csTxPwrAtIndex(0), -3);
  EXPECT_EQ(measurement.csTxPwrAtIndex(1), 0);
  EXPECT_FALSE(measurement.hasSubsId());
}

TEST(MessageReadingTest, PackedRunBeyondThePayloadFailsAtOnce) {
  KCellularGsmCsRfMeasurement measurement;
  EXPECT_FALSE(read(measurement, "2A 03 05 04"));
  EXPECT_EQ(measurement.csTxPwrsCount(), 0U);
}

TEST(MessageReadingTest, ScalarReadsAVarintWhateverItsWireType) {
  Guti guti;
  EXPECT_TRUE(read(guti, "0A 05 15 06"));
  EXPECT_EQ(guti.mmegi(), 5U);
  EXPECT_EQ(guti.mmec(), 6U);
}

TEST(MessageReadingTest, ListElementWithAnyOtherWireTypeIsOneVarint) {
  KCellularGsmCsRfMeasurement measurement;
  EXPECT_TRUE(read(measurement, "29 05 2D 04 2E 01"));
  EXPECT_EQ(dictionaryText(measurement), "[cs_tx_pwr: [-3, 2, -1]]");
}

TEST(MessageReadingTest, ByteStringAndChildReadALengthWhateverTheirWireType) {
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "30 02 08 07"));
  EXPECT_EQ(context.guti()->mmegi(), 7U);
  ElementaryFile file;
  EXPECT_TRUE(read(file, "10 01 61"));
  EXPECT_EQ(file.content(), ByteString("a"));
}

TEST(MessageReadingTest, TagOfNoFieldIsSkippedWithoutALine) {
  LogRecorder log;
  Guti guti;
  EXPECT_TRUE(read(guti, "28 05 31 01 02 03 04 05 06 07 08 3A 01 61 45 01 02 03 04 4B 08 01 4C 00 01 08 09"));
  EXPECT_EQ(guti.mmegi(), 9U);
  EXPECT_EQ(dictionaryText(guti), "[mmegi: 9]");
  EXPECT_TRUE(log.lines().empty());
}

TEST(MessageReadingTest, ValueThatCannotBeSkippedFailsAtOnce) {
  for (const char* payload : {"2E 00 08 01", "2F 00 08 01", "2D 01 02 03", "3A 05 61", "4B 08 01", "28 80"}) {
    Guti guti;
    EXPECT_FALSE(read(guti, payload)) << payload;
    EXPECT_FALSE(guti.hasMmegi()) << payload;
    EXPECT_FALSE(guti.isReadWhole()) << payload;
  }
}

TEST(MessageReadingTest, ChildBeyondThePayloadFailsAndStaysEmpty) {
  KCellularEmmContext context;
  EXPECT_FALSE(read(context, "32 05 08 01"));
  ASSERT_TRUE(context.hasGuti());
  EXPECT_FALSE(context.guti()->hasMmegi());
}

TEST(MessageReadingTest, FailedChildStaysHalfReadAndTheParentFailsAtOnce) {
  KCellularEmmContext context;
  // The child's last value ends with the child, not with the payload.
  EXPECT_FALSE(read(context, "32 03 08 07 10 78 01"));
  ASSERT_TRUE(context.hasGuti());
  EXPECT_EQ(context.guti()->mmegi(), 7U);
  EXPECT_TRUE(context.guti()->hasMmec());
  EXPECT_FALSE(context.guti()->isReadWhole());
  EXPECT_FALSE(context.hasSubsId());
  EXPECT_EQ(context.dictionaryRepresentation(), std::nullopt);
}

TEST(MessageReadingTest, FailedChildStaysInTheArray) {
  KCellularEmmContext context;
  EXPECT_FALSE(read(context, "2A 02 10 01 2A 01 10 78 01"));
  ASSERT_EQ(context.taiListsCount(), 2U);
  EXPECT_EQ(context.taiListAtIndex(0)->tac(), 1U);
  EXPECT_FALSE(context.hasSubsId());
}

TEST(MessageReadingTest, LengthStaysNarrowedBehindAFailedChild) {
  const std::string payload = bytes("32 03 08 07 10 78 01");
  WireReader reader(payload);
  KCellularEmmContext context;
  EXPECT_FALSE(context.readFrom(reader));
  EXPECT_EQ(reader.length, 5U);
}

TEST(MessageReadingTest, ByteStringBeyondThePayloadFailsAndIsNone) {
  ElementaryFile file;
  file.setContent(ByteString("old"));
  EXPECT_FALSE(read(file, "12 05 61"));
  EXPECT_FALSE(file.hasContent());
}

TEST(MessageReadingTest, MetricIdAsTagIsLoggedAndItsVarintDropped) {
  LogRecorder log;
  Guti guti;
  // Tag 0xC5004 with value 7; then a field.
  EXPECT_TRUE(read(guti, "A0 80 8A 03 07 08 01"));
  EXPECT_EQ(guti.mmegi(), 1U);
  EXPECT_EQ(log.texts("metric-related"), (std::vector<std::string>{"Unknown tag: c5004:7"}));
  EXPECT_EQ(dictionaryText(guti), "[mmegi: 1]");
}

TEST(MessageReadingTest, LineOfAMetricIdShowsTheLowBitsOfItsValue) {
  LogRecorder log;
  Guti guti;
  EXPECT_TRUE(read(guti, "A0 80 8A 03 FF FF FF FF FF FF FF FF FF 01"));
  EXPECT_TRUE(log.has("Unknown tag: c5004:4294967295"));
}

TEST(MessageReadingTest, MetricIdIsReadAsOneVarintWhateverItsWireType) {
  LogRecorder log;
  Guti guti;
  // Length-delimited: the length alone is dropped, its content is taken for keys.
  EXPECT_TRUE(read(guti, "A2 80 8A 03 02 08 01"));
  EXPECT_EQ(guti.mmegi(), 1U);
  EXPECT_TRUE(log.has("Unknown tag: c5004:2"));
}

TEST(MessageReadingTest, MetricIdWhoseValueIsTruncatedFails) {
  LogRecorder log;
  Guti guti;
  EXPECT_FALSE(read(guti, "A0 80 8A 03 80"));
  EXPECT_TRUE(log.has("Unknown tag: c5004:0"));
}

TEST(MessageReadingTest, MetricIdInAChildIsLoggedToo) {
  LogRecorder log;
  KCellularEmmContext context;
  EXPECT_TRUE(read(context, "32 07 A0 80 8A 03 07 08 01"));
  EXPECT_EQ(context.guti()->mmegi(), 1U);
  EXPECT_TRUE(log.has("Unknown tag: c5004:7"));
}

TEST(MessageReadingTest, NrRrcConnCountAloneSkipsAMetricIdLikeAnyTag) {
  LogRecorder log;
  CellularNrRrcConnCount count;
  EXPECT_TRUE(read(count, "A0 80 8A 03 07 18 05"));
  EXPECT_EQ(count.durationSeconds(), 5U);
  // Length-delimited: skipped whole.
  EXPECT_TRUE(read(count, "A2 80 8A 03 02 18 06 78 01"));
  EXPECT_EQ(count.durationSeconds(), 5U);
  EXPECT_EQ(count.subsId(), 1U);
  EXPECT_TRUE(log.lines().empty());
}

TEST(MessageReadingTest, TagWiderThanThirtyTwoBitsIsCutToThem) {
  Guti guti;
  // Key 0x800000008: tag 0x100000001, which is 1 in 32 bits.
  EXPECT_TRUE(read(guti, "88 80 80 80 80 01 05"));
  EXPECT_EQ(guti.mmegi(), 5U);
}

}  // namespace
}  // namespace quorl
