#include <memory>
#include <stdexcept>

#include <gtest/gtest.h>

#include "messages/MessageTable.h"
#include "messages/Wire.h"
#include "messages/classes/gsm.h"
#include "messages/classes/lte_carrier_aggregation.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/wcdma_statistics.h"

namespace quorl {
namespace {

using test::dictionaryText;
using test::read;
using test::written;

MessageRef<KCellularTrackingAreaId> area(std::uint32_t tac) {
  auto result = makeMessageRef<KCellularTrackingAreaId>();
  result->setTac(tac);
  return result;
}

MessageRef<Guti> guti(std::uint32_t mmegi) {
  auto result = makeMessageRef<Guti>();
  result->setMmegi(mmegi);
  return result;
}

template <typename T>
std::unique_ptr<T> deepCopy(const T& message) {
  return std::unique_ptr<T>(static_cast<T*>(message.copyWithZone().release()));
}

/// Two scalars, a child and two elements.
void fill(KCellularEmmContext& context) {
  context.setTimestamp(1000);
  context.setRejectCause(7);
  context.setGuti(guti(300));
  context.addTaiList(area(1));
  context.addTaiList(area(2));
}

// Copying into another message.

TEST(MessageCopyingTest, CopyingOverwritesWhatIsPresentAndRemovesNothing) {
  Guti source;
  source.setMmegi(1);
  Guti target;
  target.setMmegi(8);
  target.setMmec(9);
  source.copyTo(target);
  EXPECT_EQ(dictionaryText(target), "[mmegi: 1, mmec: 9]");
}

TEST(MessageCopyingTest, ClearedFlagIsNotCopied) {
  Guti source;
  source.setMmegi(1);
  source.setHasMmegi(false);
  Guti target;
  source.copyTo(target);
  EXPECT_FALSE(target.hasMmegi());
  EXPECT_EQ(target.mmegi(), 0U);
}

TEST(MessageCopyingTest, CopySharesChildrenByteStringsAndTexts) {
  KCellularEmmContext source;
  fill(source);
  KCellularEmmContext target;
  target.setGuti(guti(5));
  source.copyTo(target);
  EXPECT_EQ(target.guti(), source.guti());
  EXPECT_EQ(target.taiListAtIndex(1), source.taiListAtIndex(1));

  BearerContext bearer;
  bearer.setApn(Text("internet"));
  bearer.setPdpAddr(ByteString("addr"));
  BearerContext other;
  bearer.copyTo(other);
  EXPECT_EQ(other.apn()->data(), bearer.apn()->data());
  EXPECT_EQ(other.pdpAddr()->data(), bearer.pdpAddr()->data());
}

TEST(MessageCopyingTest, CopiedArrayReplacesThatOfTheTarget) {
  KCellularEmmContext source;
  source.addTaiList(area(1));
  KCellularEmmContext target;
  target.addTaiList(area(7));
  target.addTaiList(area(8));
  source.copyTo(target);
  EXPECT_EQ(dictionaryText(target), "[tai_list: [[tac: 1]]]");
}

TEST(MessageCopyingTest, EmptyArrayAndListLeaveThoseOfTheTarget) {
  KCellularEmmContext source;
  source.addTaiList(area(1));
  source.clearTaiLists();
  KCellularEmmContext target;
  target.addTaiList(area(7));
  source.copyTo(target);
  EXPECT_EQ(target.taiListsCount(), 1U);

  const KCellularGsmCsRfMeasurement none;
  KCellularGsmCsRfMeasurement measurement;
  measurement.addCsTxPwr(1);
  none.copyTo(measurement);
  EXPECT_EQ(measurement.csTxPwrsCount(), 1U);
}

TEST(MessageCopyingTest, CopiedListReplacesThatOfTheTarget) {
  KCellularGsmCsRfMeasurement source;
  source.addCsTxPwr(-3);
  KCellularGsmCsRfMeasurement target;
  target.addCsTxPwr(1);
  target.addCsTxPwr(2);
  source.copyTo(target);
  source.addCsTxPwr(5);
  EXPECT_EQ(dictionaryText(target), "[cs_tx_pwr: [-3]]");
}

TEST(MessageCopyingTest, CopyingOntoItselfChangesNothing) {
  KCellularEmmContext context;
  fill(context);
  const std::string before = written(context);
  context.copyTo(context);
  EXPECT_EQ(written(context), before);
}

// Deep copy.

TEST(MessageCopyingTest, DeepCopyIsEqualAndSharesNoMessage) {
  KCellularEmmContext context;
  fill(context);
  const auto copy = deepCopy(context);
  EXPECT_TRUE(copy->isEqual(context));
  EXPECT_NE(copy->guti(), context.guti());
  EXPECT_NE(copy->taiListAtIndex(0), context.taiListAtIndex(0));
  context.guti()->setMmegi(1);
  context.taiListAtIndex(0)->setTac(9);
  EXPECT_EQ(copy->guti()->mmegi(), 300U);
  EXPECT_EQ(copy->taiListAtIndex(0)->tac(), 1U);
}

TEST(MessageCopyingTest, DeepCopyHasItsOwnLists) {
  CellMetric metric;
  metric.addSfScheduledByState(1);
  metric.addSizeTbTotalByType(2);
  const auto copy = deepCopy(metric);
  metric.addSfScheduledByState(3);
  EXPECT_EQ(copy->sfScheduledByStatesCount(), 1U);
  EXPECT_EQ(copy->sizeTbTotalByTypeAtIndex(0), 2U);
}

TEST(MessageCopyingTest, DeepCopyHasTheClassOfTheObject) {
  const std::unique_ptr<MetricCodable> message = makeMessage("Guti");
  EXPECT_EQ(&message->copyWithZone()->table(), &Guti::kTable);
}

TEST(MessageCopyingTest, DeepCopyOfAnEmptiedArrayHasNone) {
  KCellularEmmContext context;
  context.addTaiList(area(1));
  context.clearTaiLists();
  EXPECT_FALSE(deepCopy(context)->taiLists().isSet());
}

TEST(MessageCopyingTest, DeepCopyOfAMessageThatWasNotReadWholeAnswersNoDictionaryEither) {
  Guti damaged;
  read(damaged, "08 01 10");
  EXPECT_EQ(damaged.copyWithZone()->dictionaryRepresentation(), std::nullopt);
}

// Merging.

TEST(MessageCopyingTest, MergingTakesOverScalarsTextsAndByteStrings) {
  BearerContext own;
  own.setCid(1);
  own.setNsapi(5);
  own.setApn(Text("old"));
  BearerContext other;
  other.setCid(2);
  other.setApn(Text("new"));
  other.setPdpAddr(ByteString("x"));
  own.mergeFrom(other);
  EXPECT_EQ(dictionaryText(own), "[cid: 2, nsapi: 5, apn: new, pdp_addr: <1 bytes>]");
}

TEST(MessageCopyingTest, MergingKeepsWhatTheOtherDoesNotHave) {
  KCellularEmmContext context;
  fill(context);
  const std::string before = written(context);
  context.mergeFrom(KCellularEmmContext());
  EXPECT_EQ(written(context), before);
}

TEST(MessageCopyingTest, MergingAdoptsAnAbsentChildByReference) {
  KCellularEmmContext own;
  KCellularEmmContext other;
  other.setGuti(guti(3));
  own.mergeFrom(other);
  EXPECT_EQ(own.guti(), other.guti());
}

TEST(MessageCopyingTest, MergingFoldsAChildIntoAChild) {
  KCellularEmmContext own;
  const auto child = guti(1);
  child->setMmec(2);
  own.setGuti(child);
  KCellularEmmContext other;
  other.setGuti(guti(3));
  own.mergeFrom(other);
  EXPECT_EQ(own.guti(), child);
  EXPECT_EQ(dictionaryText(own), "[guti: [mmegi: 3, mmec: 2]]");
  EXPECT_EQ(dictionaryText(other), "[guti: [mmegi: 3]]");
}

TEST(MessageCopyingTest, MergingConcatenatesArraysAndSharesTheirMessages) {
  KCellularEmmContext own;
  own.addTaiList(area(1));
  KCellularEmmContext other;
  other.addTaiList(area(2));
  own.mergeFrom(other);
  EXPECT_EQ(dictionaryText(own), "[tai_list: [[tac: 1], [tac: 2]]]");
  EXPECT_EQ(own.taiListAtIndex(1), other.taiListAtIndex(0));
}

TEST(MessageCopyingTest, MergingConcatenatesLists) {
  KCellularGsmCsRfMeasurement own;
  own.addCsTxPwr(1);
  KCellularGsmCsRfMeasurement other;
  other.addCsTxPwr(-2);
  own.mergeFrom(other);
  EXPECT_EQ(dictionaryText(own), "[cs_tx_pwr: [1, -2]]");
}

TEST(MessageCopyingTest, MergingWithItselfDoublesArraysAndLists) {
  KCellularEmmContext context;
  fill(context);
  context.mergeFrom(context);
  EXPECT_EQ(context.taiListsCount(), 4U);
  CellMetric metric;
  metric.addSfScheduledByState(1);
  metric.mergeFrom(metric);
  EXPECT_EQ(metric.sfScheduledByStatesCount(), 2U);
}

TEST(MessageCopyingTest, MessagesOfDifferentClassesAreRefused) {
  Guti own;
  KCellularTrackingAreaId other;
  EXPECT_THROW(own.mergeFrom(other), std::invalid_argument);
  EXPECT_THROW(own.copyTo(other), std::invalid_argument);
}

// Equality and hash.

TEST(MessageCopyingTest, PresentZeroAndAbsentFieldDiffer) {
  Guti present;
  present.setMmegi(0);
  const Guti absent;
  EXPECT_FALSE(present.isEqual(absent));
  EXPECT_FALSE(absent.isEqual(present));
}

TEST(MessageCopyingTest, ValueBehindAClearedFlagDoesNotCount) {
  Guti a;
  a.setMmegi(5);
  a.setHasMmegi(false);
  EXPECT_TRUE(a.isEqual(Guti()));
  EXPECT_EQ(a.hash(), 0U);
}

TEST(MessageCopyingTest, EqualContentOfAnotherClassDiffers) {
  EXPECT_FALSE(Guti().isEqual(KCellularTrackingAreaId()));
  EXPECT_FALSE(Plmn().isEqual(RoutingAreaId()));
}

TEST(MessageCopyingTest, EachKindOfFieldCounts) {
  KCellularEmmContext base;
  fill(base);
  const auto differs = [&](auto change) {
    const auto other = deepCopy(base);
    change(*other);
    return !base.isEqual(*other) && !other->isEqual(base);
  };
  EXPECT_FALSE(differs([](KCellularEmmContext&) {}));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.setTimestamp(1001); }));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.setRejectCause(8); }));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.setIsImsVoiceSupported(false); }));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.guti()->setMmec(1); }));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.setGuti(nullptr); }));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.taiListAtIndex(1)->setTac(3); }));
  EXPECT_TRUE(differs([](KCellularEmmContext& m) { m.addTaiList(area(3)); }));
}

