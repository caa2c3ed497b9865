#include <sstream>
#include <string>

#include <gtest/gtest.h>
#include <spdlog/sinks/ostream_sink.h>

#include "base/Log.h"
#include "base/SpdlogSink.h"
#include "support/LogRecorder.h"

namespace quorl {

/// Counts how often it was rendered.
struct Costly {
  int* rendered;
};

std::string logText(const Costly& costly) {
  ++*costly.rendered;
  return "costly";
}

namespace {

using test::LogLine;
using test::LogRecorder;

constexpr Logger kLog{"weather"};

TEST(LogTest, EveryKindOfPlaceholderTakesItsArgument) {
  LogRecorder log;
  kLog.log("%{public}s|%{public}@|%{public}d|%{public}ld|%s|%@|%d|%u|%i|%ld|%tu|%x", "text", std::string("object"), -1,
           2L, std::string_view("view"), true, 3U, 4U, 5, 6, 7, 0x3CD50D);
  EXPECT_EQ(log.texts(), (std::vector<std::string>{"text|object|-1|2|view|1|3|4|5|6|7|3cd50d"}));
}

TEST(LogTest, ALineKeepsItsCategoryAndLevel) {
  LogRecorder log;
  kLog.log("rain");
  kLog.error("storm");
  plainErrorLog.error("flood");
  EXPECT_EQ(log.lines(), (std::vector<LogLine>{{"weather", LogLevel::Default, "rain"},
                                               {"weather", LogLevel::Error, "storm"},
                                               {"", LogLevel::Error, "flood"}}));
}

TEST(LogTest, APercentThatIsNoPlaceholderStays) {
  LogRecorder log;
  kLog.log("50 %% of 100 % and %{public}s", "more");
  EXPECT_EQ(log.texts(), (std::vector<std::string>{"50 %% of 100 % and more"}));
}

TEST(LogTest, AnArgumentThatLooksLikeAPlaceholderIsNotReadAsOne) {
  LogRecorder log;
  kLog.log("%{public}s then %{public}s", "%{public}s", "last");
  EXPECT_EQ(log.texts(), (std::vector<std::string>{"%{public}s then last"}));
}

TEST(LogTest, OnlyPlaceholdersAreCounted) {
  EXPECT_EQ(log_detail::countPlaceholders("none"), 0U);
  EXPECT_EQ(log_detail::countPlaceholders("%{public}s and %{public}@ and %{public}ld"), 3U);
  EXPECT_EQ(log_detail::countPlaceholders("100 %"), 0U);
  EXPECT_EQ(log_detail::countPlaceholders("%%d"), 0U);
  EXPECT_EQ(log_detail::countPlaceholders("%{public"), 0U);
  EXPECT_EQ(log_detail::countPlaceholders("Unknown tag: %x:%u"), 2U);
}

TEST(LogTest, NothingIsRenderedWhenNobodyListens) {
  const auto previous = installLogSink(nullptr);
  int rendered = 0;
  kLog.log("%{public}@", Costly{&rendered});
  kLog.error("%{public}@", Costly{&rendered});
  EXPECT_FALSE(kLog.isEnabled(LogLevel::Error));
  installLogSink(previous);
  EXPECT_EQ(rendered, 0);
}

TEST(LogTest, NothingIsRenderedForALevelThatIsSilenced) {
  std::ostringstream out;
  const auto previous = installLogSink(
      std::make_shared<SpdlogSink>("test", std::make_shared<spdlog::sinks::ostream_sink_mt>(out), LogLevel::Error));
  int rendered = 0;
  kLog.log("%{public}@", Costly{&rendered});
  EXPECT_EQ(rendered, 0);
  EXPECT_FALSE(kLog.isEnabled(LogLevel::Default));
  kLog.error("%{public}@", Costly{&rendered});
  EXPECT_EQ(rendered, 1);
  EXPECT_TRUE(kLog.isEnabled(LogLevel::Error));
  installLogSink(previous);
}

TEST(LogTest, ARecorderGivesTheLogBackWhenItGoesAway) {
  LogRecorder outer;
  {
    LogRecorder inner;
    kLog.log("inside");
    EXPECT_TRUE(inner.has("inside"));
  }
  kLog.log("outside");
  EXPECT_EQ(outer.texts(), (std::vector<std::string>{"outside"}));
}

TEST(SpdlogSinkTest, EachCategoryIsALoggerNamedAfterTheSubsystem) {
  std::ostringstream out;
  const auto output = std::make_shared<spdlog::sinks::ostream_sink_mt>(out);
  output->set_pattern("%n [%l] %v");
  SpdlogSink sink("com.example.app", output);
  sink.write("general", LogLevel::Default, "up");
  sink.write("general", LogLevel::Error, "down {} %d");
  sink.write("", LogLevel::Error, "plain");
  EXPECT_EQ(out.str(),
            "com.example.app:general [info] up\n"
            "com.example.app:general [error] down {} %d\n"
            "com.example.app [error] plain\n");
}

TEST(SpdlogSinkTest, TheMinimumDecidesWhatIsEnabled) {
  const auto output = std::make_shared<spdlog::sinks::ostream_sink_mt>(std::cout);
  const SpdlogSink all("test", output);
  EXPECT_TRUE(all.isEnabled("general", LogLevel::Default));
  EXPECT_TRUE(all.isEnabled("general", LogLevel::Error));
  const SpdlogSink errors("test", output, LogLevel::Error);
  EXPECT_FALSE(errors.isEnabled("general", LogLevel::Default));
  EXPECT_TRUE(errors.isEnabled("general", LogLevel::Error));
}

}  // namespace
}  // namespace quorl
