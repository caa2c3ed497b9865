#include <algorithm>
#include <set>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include <fmt/format.h>
#include <gtest/gtest.h>

#include "intake/MetricGroupV2.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

namespace quorl {
namespace {

// Row, technology, name, id, id in hexadecimal, class, family.
constexpr char kCatalogue[] = R"(
1|5G|NrSys InfoBlocks|806912|C5000|CellularNrSysInfoBlocks|mav
2|5G|Nr Ota Msg|806913|C5001|CellularNrOtaMsg|mav
3|5G|Nr Serving cell Info|806914|C5002|CellularNrScellInfo|mav
4|5G|Nr Rach Attempt|806915|C5003|CellularNrRachAttempt|mav
5|5G|Nr Rrc State|806917|C5005|CellularNrRrcState|mav
6|5G|Nr Scg Addition|806919|C5007|CellularNrScgAddition|mav
7|5G|Nr Scg Removal|806920|C5008|CellularNrScgRemoval|mav
8|5G|Nr Beam Switch|806922|C500A|CellularNrBeamSwitch|mav
9|5G|Nr Rrc Resume|806928|C5010|CellularNrRrcResume|mav
10|5G|Nr R. LinkFailure|806931|C5013|CellularNrRadioLinkFailure|mav
11|5G|Nr UlPdcpStats|806932|C5014|CellularNrUlPdcpStats|mav
12|5G|Nr EndcUsageStats|806933|C5015|CellularNrEndcUsageStats|mav
13|5G|Nr ConnectionStats|806934|C5016|CellularNrConnectionStats|mav
14|LTE|ConnectionStats|806743|C4F57|CellularLTEConnectionStats|mav
15|5G|Nr SDMActivation|806936|C5018|CellularNrSDMActivation|mav
16|5G|Nr SdmEndcRelease|806937|C5019|CellularNrSdmEndcRelease|mav
17|MISC|Lqm State Change|827656|CA108|CellularLqmStateChange|mav
18|MISC|Reg Attempt|827652|CA104|CellularRegAttempt|mav
19|MISC|Registered Plmn Status|827650|CA102|CellularRegisteredPlmnStatus|mav
20|MISC|Cellular Rat Lac Srv Info|827747|CA163|CellularRatLacSrvInfo|mav
21|MISC|Cellular Health monitor|816135|C7407|CellularHealthMonitor|mav
22|MISC|Cmda Cell Info|790530|C1002|CellularCdmaCellInfo|mav
23|MISC|GsmWcdmaCellInfo|798732|C300C|CellularGsmWcdmaCellInfo|mav
24|MISC|WcdmaRrcState|802306|C3E02|CellularWcdmaRrcState|mav
25|MISC|WcdmaRachattempt|802315|C3E0B|CellularWcdmaRachattempt|mav
26|LTE|Serving Cell Meas|806660|C4F04|CellularLteRsrpRsrqSinrHist|mav
27|LTE|RrcStateHist|806674|C4F12|CellularLteRrcStateHist|mav
28|LTE|Rach Attempt|803104|C4120|CellularLteRachAttempt|mav
29|MISC|Cellular Service Status|827648|CA100|CellularServiceStatus|mav
30|MISC|Cellular Service Status|827649|CA101|CellularSysOprtMode|mav
31|MISC|Cellular SimHplmn|827651|CA103|CellularSimHplmn|mav
32|MISC|Cellular LqmDataStall|827683|CA123|CellularLqmDataStall|mav
33|MISC|Cellular RatRetention|827746|CA162|CellularRatRetention|mav
34|MISC|Cellular CallEndDetails|835590|CC006|CellularCallEndDetails|mav
35|MISC|Cellular CsCallPageRespFail|835591|CC007|CellularCsCallPageRespFail|mav
36|MISC|Cellular CsCallGwlPageRespFail|835592|CC008|CellularCsCallGwlPageRespFail|mav
37|MISC|Cellular VoiceLastCallEnd|836134|CC226|CellularVoiceLastCallEnd|mav
38|MISC|Cellular RfTunerEvent|816389|C7505|CellularRfTunerEvent|mav
39|5G|Nr Radio Link Failure|806931|C5013|CellularNrRrcState|mav
40|LTE|Ota Msg|803011|C40C3|CellularLteOtaMsg|mav
41|LTE|Serving Cell Info|803010|C40C2|CellularLteScellInfo|mav
42|Device Info|SIM Files|3932179|3C0013|KCellularSimCardFiles|ice
43|LTE|RRC State|3952132|3C4E04|KCellularLteRrcState|ice
44|LTE|Serving Cell Info|3948738|3C40C2|KCellularLteScellInfo|ice
45|LTE|Serving Cell Meas|3986177|3CD301|KCellularLteServingCellMeasurement|ice
46|LTE|CA Status|3986195|3CD313|KCellularLteCarrierAggregationStatus|ice
47|LTE|C-DRX|3952152|3C4E18|KCellularLteCdrxConfig|ice
48|LTE|Sel Resel Parameters|3986190|3CD30E|KCellularLteSelReselCellInfo|ice
49|LTE|Component Carrier Info|3986187|3CD30B|KCellularLteComponentCarrierInfo|ice
50|LTE|Tx Power|3986178|3CD302|KCellularLteTxPower|ice
51|UMTS|RRC State|3985682|3CD112|KCellularWcdmaRrcConnectionState|ice
52|LTE|NAS|3986700|3CD50C|KCellularEmmContext|ice
53|LTE|UMTS Neighbor Cell Meas|3986192|3CD310|KCellularLteNbrInterRatCellMeas|ice
54|LTE|GSM Neighbor Cell Meas|3986192|3CD310|KCellularLteNbrInterRatCellMeas|ice
55|LTE|Neighbor Cell Meas|3986191|3CD30F|KCellularLteNbrEutraCellMeas|ice
56|LTE|Active Bearers|3986701|3CD50D|KCellularActivatedBearerContexts|ice
57|UMTS|Active Bearers|3986701|3CD50D|KCellularActivatedBearerContexts|ice
58|GSM|Active Bearers|3986701|3CD50D|KCellularActivatedBearerContexts|ice
59|UMTS|RRC Configuration|3985683|3CD113|KCellularWcdmaRrcConfiguration|ice
60|UMTS|Serving Cell Info|3944460|3C300C|KCellularWcdmaCellInfo|ice
61|UMTS|Serving Cell Info|3985666|3CD102|KCellularWcdmaScellMeasurement|ice
62|UMTS|Tx Power|3985667|3CD103|KCellularWcdmaTxPower|ice
63|UMTS|Sel Resel Parameters|3985668|3CD104|KCellularWcdmaSelReselCellInfo|ice
64|UMTS|UTRA Neighbor Info|3985668|3CD104|KCellularWcdmaSelReselCellInfo|ice
65|UMTS|GSM Neighbor Info|3985668|3CD104|KCellularWcdmaSelReselCellInfo|ice
66|UMTS|UMTS Neighbor Cell Meas|3985669|3CD105|KCellularWcdmaNbrCellMeas|ice
67|UMTS|GSM Neighbor Cell Meas|3985669|3CD105|KCellularWcdmaNbrCellMeas|ice
68|UMTS|LTE Neighbor Cell Meas|3985669|3CD105|KCellularWcdmaNbrCellMeas|ice
69|UMTS|NAS MM|3986698|3CD50A|KCellularMmContext|ice
70|GSM|NAS MM|3986698|3CD50A|KCellularMmContext|ice
71|UMTS|NAS GMM|3986699|3CD50B|KCellularGmmContext|ice
72|GSM|NAS GMM|3986699|3CD50B|KCellularGmmContext|ice
73|GSM|Serving Cell Info|3943948|3C2E0C|KCellularGsmScellInfo|ice
74|GSM|Idle Config|3985409|3CD001|kCellularGsmIdleConfig|ice
75|GSM|Idle Serv Cell Meas|3985410|3CD002|kCellularGsmIdleScellMeasurement|ice
76|GSM|Connected Serv Cell Meas|3985411|3CD003|kCellularGsmCsRfMeasurement|ice
77|GSM|GPRS Config|3985420|3CD00C|kCellularGsmGprsConfig|ice
78|GSM|Neighbor Cell Meas|3985417|3CD009|kCellularGsmGrrEventMeasCr|ice
79|GSM|UMTS Neighbor Cell Meas|3985417|3CD009|kCellularGsmGrrEventMeasCr|ice
80|GSM|LTE Neighbor Cell Meas|3985417|3CD009|kCellularGsmGrrEventMeasCr|ice
)";

TEST(MetricGroupV2Test, TheCatalogueHoldsItsRowsInTheOrderOfTheWalk) {
  std::ostringstream written;
  written << '\n';
  int number = 0;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData())
    written << fmt::format("{}|{}|{}|{}|{:2X}|{}|{}\n", ++number, row.tech, row.name, row.zelkorId, row.zelkorId,
                           row.className, row.deviceType);
  EXPECT_EQ(written.str(), kCatalogue);
}

