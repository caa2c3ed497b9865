#include "ScreenTest.h"
#include "screens/export/ExportText.h"
#include "screens/export/ExportViewController.h"
#include "support/Reading.h"

namespace quorl {
namespace {

using test::line;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

Metric exampleRow() {
  Metric metric =
      test::readingAt(Date(std::chrono::seconds(1767605412)), "LTE", "Serving Cell Info", "dl_freq", "5230");
  metric.id = Uuid{{0x6D, 0x9C, 0x1C, 0x4A, 0, 0, 0x40, 0, 0x80, 0, 0, 0, 0, 0, 0, 0}};
  metric.attributeValueType.clear();
  return metric;
}

std::string textOf(const Metric& metric) {
  std::string text;
  appendMetricText(text, metric);
  return text;
}

ExportedMetrics exportOf(const std::vector<Metric>& metrics) {
  test::FakeStrings strings;
  ExportedMetrics rows;
  for (const Metric& metric : metrics)
    rows.append({{},
                 metric.metricTech,
                 metric.metricName,
                 {},
                 metric.attributeNameNonLocalized,
                 metric.attributeValue,
                 metric.collectedOn,
                 metric.metricId,
                 metric.subsId},
                strings);
  return rows;
}

TEST(ExportTextTest, ARowIsPrintedWithAllThirteenFields) {
  EXPECT_EQ(textOf(exampleRow()),
            "QuorlInternal_4.Metric(id: 6D9C1C4A-0000-4000-8000-000000000000, metricTech: LTE, metricName: Serving "
            "Cell Info, attributeName: dl_freq, attributeNameNonLocalized: dl_freq, attributeValue: 5230, "
            "attributeValueType: , collectedOn: 2026-01-05 09:30:12 +0000, metricId: 803010, subsId: 0, graphable: "
            "false, isBookmarked: false, sectionNumber: nil)");
}

TEST(ExportTextTest, RowsAreJoinedByASingleComma) {
  const ExportedMetrics rows = exportOf({exampleRow(), exampleRow(), exampleRow()});
  EXPECT_EQ(exportText(rows),
            textOf(rows.row(0).metric()) + "," + textOf(rows.row(1).metric()) + "," + textOf(rows.row(2).metric()));
}

TEST(ExportTextTest, NoRowsGiveAnEmptyText) {
  EXPECT_EQ(exportText({}), "");
}

TEST(ExportTextTest, NothingIsQuotedOrEscapedAsMeant) {
  Metric metric = exampleRow();
  metric.attributeValue = "a,b (\"c\")\n";
  EXPECT_THAT(textOf(metric), HasSubstr("attributeValue: a,b (\"c\")\n, attributeValueType"));
}

TEST(ExportTextTest, FlagsSubscriptionAndSectionPrintAsTheyAre) {
  Metric metric = exampleRow();
  metric.subsId = -2147483647 - 1;
  metric.graphable = true;
  metric.isBookmarked = true;
  metric.sectionNumber = "2";
  EXPECT_THAT(textOf(metric),
              ::testing::EndsWith("subsId: -2147483648, graphable: true, isBookmarked: true, sectionNumber: "
                                  "Optional(\"2\"))"));
}

TEST(ExportTextTest, TimesOfManyDaysInAnyOrderPrintLikeOneByOne) {
  const test::ScopedTimeZone zone("America/New_York");
  std::vector<Metric> metrics;
  for (const std::int64_t seconds :
       {1767605412, 1767571200, 1767571199, 0, -1, -86400, -86401, 1772953200, 1772953199, 951827696}) {
    metrics.push_back(exampleRow());
    metrics.back().collectedOn = Date(std::chrono::seconds(seconds));
  }
  const ExportedMetrics rows = exportOf(metrics);
  std::string expected;
  for (std::size_t i = 0; i < rows.size(); ++i) expected += (i > 0 ? "," : "") + textOf(rows.row(i).metric());
  EXPECT_EQ(exportText(rows), expected);
  EXPECT_THAT(expected, HasSubstr("collectedOn: 1969-12-31 23:59:59 +0000"));
  EXPECT_THAT(expected, HasSubstr("collectedOn: 1969-12-31 00:00:00 +0000"));
  EXPECT_THAT(expected, HasSubstr("collectedOn: 1969-12-30 23:59:59 +0000"));
  EXPECT_THAT(expected, HasSubstr("collectedOn: 2000-02-29 12:34:56 +0000"));
}

TEST(ExportTextTest, ATimeIsCutOffToItsSecond) {
  Metric metric = exampleRow();
  metric.collectedOn += 999'999us;
  EXPECT_EQ(textOf(metric), textOf(exampleRow()));
}

/// What a statement counts as now is the machine's time.
class ExportTest : public test::ScreenTest {
 protected:
  ExportTest() { livesNow(); }

