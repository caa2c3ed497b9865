#include "intake/MetricGroupV2.h"

#include <algorithm>

namespace quorl {
namespace {

// The order is that of the walk, and the names are what rows are stored under: neither may change. Some class names
// exist nowhere and some differ from a class in case only; they stand as the baseband's own lists have them.
constexpr std::array<MetricGroupV2, MetricGroupV2::kRowCount> kCatalogue{{
    {"5G", "NrSys InfoBlocks", 806912, "CellularNrSysInfoBlocks", "mav"},
    {"5G", "Nr Ota Msg", 806913, "CellularNrOtaMsg", "mav"},
    {"5G", "Nr Serving cell Info", 806914, "CellularNrScellInfo", "mav"},
    {"5G", "Nr Rach Attempt", 806915, "CellularNrRachAttempt", "mav"},
    {"5G", "Nr Rrc State", 806917, "CellularNrRrcState", "mav"},
    {"5G", "Nr Scg Addition", 806919, "CellularNrScgAddition", "mav"},
    {"5G", "Nr Scg Removal", 806920, "CellularNrScgRemoval", "mav"},
    {"5G", "Nr Beam Switch", 806922, "CellularNrBeamSwitch", "mav"},
    {"5G", "Nr Rrc Resume", 806928, "CellularNrRrcResume", "mav"},
    {"5G", "Nr R. LinkFailure", 806931, "CellularNrRadioLinkFailure", "mav"},
    {"5G", "Nr UlPdcpStats", 806932, "CellularNrUlPdcpStats", "mav"},
    {"5G", "Nr EndcUsageStats", 806933, "CellularNrEndcUsageStats", "mav"},
    {"5G", "Nr ConnectionStats", 806934, "CellularNrConnectionStats", "mav"},
    {"LTE", "ConnectionStats", 806743, "CellularLTEConnectionStats", "mav"},
    {"5G", "Nr SDMActivation", 806936, "CellularNrSDMActivation", "mav"},
    {"5G", "Nr SdmEndcRelease", 806937, "CellularNrSdmEndcRelease", "mav"},
    {"MISC", "Lqm State Change", 827656, "CellularLqmStateChange", "mav"},
    {"MISC", "Reg Attempt", 827652, "CellularRegAttempt", "mav"},
    {"MISC", "Registered Plmn Status", 827650, "CellularRegisteredPlmnStatus", "mav"},
    {"MISC", "Cellular Rat Lac Srv Info", 827747, "CellularRatLacSrvInfo", "mav"},
    {"MISC", "Cellular Health monitor", 816135, "CellularHealthMonitor", "mav"},
    {"MISC", "Cmda Cell Info", 790530, "CellularCdmaCellInfo", "mav"},
    {"MISC", "GsmWcdmaCellInfo", 798732, "CellularGsmWcdmaCellInfo", "mav"},
    {"MISC", "WcdmaRrcState", 802306, "CellularWcdmaRrcState", "mav"},
    {"MISC", "WcdmaRachattempt", 802315, "CellularWcdmaRachattempt", "mav"},
    {"LTE", "Serving Cell Meas", 806660, "CellularLteRsrpRsrqSinrHist", "mav"},
    {"LTE", "RrcStateHist", 806674, "CellularLteRrcStateHist", "mav"},
    {"LTE", "Rach Attempt", 803104, "CellularLteRachAttempt", "mav"},
    {"MISC", "Cellular Service Status", 827648, "CellularServiceStatus", "mav"},
    {"MISC", "Cellular Service Status", 827649, "CellularSysOprtMode", "mav"},
    {"MISC", "Cellular SimHplmn", 827651, "CellularSimHplmn", "mav"},
    {"MISC", "Cellular LqmDataStall", 827683, "CellularLqmDataStall", "mav"},
    {"MISC", "Cellular RatRetention", 827746, "CellularRatRetention", "mav"},
    {"MISC", "Cellular CallEndDetails", 835590, "CellularCallEndDetails", "mav"},
    {"MISC", "Cellular CsCallPageRespFail", 835591, "CellularCsCallPageRespFail", "mav"},
    {"MISC", "Cellular CsCallGwlPageRespFail", 835592, "CellularCsCallGwlPageRespFail", "mav"},
    {"MISC", "Cellular VoiceLastCallEnd", 836134, "CellularVoiceLastCallEnd", "mav"},
    {"MISC", "Cellular RfTunerEvent", 816389, "CellularRfTunerEvent", "mav"},
    {"5G", "Nr Radio Link Failure", 806931, "CellularNrRrcState", "mav"},
    {"LTE", "Ota Msg", 803011, "CellularLteOtaMsg", "mav"},
    {"LTE", "Serving Cell Info", 803010, "CellularLteScellInfo", "mav"},
    {"Device Info", "SIM Files", 3932179, "KCellularSimCardFiles", "ice"},
    {"LTE", "RRC State", 3952132, "KCellularLteRrcState", "ice"},
    {"LTE", "Serving Cell Info", 3948738, "KCellularLteScellInfo", "ice"},
    {"LTE", "Serving Cell Meas", 3986177, "KCellularLteServingCellMeasurement", "ice"},
    {"LTE", "CA Status", 3986195, "KCellularLteCarrierAggregationStatus", "ice"},
    {"LTE", "C-DRX", 3952152, "KCellularLteCdrxConfig", "ice"},
    {"LTE", "Sel Resel Parameters", 3986190, "KCellularLteSelReselCellInfo", "ice"},
    {"LTE", "Component Carrier Info", 3986187, "KCellularLteComponentCarrierInfo", "ice"},
    {"LTE", "Tx Power", 3986178, "KCellularLteTxPower", "ice"},
    {"UMTS", "RRC State", 3985682, "KCellularWcdmaRrcConnectionState", "ice"},
    {"LTE", "NAS", 3986700, "KCellularEmmContext", "ice"},
    {"LTE", "UMTS Neighbor Cell Meas", 3986192, "KCellularLteNbrInterRatCellMeas", "ice"},
    {"LTE", "GSM Neighbor Cell Meas", 3986192, "KCellularLteNbrInterRatCellMeas", "ice"},
    {"LTE", "Neighbor Cell Meas", 3986191, "KCellularLteNbrEutraCellMeas", "ice"},
    {"LTE", "Active Bearers", 3986701, "KCellularActivatedBearerContexts", "ice"},
    {"UMTS", "Active Bearers", 3986701, "KCellularActivatedBearerContexts", "ice"},
    {"GSM", "Active Bearers", 3986701, "KCellularActivatedBearerContexts", "ice"},
    {"UMTS", "RRC Configuration", 3985683, "KCellularWcdmaRrcConfiguration", "ice"},
    {"UMTS", "Serving Cell Info", 3944460, "KCellularWcdmaCellInfo", "ice"},
    {"UMTS", "Serving Cell Info", 3985666, "KCellularWcdmaScellMeasurement", "ice"},
    {"UMTS", "Tx Power", 3985667, "KCellularWcdmaTxPower", "ice"},
    {"UMTS", "Sel Resel Parameters", 3985668, "KCellularWcdmaSelReselCellInfo", "ice"},
    {"UMTS", "UTRA Neighbor Info", 3985668, "KCellularWcdmaSelReselCellInfo", "ice"},
    {"UMTS", "GSM Neighbor Info", 3985668, "KCellularWcdmaSelReselCellInfo", "ice"},
    {"UMTS", "UMTS Neighbor Cell Meas", 3985669, "KCellularWcdmaNbrCellMeas", "ice"},
    {"UMTS", "GSM Neighbor Cell Meas", 3985669, "KCellularWcdmaNbrCellMeas", "ice"},
    {"UMTS", "LTE Neighbor Cell Meas", 3985669, "KCellularWcdmaNbrCellMeas", "ice"},
    {"UMTS", "NAS MM", 3986698, "KCellularMmContext", "ice"},
    {"GSM", "NAS MM", 3986698, "KCellularMmContext", "ice"},
    {"UMTS", "NAS GMM", 3986699, "KCellularGmmContext", "ice"},
    {"GSM", "NAS GMM", 3986699, "KCellularGmmContext", "ice"},
    {"GSM", "Serving Cell Info", 3943948, "KCellularGsmScellInfo", "ice"},
    {"GSM", "Idle Config", 3985409, "kCellularGsmIdleConfig", "ice"},
    {"GSM", "Idle Serv Cell Meas", 3985410, "kCellularGsmIdleScellMeasurement", "ice"},
    {"GSM", "Connected Serv Cell Meas", 3985411, "kCellularGsmCsRfMeasurement", "ice"},
    {"GSM", "GPRS Config", 3985420, "kCellularGsmGprsConfig", "ice"},
    {"GSM", "Neighbor Cell Meas", 3985417, "kCellularGsmGrrEventMeasCr", "ice"},
    {"GSM", "UMTS Neighbor Cell Meas", 3985417, "kCellularGsmGrrEventMeasCr", "ice"},
    {"GSM", "LTE Neighbor Cell Meas", 3985417, "kCellularGsmGrrEventMeasCr", "ice"},
}};

struct GraphableAttribute {
  std::string_view metricName;
  std::string_view attributeName;
};

constexpr GraphableAttribute kGraphableAttributes[] = {
    {"Nr ConnectionStats", "duration_of_conn"},
    {"Cell Info", "kHVCellMonitorDeploymentType"},
    {"Cell Info", "kHVCellMonitorCellId"},
    {"Nr ConnectionStats", "max_dl_mod"},
    {"Nr ConnectionStats", "max_schd_mimo_lyr"},
    {"Nr ConnectionStats", "max_ue_rank"},
    {"Nr ConnectionStats", "nr5g_total_dl_mimo_layers"},
    {"Cell Info", "kHVCellMonitorBandwidth"},
    {"Cell Info", "kHVCellMonitorBandInfo"},
};

}  // namespace

const std::array<MetricGroupV2, MetricGroupV2::kRowCount>& MetricGroupV2::metricGroupData() {
  return kCatalogue;
}

bool isGraphable(std::string_view metricName, std::string_view attributeName) {
  return std::any_of(std::begin(kGraphableAttributes), std::end(kGraphableAttributes),
                     [&](const GraphableAttribute& attribute) {
                       return attribute.attributeName == attributeName && attribute.metricName == metricName;
                     });
}

}  // namespace quorl