TEST(MetricGroupV2Test, TheFamiliesHaveTheirNumbersOfRowsAndSeparateIds) {
  int mav = 0;
  int ice = 0;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    if (row.deviceType == "mav") {
      ++mav;
      EXPECT_LT(row.zelkorId, 1000000);
    } else {
      ++ice;
      EXPECT_EQ(row.deviceType, "ice");
      EXPECT_GT(row.zelkorId, 3900000);
    }
  }
  EXPECT_EQ(mav, 41);
  EXPECT_EQ(ice, 39);
}

TEST(MetricGroupV2Test, TwelveRowsNameNoClassAsMeant) {
  std::vector<std::pair<int, std::string>> missing;
  int number = 0;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    ++number;
    if (!makeMessage(row.className)) missing.emplace_back(number, row.className);
  }
  EXPECT_EQ(missing, (std::vector<std::pair<int, std::string>>{{14, "CellularLTEConnectionStats"},
                                                               {25, "CellularWcdmaRachattempt"},
                                                               {33, "CellularRatRetention"},
                                                               {35, "CellularCsCallPageRespFail"},
                                                               {37, "CellularVoiceLastCallEnd"},
                                                               {74, "kCellularGsmIdleConfig"},
                                                               {75, "kCellularGsmIdleScellMeasurement"},
                                                               {76, "kCellularGsmCsRfMeasurement"},
                                                               {77, "kCellularGsmGprsConfig"},
                                                               {78, "kCellularGsmGrrEventMeasCr"},
                                                               {79, "kCellularGsmGrrEventMeasCr"},
                                                               {80, "kCellularGsmGrrEventMeasCr"}}));
}

