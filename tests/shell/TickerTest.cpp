#include <cmath>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "shell/TickerViewController.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Size = TickerColumnCell::Size;

class TickerTest : public ::testing::Test {
 protected:
  TickerTest()
      : reload(ticker.onReload([this] { ++reloads; })),
        scroll(ticker.onScroll([this](std::size_t index) { moved.push_back(index); })) {}

  void shows(double value) {
    moved.clear();
    ticker.setNumberValue(value);
  }
  std::vector<double> widths() const {
    std::vector<double> result;
    for (std::size_t index = 0; index < ticker.collectionView().size(); ++index)
      result.push_back(ticker.widthAt(index));
    return result;
  }
  std::vector<Size> sizes() const {
    std::vector<Size> result;
    for (const TickerColumnCell& column : ticker.collectionView()) result.push_back(column.size());
    return result;
  }
  /// What the columns show, whatever the value is.
  std::string shown() const {
    std::string result;
    for (const TickerColumnCell& column : ticker.collectionView()) result += column.characters().at(column.row());
    return result;
  }

  TickerViewController ticker;
  int reloads = 0;
  std::vector<std::size_t> moved;
  Connection reload;
  Connection scroll;
};

TEST_F(TickerTest, ShowsNothingBeforeItsFirstValue) {
  EXPECT_EQ(ticker.stringValue(), "");
  EXPECT_THAT(ticker.collectionView(), IsEmpty());
}

TEST_F(TickerTest, ZeroHasFourColumnsWithTheirWidthsByPosition) {
  shows(0);
  EXPECT_EQ(ticker.stringValue(), "0.00");
  EXPECT_THAT(widths(), ElementsAre(20, 8, 20, 20));
  EXPECT_THAT(sizes(), ElementsAre(Size::large, Size::mini, Size::small, Size::small));
  EXPECT_EQ(shown(), "0.00");
}

TEST_F(TickerTest, ALongerNumberHasWideColumnsBetweenTheFirstAndThePoint) {
  shows(-1234.5);
  EXPECT_EQ(ticker.stringValue(), "-1234.50");
  EXPECT_THAT(widths(), ElementsAre(20, 32, 32, 32, 32, 8, 20, 20));
  EXPECT_THAT(sizes(), ElementsAre(Size::small, Size::large, Size::large, Size::large, Size::large, Size::mini,
                                   Size::small, Size::small));
  EXPECT_EQ(shown(), "-1234.50");
}

TEST_F(TickerTest, ValuesAreRoundedToTwoDecimals) {
  shows(2.0 / 3);
  EXPECT_EQ(ticker.stringValue(), "0.67");
  shows(99.999);
  EXPECT_EQ(ticker.stringValue(), "100.00");
  EXPECT_EQ(ticker.numberValue(), 99.999);
}

TEST_F(TickerTest, ADigitColumnHoldsTheTenDigitsAndAnyOtherItsOneCharacter) {
  shows(-7);
  const auto& columns = ticker.collectionView();
  EXPECT_THAT(columns[0].characters(), ElementsAre("-"));
  EXPECT_THAT(columns[1].characters(), ElementsAre("0", "1", "2", "3", "4", "5", "6", "7", "8", "9"));
  EXPECT_THAT(columns[2].characters(), ElementsAre("."));
}

TEST_F(TickerTest, DigitsOfSmallColumnsAreSmaller) {
  shows(1);
  EXPECT_EQ(ticker.collectionView()[0].cellAt(7), (TickerCell{"7", 40}));
  EXPECT_EQ(ticker.collectionView()[1].cellAt(0), (TickerCell{".", 40}));
  EXPECT_EQ(ticker.collectionView()[3].cellAt(7), (TickerCell{"7", 35}));
  EXPECT_EQ(TickerCell().fontSize, 40);
}

TEST_F(TickerTest, ColumnsOfTheSameKindsScrollAndStay) {
  shows(12.34);
  EXPECT_EQ(reloads, 1);
  shows(98.76);
  EXPECT_EQ(reloads, 1);
  EXPECT_THAT(moved, ElementsAre(0, 1, 2, 3, 4));
  EXPECT_EQ(shown(), "98.76");
  shows(198.76);
  EXPECT_EQ(reloads, 2);
  EXPECT_EQ(shown(), "198.76");
}

TEST_F(TickerTest, AColumnUnderWayIsLeftAloneAndTheNextValueCatchesUp) {
  shows(1.23);
  ticker.collectionView()[0].setScrolling(true);
  shows(4.56);
  EXPECT_THAT(moved, ElementsAre(1, 2, 3));
  EXPECT_EQ(shown(), "1.56");
  ticker.collectionView()[0].setScrolling(false);
  shows(4.57);
  EXPECT_EQ(shown(), "4.57");
}

TEST_F(TickerTest, ACharacterThatItsColumnLacksEndsThePass) {
  shows(1.23);
  ticker.collectionView()[1] = TickerColumnCell({"x"}, Size::mini);
  moved.clear();
  ticker.scrollToValue();
  EXPECT_THAT(moved, ElementsAre(0));
}

TEST_F(TickerTest, ACharacterWithoutAColumnIsPassedOver) {
  shows(12.34);
  ticker.collectionView().pop_back();
  moved.clear();
  ticker.scrollToValue();
  EXPECT_THAT(moved, ElementsAre(0, 1, 2, 3));
}

TEST_F(TickerTest, AValueThatIsNoNumberHasNoPoint) {
  shows(std::nan(""));
  EXPECT_EQ(ticker.stringValue(), "nan");
  EXPECT_THAT(widths(), ElementsAre(20, 20, 20));
  EXPECT_THAT(sizes(), ElementsAre(Size::small, Size::small, Size::small));
}

}  // namespace
}  // namespace quorl
