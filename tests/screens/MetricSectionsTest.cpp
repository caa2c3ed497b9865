#include "MetricDetailFixture.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::UnorderedElementsAre;
using namespace std::chrono_literals;

constexpr char kDeployment[] = "kHVCellMonitorDeploymentType";
constexpr char kTechnology[] = "kHVCellMonitorCellRadioAccessTechnology";

using MetricSectionsTest = test::MetricDetailTest;

// "Cell Info".

TEST_F(MetricSectionsTest, CellInfoWithoutADeploymentRowStaysAsItIs) {
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo("kHVCellMonitorTAC", "4711");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "LTE"), Pair("kHVCellMonitorTAC", "4711")));
}

TEST_F(MetricSectionsTest, ADeploymentOfZeroShowsLte) {
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo(kDeployment, "0");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "LTE"), Pair(kDeployment, "LTE (0)")));
}

TEST_F(MetricSectionsTest, ADeploymentThatIsNoNumberShowsLte) {
  launch();
  for (const char* value : {"", "unknown", "2.5", " 2"}) {
    pass(1s);
    cellInfo(kDeployment, value);
    opened("RAT", "Cell Info");
    EXPECT_THAT(shown(), ElementsAre(Pair(kDeployment, "LTE (0)"))) << value;
  }
}

TEST_F(MetricSectionsTest, ANegativeDeploymentChangesNothing) {
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo(kDeployment, "-1");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "LTE"), Pair(kDeployment, "-1")));
}

TEST_F(MetricSectionsTest, APositiveDeploymentShowsNsaAndSwallowsTheTechnologyLte) {
  launch();
  cellInfo(kTechnology, "kHVCellMonitorRadioAccessTechnologyLTE");  // the read takes the prefix off
  cellInfo(kDeployment, "2");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kDeployment, "5G NSA (2)")));
}

TEST_F(MetricSectionsTest, APositiveDeploymentLeavesAnotherTechnologyAlone) {
  launch();
  cellInfo(kTechnology, "NR");
  cellInfo(kDeployment, "1");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "NR"), Pair(kDeployment, "5G NSA (1)")));
}

TEST_F(MetricSectionsTest, TheDeploymentRuleIsForCellInfoAlone) {
  launch();
  stored(reading("RAT", "Active Bands", kDeployment, "2"));
  opened("RAT", "Active Bands");
  EXPECT_THAT(shown(), ElementsAre(Pair(kDeployment, "2")));
}

TEST_F(MetricSectionsTest, TheRowsOfCellInfoAreFoundByTheirRawNames) {
  platform.strings.table = {{kDeployment, "Deployment"},
                            {kTechnology, "Technology"},
                            {"kHVCellMonitorBandInfo", kDeployment},
                            {"kHVCellMonitorTAC", kTechnology}};
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo(kDeployment, "2");
  cellInfo("kHVCellMonitorBandInfo", "3");
  cellInfo("kHVCellMonitorTAC", "LTE");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair(kDeployment, "5G NSA (2)"), Pair("kHVCellMonitorBandInfo", "3"),
                                            Pair("kHVCellMonitorTAC", "LTE")));
}

// "CA Status".

TEST_F(MetricSectionsTest, CaStatusMakesASectionForEachNumberBelowTheLastRowsAsMeant) {
  launch();
  caStatus("0-section-rsrp", "-90");
  caStatus("0-section-dl_bw", "100");
  caStatus("1-section-rsrp", "-95");
  caStatus("2-section-rsrp", "-99");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 2U);
  const MetricSectional& first = model->metricSectionals()[0];
  EXPECT_EQ(first.sectionName, "0");
  ASSERT_EQ(first.sectionMetrics.size(), 2U);
  EXPECT_EQ(first.sectionMetrics[0].attributeNameNonLocalized, "0-section-dl_bw");
  EXPECT_EQ(first.sectionMetrics[0].sectionNumber, "0");
  EXPECT_EQ(model->metricSectionals()[1].sectionName, "1");
  EXPECT_EQ(model->metricSectionals()[1].sectionMetrics.size(), 1U);
  EXPECT_NE(first.id, model->metricSectionals()[1].id);
  EXPECT_EQ(model->metrics().size(), 4U);
}