TEST(MetricGroupV2Test, FourRowsNameAClassWithoutSubscriptionIdSoThatNothingOfThemIsStored) {
  std::vector<std::string> names;
  for (const MetricGroupV2& row : MetricGroupV2::metricGroupData()) {
    const auto message = makeMessage(row.className);
    if (!message) continue;
    const auto fields = message->table().fields;
    if (std::none_of(fields.begin(), fields.end(), [](const FieldEntry& field) { return field.key == "subs_id"; }))
      names.emplace_back(row.name);
  }
  EXPECT_EQ(names, (std::vector<std::string>{"Lqm State Change", "Reg Attempt", "Cellular SimHplmn",
                                             "Cellular CsCallGwlPageRespFail"}));
}

TEST(MetricGroupV2Test, NineAttributesAreGraphable) {
  const std::set<std::pair<std::string, std::string>> graphable{
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
  for (const auto& [metricName, attributeName] : graphable) {
    EXPECT_TRUE(isGraphable(metricName, attributeName)) << metricName << ' ' << attributeName;
    const bool swapped =
        graphable.contains({metricName == "Cell Info" ? "Nr ConnectionStats" : "Cell Info", attributeName});
    EXPECT_EQ(isGraphable(metricName == "Cell Info" ? "Nr ConnectionStats" : "Cell Info", attributeName), swapped);
  }
}

TEST(MetricGroupV2Test, TheMetricsNameAndNotItsTechnologyDecidesWhatIsGraphable) {
  EXPECT_FALSE(isGraphable("Nr ConnectionStats", "timestamp"));
  EXPECT_FALSE(isGraphable("LTE", "duration_of_conn"));
  EXPECT_FALSE(isGraphable("5G", "duration_of_conn"));
  EXPECT_FALSE(isGraphable("ConnectionStats", "duration_of_conn"));
  EXPECT_FALSE(isGraphable("nr connectionstats", "duration_of_conn"));
  EXPECT_FALSE(isGraphable("", ""));
  EXPECT_FALSE(isGraphable("Nr ConnectionStats:duration_of_conn", ""));
}

}  // namespace
}  // namespace quorl
