#include "messages/KBBMetricUtility.h"

#include <algorithm>
#include <vector>

namespace quorl {

namespace {

// Several texts differ from the name of their class, and two ids share one; all as the baseband's list has them.
constexpr KBBMetricUtility::Entry kEntries[] = {
    {0x3C4E04, "KCellularLteRrcState"},
    {0x3C4E18, "KCellularLteCdrxConfig"},
    {0x3C4E25, "KCellularLteRadioLinkFailure"},
    {0x3C40C2, "KCellularLteScellInfo"},
    {0x3CD30E, "KCellularLteSelReselCellInfo"},
    {0x3CD301, "KCellularLteServingCellMeasurement"},
    {0x3CD302, "KCellularLteTxPower"},
    {0x3C4F6A, "KCellularRsrpRsrqSinr"},
    {0x3CD50C, "KCellularEmmContext"},
    {0x3CD30B, "KCellularLteComponentCarrierInfo"},
    {0x3CD313, "KCellularLteCarrierAggregationStatus"},
    {0x3CD310, "KCellularLteNbrInterRatCellMeas"},
    {0x3CD30F, "KCellularLteNbrEutraCellMeas"},
    {0x3CD509, "KCellularMmCommonInfo"},
    {0x3CD50D, "KCellularActivatedBearerContexts"},
    {0x3CD112, "KCellularWcdmaRrcConnectionState"},
    {0x3C300C, "KCellularWcdmaCellInfo"},
    {0x3CD102, "KCellularWcdmaScellMeasurement"},
    {0x3CD103, "KCellularWcdmaTxPower"},
    {0x3CD105, "KCellularWcdmaNbrCellMeas"},
    {0x3CD104, "KCellularWcdmaSelReselCellInfo"},
    {0x3CD113, "KCellularWcdmaRrcConfiguration"},
    {0x3CD50A, "KCellularMmContext"},
    {0x3CD50B, "KCellularGmmContext"},
    {0x3C2E0C, "kCellularGsmScellInfo"},
    {0x3CD001, "kCellularGsmIdleConfig"},
    {0x3CD002, "kCellularGsmIdleScellMeasurement"},
    {0x3CD003, "kCellularGsmCsRfMeasurement"},
    {0x3CD009, "kCellularGsmGrrEventMeasCr"},
    {0x3CD00C, "kCellularGsmGprsConfig"},
    {0x3C0013, "kCellularSimCardFiles"},
    {0xC40C2, "CellularLteScellInfo"},
    {0xC40C3, "CellularLteOtaMsg"},
    {0xC5000, "CellularNrSysInfoBlocks"},
    {0xC5001, "CellularNrOtaMsg"},
    {0xC5002, "CellularNrScellInfo"},
    {0xC5003, "CellularNrRachAttempt"},
    {0xC5005, "CellularNrRrcState"},
    {0xC5007, "CellularNrScgAddition"},
    {0xC5008, "CellularNrScgRemoval"},
    {0xC500A, "CellularNrBeamSwitch"},
    {0xC5010, "CellularNrRrcResume"},
    {0xC5014, "CellularNrUlPdcpStats"},
    {0xC5015, "CellularNrEndcUsageStats"},
    {0xC5016, "CellularNrConnectionStats"},
    {0xC4F57, "CellularLTEConnectionStats"},
    {0xC5018, "CellularNrSDMActivation"},
    {0xC5019, "CellularNrSdmEndcRelease"},
    {0xCA108, "CellularLqmStateChange"},
    {0xCA104, "CellularRegAttempt"},
    {0xCA102, "CellularRegisteredPlmnStatus"},
    {0xCA163, "CellularRatLacSrvInfo"},
    {0xC7407, "CellularHealthMonitor"},
    {0xCC226, "CellularVoiceCallEvent"},
    {0xC7505, "CellularRfTunerEvent"},
    {0xCC006, "CellularCallEndDetails"},
    {0xCC007, "CellularCsCallPageRespFail"},
    {0xCC008, "CellularCsCallGwlPageRespFail"},
    {0xC5013, "CellularNrRadioLinkFailure"},
    {0xCA123, "CellularLqmDataStall"},
    {0xC1002, "CellularCdmaCellInfo"},
    {0xC300C, "CellularGsmWcdmaCellInfo"},
    {0xC3E02, "CellularWcdmaRrcState"},
    {0xC3E0B, "Cellular WcdmaRachattempt"},
    {0xC4F04, "CellularLteRsrpRsrqSinrHist"},
    {0xC4F12, "CellularLteRrcStateHist"},
    {0xC4120, "CellularLteRachAttempt"},
    {0xCA100, "CellularServiceStatus"},
    {0xCA101, "CellularSysOprtMode"},
    {0xCA103, "CellularSimHplmn"},
    {0xCA162, "CellularRatLacSrvInfo"},
    {0xC5004, "CellularNrRrcConnCount"},
};

}  // namespace

std::span<const KBBMetricUtility::Entry> KBBMetricUtility::entries() {
  return kEntries;
}

bool KBBMetricUtility::holds(std::uint32_t tag, const MessageTable& /*forClass*/) {
  static const std::vector<std::uint32_t> ids = [] {
    std::vector<std::uint32_t> sorted;
    for (const Entry& entry : kEntries) sorted.push_back(entry.metricId);
    std::sort(sorted.begin(), sorted.end());
    return sorted;
  }();
  return std::binary_search(ids.begin(), ids.end(), tag);
}

}  // namespace quorl