TEST_F(MetricSectionsTest, ALastRowWithoutANumberEndsTheWorkWithoutSectionsAsMeant) {
  launch();
  caStatus("0-section-rsrp", "-90");
  caStatus("1-section-rsrp", "-95");
  caStatus("timestamp", "1700000000123");
  opened("LTE", "CA Status");
  EXPECT_THAT(model->metricSectionals(), IsEmpty());
  EXPECT_EQ(model->metrics().size(), 2U);
}

TEST_F(MetricSectionsTest, SectionsAreToldByTheRawNames) {
  platform.strings.table = {
      {"0-section-rsrp", "Signal"}, {"1-section-rsrp", "Other signal"}, {"0-pci", "0-section-pci"}};
  launch();
  caStatus("0-section-rsrp", "-90");
  caStatus("1-section-rsrp", "-95");
  caStatus("0-pci", "7");
  caStatus("1-section-pci", "8");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 1U);
  ASSERT_EQ(model->metricSectionals()[0].sectionMetrics.size(), 1U);
  EXPECT_EQ(model->metricSectionals()[0].sectionMetrics[0].attributeName, "Signal");
}

TEST_F(MetricSectionsTest, TheLastRowIsThatOfTheReadAndNotOfTheNamesShown) {
  platform.strings.table = {
      {"0-section-dl_bw", "Z"}, {"0-section-rsrp", "Y"}, {"1-section-rsrp", "X"}, {"2-section-rsrp", "A"}};
  launch();
  caStatus("0-section-dl_bw", "100");
  caStatus("0-section-rsrp", "-90");
  caStatus("1-section-rsrp", "-95");
  caStatus("2-section-rsrp", "-99");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metrics().front().attributeName, "A");
  ASSERT_EQ(model->metricSectionals().size(), 2U);
  // So are the rows of a section.
  ASSERT_EQ(model->metricSectionals()[0].sectionMetrics.size(), 2U);
  EXPECT_EQ(model->metricSectionals()[0].sectionMetrics[0].attributeName, "Z");
}

TEST_F(MetricSectionsTest, ALastRowWhoseNumberIsNoIntegerGivesNoSections) {
  launch();
  caStatus("0-section-rsrp", "-90");
  for (const char* name : {"3a-section-rsrp", "4.5-section-rsrp", "section-rsrp"}) {
    pass(1s);
    caStatus(name, "-95");
    opened("LTE", "CA Status");
    EXPECT_THAT(model->metricSectionals(), IsEmpty()) << name;
  }
}

TEST_F(MetricSectionsTest, ASectionWithoutRowsIsEmpty) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("2-section-rsrp");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 2U);
  EXPECT_THAT(model->metricSectionals()[1].sectionMetrics, IsEmpty());
}

TEST_F(MetricSectionsTest, SectionsAreMadeAnewAtEachLoad) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 1U);
  arrives(reading("LTE", "CA Status", "subs_id", "0"));  // the last row now, and without a number
  EXPECT_THAT(model->metricSectionals(), IsEmpty());
}

TEST_F(MetricSectionsTest, SectionsAreForCaStatusAlone) {
  launch();
  stored(reading("LTE", "Component Carrier Info", "0-section-rsrp", "-90"));
  stored(reading("LTE", "Component Carrier Info", "1-section-rsrp", "-95"));
  opened("LTE", "Component Carrier Info");
  EXPECT_THAT(model->metricSectionals(), IsEmpty());
}

TEST_F(MetricSectionsTest, EachStepOfTheSectionsIsSignalled) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  caStatus("2-section-rsrp");
  open("LTE", "CA Status");
  std::vector<std::size_t> sizes;
  const Connection connection = model->onChange([&] { sizes.push_back(model->metricSectionals().size()); });
  settle();
  // Spinner, rows, last seen, sections emptied, two sections, rows sorted.
  EXPECT_THAT(sizes, ElementsAre(0, 0, 0, 0, 1, 2, 2));
}

TEST(MetricSectionsDeathTest, ANegativeSectionNumberStopsTheProcess) {
  Metric row;
  row.sectionNumber = "-1";
  EXPECT_DEATH(sectionsOf({row}), "negative section number");
}

}  // namespace
}  // namespace quorl
