#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/FailedRows.h"
#include "shell/LogCategories.h"

namespace quorl::simulator {
namespace {

constexpr std::string_view kFull = R"(error occurred while inserting  ---> Optional(Prepare(message: "disk is full")))";
constexpr std::string_view kLocked = R"(error occurred while inserting  ---> Prepare(message: "database is locked"))";

/// Takes the error lines alone.
class ErrorLines final : public LogSink {
 public:
  bool isEnabled(std::string_view, LogLevel level) const override { return level == LogLevel::Error; }
  void write(std::string_view, LogLevel, std::string_view text) override { texts.emplace_back(text); }

  std::vector<std::string> texts;
};

TEST(FailedRows, TellNothingWhenAllRowsAreStored) {
  FailedRows rows;
  rows.write(log_category::kMetricService, LogLevel::Default, kFull);
  rows.write(log_category::kMetricService, LogLevel::Error, "another error");
  rows.write("elsewhere", LogLevel::Error, kFull);
  EXPECT_EQ(rows.count(), 0U);
  EXPECT_EQ(rows.report(), "");
}

TEST(FailedRows, TellHowManyAndWhyTheFirstFailed) {
  FailedRows rows;
  rows.write(log_category::kHorvaneService, LogLevel::Error, kLocked);
  EXPECT_EQ(rows.report(), "1 row could not be stored: database is locked");
  rows.write(log_category::kMetricService, LogLevel::Error, kFull);
  EXPECT_EQ(rows.count(), 2U);
  EXPECT_EQ(rows.report(), "2 rows could not be stored: database is locked");
}

TEST(FailedRows, ShowALineWithoutAMessageAsItIs) {
  FailedRows rows;
  rows.write(log_category::kMetricService, LogLevel::Error, "error occurred while inserting  ---> nil");
  EXPECT_EQ(rows.report(), "1 row could not be stored: error occurred while inserting  ---> nil");
}

TEST(FailedRows, HandOnWhatTheOutputWants) {
  const auto output = std::make_shared<ErrorLines>();
  FailedRows rows(output);
  EXPECT_TRUE(rows.isEnabled("elsewhere", LogLevel::Error));
  EXPECT_FALSE(rows.isEnabled("elsewhere", LogLevel::Default));
  rows.write("elsewhere", LogLevel::Error, "seen");
  rows.write(log_category::kMetricService, LogLevel::Error, kFull);
  EXPECT_EQ(output->texts, (std::vector<std::string>{"seen", std::string(kFull)}));
}

TEST(FailedRows, AskForNothingButTheLinesOfRowsWhenNobodyLooks) {
  const FailedRows rows;
  EXPECT_TRUE(rows.isEnabled(log_category::kMetricService, LogLevel::Error));
  EXPECT_TRUE(rows.isEnabled(log_category::kHorvaneService, LogLevel::Error));
  EXPECT_FALSE(rows.isEnabled(log_category::kMetricService, LogLevel::Default));
  EXPECT_FALSE(rows.isEnabled("elsewhere", LogLevel::Error));
}

}  // namespace
}  // namespace quorl::simulator