TEST(MessageCopyingTest, OrderOfAnArrayCounts) {
  KCellularEmmContext a;
  a.addTaiList(area(1));
  a.addTaiList(area(2));
  KCellularEmmContext b;
  b.addTaiList(area(2));
  b.addTaiList(area(1));
  EXPECT_FALSE(a.isEqual(b));
}

TEST(MessageCopyingTest, SetAndUnsetReferencesDiffer) {
  BearerContext set;
  set.setApn(Text());
  EXPECT_FALSE(set.isEqual(BearerContext()));
  BearerContext bytes;
  bytes.setPdpAddr(ByteString());
  EXPECT_FALSE(BearerContext().isEqual(bytes));
  KCellularEmmContext child;
  child.setGuti(makeMessageRef<Guti>());
  EXPECT_FALSE(child.isEqual(KCellularEmmContext()));
}

TEST(MessageCopyingTest, EmptiedArrayAndNoArrayDiffer) {
  KCellularEmmContext emptied;
  emptied.addTaiList(area(1));
  emptied.clearTaiLists();
  EXPECT_FALSE(emptied.isEqual(KCellularEmmContext()));
}

TEST(MessageCopyingTest, EmptiedListAndNewListAreEqual) {
  KCellularGsmCsRfMeasurement emptied;
  emptied.addCsTxPwr(1);
  EXPECT_FALSE(emptied.isEqual(KCellularGsmCsRfMeasurement()));
  emptied.clearCsTxPwrs();
  EXPECT_TRUE(emptied.isEqual(KCellularGsmCsRfMeasurement()));
}

