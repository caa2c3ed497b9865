#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "screens/history/AttributeDetailsViewModel.h"
#include "screens/history/GraphScale.h"
#include "screens/history/GraphView.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

constexpr double kPlot = 240;
constexpr double kAvailable = kPlot - kBarAreaReserve;

std::vector<Metric> rowsOf(const std::vector<std::string>& values) {
  std::vector<Metric> rows(values.size());
  for (std::size_t i = 0; i < values.size(); ++i) rows[i].attributeValue = values[i];
  return rows;
}

GraphScale scaleOf(const std::vector<std::string>& values, double plotHeight = kPlot) {
  const AttributeDetailsViewModel model(rowsOf(values), {}, {});
  return {model.dataSource(), model.maxValueOfDataSource(), plotHeight};
}

std::vector<std::string> tickTexts(const GraphScale& scale) {
  std::vector<std::string> texts;
  for (const GraphTick& tick : scale.ticks()) texts.push_back(tick.text);
  return texts;
}

TEST(GraphScaleTest, PositiveBarsHaveTheHeightsOfTheirRuleOnABaselineAtTheBottom) {
  const GraphScale scale = scaleOf({"5", "10", "0"});
  EXPECT_DOUBLE_EQ(scale.height("10"), kAvailable);
  EXPECT_DOUBLE_EQ(scale.height("5"), kAvailable / 2);
  EXPECT_DOUBLE_EQ(scale.height("0"), 0);
  EXPECT_DOUBLE_EQ(scale.baseline(), kPlot);
}

TEST(GraphScaleTest, AnAverageAboveTheIntegerMaximumStandsHigherAsMeant) {
  EXPECT_DOUBLE_EQ(scaleOf({"5.5", "4"}).height("5.5"), kAvailable * 5.5 / 5);
}

TEST(GraphScaleTest, NegativeBarsAreMeasuredByTheGreatestAndShrinkUntilTheLargestFits) {
  const GraphScale scale = scaleOf({"-70", "-140", "-105"});
  EXPECT_NEAR(scale.height("-140"), kAvailable, 1e-9);
  EXPECT_NEAR(scale.height("-70"), kAvailable / 2, 1e-9);
  EXPECT_DOUBLE_EQ(scale.baseline(), kPlot);
}

TEST(GraphScaleTest, BarsOfBothSignsShareThePlot) {
  const GraphScale scale = scaleOf({"10", "-20"});
  EXPECT_LT(scale.height("-20"), 0);
  EXPECT_NEAR(scale.height("-20"), -2 * scale.height("10"), 1e-9);
  EXPECT_NEAR(scale.height("10") - scale.height("-20"), kAvailable, 1e-9);
  EXPECT_NEAR(scale.baseline(), kPlot + scale.height("-20"), 1e-9);
}

TEST(GraphScaleTest, ZerosAloneAreTheMaximumAndStandInFull) {
  const GraphScale scale = scaleOf({"0", "0"});
  EXPECT_DOUBLE_EQ(scale.height("0"), kAvailable);
  EXPECT_THAT(tickTexts(scale), ElementsAre("0"));
  EXPECT_DOUBLE_EQ(scale.ticks()[0].y, kPlot - kAvailable);
}

TEST(GraphScaleTest, FractionsBelowOneAreMeasuredByTheirLargest) {
  const GraphScale scale = scaleOf({"0.25", "0.5"});
  EXPECT_DOUBLE_EQ(scale.height("0.5"), kAvailable);
  EXPECT_DOUBLE_EQ(scale.height("0.25"), kAvailable / 2);
}

TEST(GraphScaleTest, NothingAboveZeroIsMeasuredByTheLeast) {
  const GraphScale scale = scaleOf({"0", "-3"});
  EXPECT_DOUBLE_EQ(scale.height("-3"), kAvailable);
  EXPECT_DOUBLE_EQ(scale.height("0"), 0);
}