  void open() {
    screen = ExportViewController::make(store);
    log.clear();
  }
  ExportView& row(const std::string& label) {
    for (ExportView& view : screen->containerView())
      if (view.labelText() == label) return view;
    throw std::runtime_error("no row " + label);
  }
  void taps(const std::string& label) { row(label).didTapExportButton(); }
  Metric power(const std::string& value, std::chrono::hours ago = 0h, std::int32_t subsId = 0) {
    Metric metric = reading("LTE", "Tx Power", "power", value, subsId);
    metric.collectedOn = now() + 1min - ago;  // so that midnight may pass during the test
    return metric;
  }
  std::string shared() {
    if (platform.share.texts.empty()) return "nothing was shared";
    return platform.share.texts.back();
  }

  std::shared_ptr<ExportViewController> screen;
};

TEST_F(ExportTest, OffersThreeTimeFramesUnderItsHeading) {
  launch();
  open();
  std::vector<std::string> labels;
  for (const ExportView& view : screen->containerView()) labels.push_back(view.labelText());
  EXPECT_THAT(labels, ElementsAre("Daily", "Weekly", "Monthly"));
  EXPECT_STREQ(ExportViewController::exportOptionsLabel, "Select a time frame to export all metrics");
  EXPECT_TRUE(screen->loadingView().isHidden());
}

TEST_F(ExportTest, ATapShowsThatItGathersAndThenSharesOneText) {
  launch();
  stored(power("11"));
  open();
  taps("Daily");
  EXPECT_TRUE(log.has(line("general", "Export View - didTapExportButton")));
  EXPECT_FALSE(screen->loadingView().isHidden());
  EXPECT_TRUE(screen->loadingView().isAnimating());
  EXPECT_EQ(screen->loadingView().loadingLabelText(), "Gathering metrics from database");
  EXPECT_THAT(platform.share.texts, IsEmpty());
  settle();
  EXPECT_TRUE(screen->loadingView().isHidden());
  EXPECT_FALSE(screen->loadingView().isAnimating());
  ASSERT_THAT(platform.share.texts, SizeIs(1));
  EXPECT_THAT(shared(), ::testing::StartsWith("QuorlInternal_4.Metric(id: "));
  EXPECT_THAT(shared(), HasSubstr("attributeValue: 11, attributeValueType: , "));
}

TEST_F(ExportTest, TheTextIsCalledByTimeFrameAndTime) {
  launch();
  platform.time.setNow(Date(std::chrono::seconds(1767605412)));
  open();
  EXPECT_EQ(row("Daily").fileName(), "quorl-daily-2026-01-05-093012.txt");
  EXPECT_EQ(row("Monthly").fileName(), "quorl-monthly-2026-01-05-093012.txt");
  taps("Weekly");
  pass(1h);
  EXPECT_THAT(platform.share.fileNames, ElementsAre("quorl-weekly-2026-01-05-093012.txt"));  // of the tap
}

TEST_F(ExportTest, ATextOfManyPiecesIsTheSameAsAWhole) {
  ExportedMetrics metrics;
  const Metric row = exampleRow();
  for (int i = 0; i < 1000; ++i)
    metrics.append({Uuid::make(), row.metricTech, row.metricName, row.attributeName, row.attributeNameNonLocalized,
                    std::to_string(i), row.collectedOn, row.metricId, row.subsId},
                   platform.strings);
  const SharedText shared = sharedExportText(metrics, "name.txt");
  EXPECT_EQ(shared.text(), exportText(metrics));
  EXPECT_EQ(shared.text(), exportText(metrics));  // it can be made again
  std::size_t pieces = 0;
  shared.write([&](std::string_view piece) {
    EXPECT_LT(piece.size(), 128U * 1024);
    return ++pieces < 2;
  });
  EXPECT_EQ(pieces, 2U);  // and ends when it is told to
  EXPECT_EQ(sharedExportText(ExportedMetrics(), "name.txt").text(), "");
}

TEST_F(ExportTest, EachRowTakesItsOwnTimeFrame) {
  launch();
  stored(power("1"));
  stored(power("2", 24h * 4));
  stored(power("3", 24h * 20));
  open();
  const auto count = [&](const std::string& label) {
    taps(label);
    settle();
    const std::string text = shared();
    std::size_t rows = 0;
    for (std::size_t at = text.find("QuorlInternal_4"); at != std::string::npos;
         at = text.find("QuorlInternal_4", at + 1))
      ++rows;
    return rows;
  };
  EXPECT_EQ(count("Daily"), 1U);
  EXPECT_EQ(count("Weekly"), 2U);
  EXPECT_EQ(count("Monthly"), 3U);
}

TEST_F(ExportTest, BothSubscriptionsAreMixedAndToldApartBySubsId) {
  launch();
  stored(power("1", 0h, 0));
  stored(power("2", 0h, 1));
  open();
  taps("Daily");
  settle();
  EXPECT_THAT(shared(), HasSubstr("subsId: 0"));
  EXPECT_THAT(shared(), HasSubstr("subsId: 1"));
}

TEST_F(ExportTest, BothNamesOfAnAttributeArePrinted) {
  platform.strings.table = {{"power", "Transmit power"}};
  launch();
  stored(power("11"));
  open();
  taps("Daily");
  settle();
  EXPECT_THAT(shared(), HasSubstr("attributeName: Transmit power, attributeNameNonLocalized: power, "));
}

TEST_F(ExportTest, NothingStoredGivesAnEmptyText) {
  launch();
  open();
  taps("Monthly");
  settle();
  ASSERT_THAT(platform.share.texts, SizeIs(1));
  EXPECT_EQ(shared(), "");
}

TEST_F(ExportTest, AFailedReadIsLoggedAndTheLoadingViewStaysAsMeant) {
  launch();
  loses("Metric");
  open();
  taps("Weekly");
  settle();
  EXPECT_FALSE(screen->loadingView().isHidden());
  EXPECT_TRUE(screen->loadingView().isAnimating());
  EXPECT_THAT(platform.share.texts, IsEmpty());
  ASSERT_THAT(log.texts("general"), SizeIs(2));
  EXPECT_THAT(log.texts("general")[1], ::testing::StartsWith("error  ---> Prepare(message: "));
  EXPECT_THAT(log.texts("general")[1], ::testing::EndsWith("))"));  // the second is the line's own
}

TEST_F(ExportTest, ARowThatCannotBeReadIsLoggedAndTheLoadingViewStays) {
  launch();
  stored(power("1"));
  sql("UPDATE Metric SET attribute_value = NULL");
  open();
  taps("Daily");
  settle();
  EXPECT_TRUE(log.has(line("general", "error  ---> EmptyQueryResult)")));
  EXPECT_FALSE(screen->loadingView().isHidden());
  EXPECT_THAT(platform.share.texts, IsEmpty());
}

TEST_F(ExportTest, AScreenDismissedMeanwhileSharesNothing) {
  launch();
  stored(power("1"));
  open();
  taps("Daily");
  screen.reset();
  settle();
  EXPECT_THAT(platform.share.texts, IsEmpty());
}

TEST_F(ExportTest, TheCrossClosesIt) {
  launch();
  open();
  int closed = 0;
  const Connection connection = screen->onDismiss([&] { ++closed; });
  screen->dismiss();
  EXPECT_EQ(closed, 1);
}

}  // namespace
}  // namespace quorl