TEST(MessageCopyingTest, HashOfScalarsIsTheirProductWithTheFactor) {
  constexpr std::uint64_t kFactor = 0x9E3779B1;
  Guti message;
  EXPECT_EQ(message.hash(), 0U);
  message.setMmegi(300);
  EXPECT_EQ(message.hash(), 300 * kFactor);
  message.setMmec(0xFFFFFFFF);
  EXPECT_EQ(message.hash(), (300 * kFactor) ^ (0xFFFFFFFF * kFactor)) << "unsigned values are extended with zeros";
}

TEST(MessageCopyingTest, HashExtendsSignedValuesByTheirSign) {
  constexpr std::uint64_t kFactor = 0x9E3779B1;
  constexpr std::uint64_t kMinusOne = 0xFFFFFFFFFFFFFFFF;
  CellularLteRachAttempt plain;
  plain.setPMax(-1);
  EXPECT_EQ(plain.hash(), kMinusOne * kFactor);
  CellularLteRachAttempt zigzag;
  zigzag.setRsrp(-1);
  EXPECT_EQ(zigzag.hash(), kMinusOne * kFactor);
  KCellularEmmContext enumeration;
  enumeration.setRegStatus(-1);
  EXPECT_EQ(enumeration.hash(), kMinusOne * kFactor);
  KCellularEmmContext flag;
  flag.setIsImsVoiceSupported(true);
  EXPECT_EQ(flag.hash(), kFactor);
}

TEST(MessageCopyingTest, EqualMessagesHaveEqualHashes) {
  KCellularEmmContext a;
  fill(a);
  KCellularEmmContext b;
  fill(b);
  EXPECT_TRUE(a.isEqual(b));
  EXPECT_EQ(a.hash(), b.hash());
  b.taiListAtIndex(0)->setTac(77);
  EXPECT_NE(a.hash(), b.hash());
}

TEST(MessageCopyingTest, ASharedChildOutlivesItsFirstParent) {
  KCellularEmmContext target;
  {
    KCellularEmmContext source;
    fill(source);
    source.copyTo(target);
  }
  EXPECT_EQ(target.guti()->mmegi(), 300U);
  EXPECT_EQ(target.taiListAtIndex(1)->tac(), 2U);
}

}  // namespace
}  // namespace quorl