TEST(GraphScaleTest, NoBarLeavesThePlotAndTheTicksStandBesideTheirBars) {
  const std::vector<std::vector<std::string>> frames{
      {"1"},           {"-1"},  {"7", "3"},  {"9.9", "2"}, {"-44", "-140"}, {"100", "-1"}, {"1", "-100"},
      {"0.3", "-0.2"}, {"5e8"}, {"12", "x"}, {"1e300"},    {"0", "-0.5"},   {"-7", "0.9"}, {"250000000", "13"}};
  for (const auto& values : frames) {
    SCOPED_TRACE(values.front() + " …");
    const GraphScale scale = scaleOf(values);
    for (const std::string& value : values) {
      const double top = scale.baseline() - scale.height(value);
      EXPECT_GE(top, -1e-6);
      EXPECT_LE(top, kPlot + 1e-6);
    }
    ASSERT_THAT(scale.ticks(), SizeIs(3));
    for (const GraphTick& tick : scale.ticks()) {
      EXPECT_GE(tick.y, -1e-6);
      EXPECT_LE(tick.y, kPlot + 1e-6);
    }
    EXPECT_THAT(tickTexts(scale), ::testing::Contains("0"));
  }
}

TEST(GraphScaleTest, TicksAreThreeRoundValues) {
  EXPECT_THAT(tickTexts(scaleOf({"10"})), ElementsAre("0", "5", "10"));
  EXPECT_THAT(tickTexts(scaleOf({"7"})), ElementsAre("0", "3", "6"));
  EXPECT_THAT(tickTexts(scaleOf({"9.9"})), ElementsAre("0", "4", "8"));
  EXPECT_THAT(tickTexts(scaleOf({"1"})), ElementsAre("0", "0.5", "1"));
  EXPECT_THAT(tickTexts(scaleOf({"-90", "-104"})), ElementsAre("-100", "-50", "0"));
  EXPECT_THAT(tickTexts(scaleOf({"30000"})), ElementsAre("0", "15k", "30k"));
  EXPECT_THAT(tickTexts(scaleOf({"250000000"})), ElementsAre("0", "100M", "200M"));
  EXPECT_THAT(tickTexts(scaleOf({"10", "-20"})), ElementsAre("-10", "0", "10"));
}

TEST(GraphScaleTest, ATickStandsWhereABarOfItsValueEnds) {
  const GraphScale scale = scaleOf({"-80", "-100"});
  for (const GraphTick& tick : scale.ticks()) EXPECT_NEAR(tick.y, scale.baseline() - scale.height(tick.text), 1e-9);
}

TEST(GraphScaleTest, WithoutRowsOrRoomThereIsNothing) {
  EXPECT_THAT(scaleOf({}).ticks(), IsEmpty());
  EXPECT_THAT(scaleOf({"5"}, kBarAreaReserve).ticks(), IsEmpty());
  EXPECT_THAT(GraphScale().ticks(), IsEmpty());
}

TEST(GraphScaleTest, LabelsAreThinnedUntilNoneOverlap) {
  EXPECT_EQ(labelStride(20, 36), 1U);
  EXPECT_EQ(labelStride(28, 36), 1U);
  EXPECT_EQ(labelStride(29, 36), 2U);
  EXPECT_EQ(labelStride(80, 36), 3U);
  EXPECT_EQ(labelStride(0, 36), 1U);
  EXPECT_EQ(labelStride(80, 0), 1U);
}

TEST(GraphScaleTest, AnAverageIsShownWithTwoDecimalsAndATextAsItIs) {
  EXPECT_EQ(shortValue("-91.3333333333"), "-91.33");
  EXPECT_EQ(shortValue("-91.5"), "-91.5");
  EXPECT_EQ(shortValue("12.0"), "12");
  EXPECT_EQ(shortValue("-0.001"), "0");
  EXPECT_EQ(shortValue("100"), "100");
  EXPECT_EQ(shortValue("Serving"), "Serving");
  EXPECT_EQ(shortValue("5.5 dB"), "5.5 dB");
  EXPECT_EQ(shortValue(""), "");
  EXPECT_EQ(shortValue("1.5e3"), "1.5e3");
}

TEST(GraphScaleTest, TheCaptionTellsCountAndMean) {
  EXPECT_EQ(graphCaption(rowsOf({"-90", "-91", "-93"}), 0), "3 readings · mean -91.33");
  EXPECT_EQ(graphCaption(rowsOf({"7"}), 0), "1 reading · mean 7");
  EXPECT_EQ(graphCaption(rowsOf({"7", "8"}), 1), "2 days · mean 7.5");
  EXPECT_EQ(graphCaption(rowsOf({"x"}), 2), "1 day · mean 0");
  EXPECT_EQ(graphCaption({}, 0), "");
}

}  // namespace
}  // namespace quorl
