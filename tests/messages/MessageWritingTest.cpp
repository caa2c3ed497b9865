#include <limits>

#include <gtest/gtest.h>

#include "messages/Wire.h"
#include "messages/classes/call_statistics.h"
#include "messages/classes/gsm.h"
#include "messages/classes/lte_carrier_aggregation.h"
#include "messages/classes/lte_neighbors.h"
#include "messages/classes/lte_rrc.h"
#include "messages/classes/lte_statistics.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/nr_cell.h"
#include "messages/classes/nr_connection.h"
#include "messages/classes/rf_health.h"
#include "messages/classes/service_status.h"
#include "messages/classes/wcdma_statistics.h"

namespace quorl {
namespace {

using test::dictionaryText;
using test::written;

TEST(MessageWritingTest, EmptyMessageWritesNothing) {
  EXPECT_EQ(written(KCellularEmmContext()), "");
  EXPECT_EQ(written(KCellularGsmCsRfMeasurement()), "") << "an empty packed list is not written";
}

TEST(MessageWritingTest, PresentZeroIsWrittenAndShown) {
  KCellularEmmContext context;
  context.setTimestamp(0);
  context.setRegStatus(0);
  context.setIsImsVoiceSupported(false);
  EXPECT_EQ(written(context), "08 00 10 00 50 00");
  EXPECT_EQ(dictionaryText(context),
            "[timestamp: 0, reg_status: KREG_STATUS_NORMAL_SERVICE, is_ims_voice_supported: false]");
}

TEST(MessageWritingTest, ClearedFlagKeepsTheFieldOut) {
  Guti guti;
  guti.setMmegi(5);
  guti.setHasMmegi(false);
  EXPECT_EQ(written(guti), "");
  EXPECT_EQ(dictionaryText(guti), "[:]");
  guti.setHasMmegi(true);
  EXPECT_EQ(written(guti), "08 05");
}

TEST(MessageWritingTest, EmptyTextByteStringAndChildAreWritten) {
  BearerContext bearer;
  bearer.setApn(Text());
  bearer.setPdpAddr(ByteString());
  EXPECT_EQ(written(bearer), "1A 00 2A 00");
  EXPECT_EQ(dictionaryText(bearer), "[apn: , pdp_addr: <0 bytes>]");

  KCellularEmmContext context;
  context.setGuti(makeMessageRef<Guti>());
  context.addTaiList(makeMessageRef<KCellularTrackingAreaId>());
  EXPECT_EQ(written(context), "2A 00 32 00");
  EXPECT_EQ(dictionaryText(context), "[tai_list: [[:]], guti: [:]]");
}

TEST(MessageWritingTest, ListThatIsNotPackedHasAKeyPerElement) {
  CellMetric metric;
  metric.addSfScheduledByState(1);
  metric.addSfScheduledByState(300);
  metric.addSizeTbTotalByState(std::numeric_limits<std::uint64_t>::max());
  EXPECT_EQ(written(metric), "28 01 28 AC 02 30 FF FF FF FF FF FF FF FF FF 01");
}

TEST(MessageWritingTest, PackedListIsOneRun) {
  KCellularLteSelReselCellInfo info;
  info.addMultiBandInfo(1);
  info.addMultiBandInfo(300);
  EXPECT_EQ(written(info), "12 03 01 AC 02");
}

TEST(MessageWritingTest, ArrayIsOneRecordPerElement) {
  KCellularEmmContext context;
  for (const std::uint32_t tac : {1U, 2U}) {
    auto area = makeMessageRef<KCellularTrackingAreaId>();
    area->setTac(tac);
    context.addTaiList(area);
  }
  EXPECT_EQ(written(context), "2A 02 10 01 2A 02 10 02");
}

TEST(MessageWritingTest, NegativeInt32AndEnumeratorTakeTenBytes) {
  CellularLteRachAttempt attempt;
  attempt.setPMax(-1);
  attempt.setRsrp(-1);
  EXPECT_EQ(written(attempt), "40 FF FF FF FF FF FF FF FF FF 01 48 01");
  CellularServiceStatus status;
  status.setSrvStatus(SYS_SRV_STATUS_NONE);
  EXPECT_EQ(written(status).substr(3), "FF FF FF FF FF FF FF FF FF 01");
}

TEST(MessageWritingTest, DefaultsReachNeitherTheDictionaryNorTheWire) {
  const CellularWcdmaTxRxHist hist;
  EXPECT_EQ(hist.minRxLevelDbm(), -121);
  EXPECT_EQ(written(hist), "");
  EXPECT_EQ(dictionaryText(hist).find("dbm"), std::string::npos);
}

// Where a table has two rows out of the order of their tags, the table counts.

TEST(MessageWritingTest, EmmContextWritesTag15Before11AsMeant) {
  KCellularEmmContext context;
  context.setIsEmergBearerSupported(true);
  context.setSubsId(1);
  EXPECT_EQ(written(context), "78 01 58 01");
}

TEST(MessageWritingTest, SelReselCellInfoWritesTag25Before24AsMeant) {
  KCellularLteSelReselCellInfo info;
  info.setDlRfBand(2);
  info.setDlBandwidth(1);
  EXPECT_EQ(written(info), "C8 01 01 C0 01 02");
}

TEST(MessageWritingTest, LteConnectionStatsWritesTag10Before9AndTag15Before14AsMeant) {
  CellularLteConnectionStats stats;
  stats.setLteTotalNumCcs(1);
  stats.setLteTotalDlMimoLayers(2);
  stats.setMrdcLteTotalNumCcs(3);
  stats.setMrdcLteTotalDlMimoLayers(4);
  EXPECT_EQ(written(stats), "50 02 48 01 78 04 70 03");
}

TEST(MessageWritingTest, NrRachAttemptWritesTag13Before12AsMeant) {
  CellularNrRachAttempt attempt;
  attempt.setAccbState(1);
  attempt.setNumSubs(2);
  EXPECT_EQ(written(attempt), "68 02 60 01");
}

TEST(MessageWritingTest, ServingCellBeamInfoWritesTag9Before8AsMeant) {
  ServingCellBeamInfo info;
  info.setRxBeamRsrp(1);
  info.setRasterArfcn(2);
  EXPECT_EQ(written(info), "48 02 40 01");
}

TEST(MessageWritingTest, CallCountWritesTag37Before36AsMeant) {
  CellularCallCount count;
  count.setNumConnectedCallsWcdma(1);
  count.setNumNormalReleaseCallsWcdma(2);
  EXPECT_EQ(written(count), "A8 02 02 A0 02 01");
}

TEST(MessageWritingTest, WcdmaRlcThroughputWritesTag64Before25AsMeant) {
  CellularWcdmaRlcThroughput throughput;
  throughput.setDlTotalBytes(1);
  throughput.setVersion(2);
  EXPECT_EQ(written(throughput), "80 04 02 C8 01 01");
}

TEST(MessageWritingTest, DictionaryHasTheOrderOfTheTableToo) {
  KCellularEmmContext context;
  context.setIsEmergBearerSupported(true);
  context.setSubsId(1);
  EXPECT_EQ(dictionaryText(context), "[subs_id: 1, is_emerg_bearer_supported: true]");
}

TEST(MessageWritingTest, VersionOfLmapoOosHistStandsAtTag64) {
  CellularLmapoOosHist hist;
  hist.setVersion(1);
  hist.addRecoverHist(makeMessageRef<RecoverHist>());
  EXPECT_EQ(written(hist), "32 00 80 04 01");
}

}  // namespace
}  // namespace quorl
