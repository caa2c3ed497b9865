#include <string>

#include <gtest/gtest.h>

#include "base/DateText.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;
using test::ScopedLocale;
using test::ScopedTimeZone;

Date utc(int year, unsigned month, unsigned day, int hour = 0, int minute = 0, int second = 0) {
  const std::chrono::sys_days days{std::chrono::year{year} / std::chrono::month{month} / std::chrono::day{day}};
  return Date(days.time_since_epoch()) + std::chrono::hours(hour) + std::chrono::minutes(minute) +
         std::chrono::seconds(second);
}

struct ZoneCase {
  const char* zone;
  const char* text;
  Date date;
};

void PrintTo(const ZoneCase& zoneCase, std::ostream* out) {
  *out << zoneCase.zone << ' ' << zoneCase.text;
}

class WallClockTest : public ::testing::TestWithParam<ZoneCase> {};

TEST_P(WallClockTest, TextAndDateGiveEachOther) {
  const ScopedTimeZone zone(GetParam().zone);
  EXPECT_EQ(wallClockText(GetParam().date), GetParam().text);
  EXPECT_EQ(parseWallClock(GetParam().text), GetParam().date);
}

INSTANTIATE_TEST_SUITE_P(
    Zones, WallClockTest,
    ::testing::Values(ZoneCase{"UTC", "2026-01-05 09:30:12", utc(2026, 1, 5, 9, 30, 12)},
                      ZoneCase{"Asia/Tokyo", "2026-01-05 18:30:12", utc(2026, 1, 5, 9, 30, 12)},
                      ZoneCase{"Asia/Kathmandu", "2026-01-05 15:15:12", utc(2026, 1, 5, 9, 30, 12)},
                      ZoneCase{"America/New_York", "2026-01-05 04:30:12", utc(2026, 1, 5, 9, 30, 12)},
                      ZoneCase{"Pacific/Kiritimati", "2026-01-01 13:59:59", utc(2025, 12, 31, 23, 59, 59)},
                      ZoneCase{"UTC", "1969-12-31 23:59:59", utc(1969, 12, 31, 23, 59, 59)},
                      ZoneCase{"UTC", "2024-02-29 00:00:00", utc(2024, 2, 29)},
                      // The last second before and the first after the clock goes forward.
                      ZoneCase{"America/New_York", "2026-03-08 01:59:59", utc(2026, 3, 8, 6, 59, 59)},
                      ZoneCase{"America/New_York", "2026-03-08 03:00:00", utc(2026, 3, 8, 7)},
                      ZoneCase{"Europe/Berlin", "2026-03-29 01:59:59", utc(2026, 3, 29, 0, 59, 59)},
                      ZoneCase{"Europe/Berlin", "2026-03-29 03:00:00", utc(2026, 3, 29, 1)},
                      // Around the hour that occurs twice when it goes back.
                      ZoneCase{"America/New_York", "2026-11-01 00:59:59", utc(2026, 11, 1, 4, 59, 59)},
                      ZoneCase{"America/New_York", "2026-11-01 02:00:00", utc(2026, 11, 1, 7)},
                      // South of the equator, and a change of half an hour.
                      ZoneCase{"Australia/Sydney", "2026-10-04 03:00:00", utc(2026, 10, 3, 16)},
                      ZoneCase{"Australia/Lord_Howe", "2026-10-04 02:30:00", utc(2026, 10, 3, 15, 30)}));

TEST(DateTextTest, AFractionOfASecondIsCutOffTowardThePast) {
  const ScopedTimeZone zone("UTC");
  EXPECT_EQ(wallClockText(utc(2026, 1, 5, 9, 30, 12) + 999999us), "2026-01-05 09:30:12");
  EXPECT_EQ(wallClockText(Date(-1us)), "1969-12-31 23:59:59");
  EXPECT_EQ(utcText(Date(-1us)), "1969-12-31 23:59:59 +0000");
}

TEST(DateTextTest, ATimeThatTheChangeSkipsReadsAsIfItHadNotTakenPlaceYet) {
  const ScopedTimeZone newYork("America/New_York");
  EXPECT_EQ(parseWallClock("2026-03-08 02:30:00"), utc(2026, 3, 8, 7, 30));
  const ScopedTimeZone sydney("Australia/Sydney");
  EXPECT_EQ(parseWallClock("2026-10-04 02:30:00"), utc(2026, 10, 3, 16, 30));
}

TEST(DateTextTest, OfATimeThatOccursTwiceTheFirstIsMeant) {
  const ScopedTimeZone newYork("America/New_York");
  EXPECT_EQ(wallClockText(utc(2026, 11, 1, 5, 30)), "2026-11-01 01:30:00");
  EXPECT_EQ(wallClockText(utc(2026, 11, 1, 6, 30)), "2026-11-01 01:30:00");
  EXPECT_EQ(parseWallClock("2026-11-01 01:30:00"), utc(2026, 11, 1, 5, 30));
  const ScopedTimeZone sydney("Australia/Sydney");
  EXPECT_EQ(parseWallClock("2026-04-05 02:30:00"), utc(2026, 4, 4, 15, 30));
}

TEST(DateTextTest, ADayStartsAtItsLocalMidnight) {
  const ScopedTimeZone tokyo("Asia/Tokyo");
  EXPECT_EQ(parseWallClockDay("2026-01-05"), utc(2026, 1, 4, 15));
  const ScopedTimeZone newYork("America/New_York");
  EXPECT_EQ(parseWallClockDay("2026-03-08"), utc(2026, 3, 8, 5));
  EXPECT_EQ(parseWallClockDay("2026-03-09"), utc(2026, 3, 9, 4));
}

TEST(DateTextTest, OneReaderReadsManyTextsOverAChange) {
  const ScopedTimeZone zone("Europe/Berlin");
  WallClockReader reader;
  for (int hour = 0; hour < 24 * 10; ++hour) {
    // The fold is left out: its second run reads as its first.
    const Date date = utc(2026, 10, 20) + std::chrono::hours(hour);
    if (date == utc(2026, 10, 25, 1)) continue;
    EXPECT_EQ(reader.read(wallClockText(date)), date) << wallClockText(date);
  }
  // Days out of order.
  EXPECT_EQ(reader.read("2026-10-24 12:00:00"), utc(2026, 10, 24, 10));
  EXPECT_EQ(reader.read("2026-10-27 12:00:00"), utc(2026, 10, 27, 11));
  EXPECT_EQ(reader.read("2026-10-24 12:00:00"), utc(2026, 10, 24, 10));
  EXPECT_EQ(reader.readDay("2026-10-26"), utc(2026, 10, 25, 23));
}

TEST(DateTextTest, AnythingButAWallClockTextAnswersNothing) {
  const ScopedTimeZone zone("UTC");
  for (const char* text :
       {"", "2026-01-05", "2026-01-05 09:30", "2026-01-05T09:30:12", "2026-01-05 09:30:12 ", " 2026-01-05 09:30:12",
        "2026/01/05 09:30:12", "2026-01-05 09.30.12", "2026-1-05 09:30:123", "abcd-01-05 09:30:12",
        "2026-01-05 9a:30:12", "2026-01-05 -9:30:12", "2026-01-05 09:30:1+", "1700000000"})
    EXPECT_EQ(parseWallClock(text), std::nullopt) << text;
  for (const char* text : {"", "2026-01", "2026-01-05 ", "2026-01-05 09:30:12", "2026.01.05"})
    EXPECT_EQ(parseWallClockDay(text), std::nullopt) << text;
}

TEST(DateTextTest, AnImpossibleDateAnswersNothing) {
  const ScopedTimeZone zone("UTC");
  for (const char* text : {"2026-00-05 09:30:12", "2026-13-05 09:30:12", "2026-01-00 09:30:12", "2026-01-32 09:30:12",
                           "2026-02-29 09:30:12", "2100-02-29 09:30:12", "2026-04-31 09:30:12", "2026-01-05 24:00:00",
                           "2026-01-05 09:60:12", "2026-01-05 09:30:60"})
    EXPECT_EQ(parseWallClock(text), std::nullopt) << text;
  EXPECT_EQ(parseWallClockDay("2026-02-30"), std::nullopt);
  EXPECT_TRUE(parseWallClock("2000-02-29 23:59:59"));
}

TEST(DateTextTest, AReaderReadsTheSameTextTwiceAndIsNotMisledByOneThatFails) {
  const ScopedTimeZone zone("UTC");
  WallClockReader reader;
  EXPECT_EQ(reader.read(std::string(19, '\0')), std::nullopt);
  for (int i = 0; i < 2; ++i) EXPECT_EQ(reader.read("2026-01-05 09:30:12"), utc(2026, 1, 5, 9, 30, 12));
  EXPECT_EQ(reader.read("2026-01-05 09:30:60"), std::nullopt);
  EXPECT_EQ(reader.read("2026-01-05 09:30:60"), std::nullopt);
  EXPECT_EQ(reader.read("2026-01-05 09:30:12"), utc(2026, 1, 5, 9, 30, 12));
  EXPECT_EQ(reader.readDay("2026-01-06"), utc(2026, 1, 6, 0, 0, 0));
  EXPECT_EQ(reader.read("2026-01-05 09:30:12"), utc(2026, 1, 5, 9, 30, 12));
}

TEST(DateTextTest, UtcTextIsTheSameInEveryZone) {
  for (const char* name : {"UTC", "Asia/Tokyo", "America/New_York"}) {
    const ScopedTimeZone zone(name);
    EXPECT_EQ(utcText(utc(2026, 1, 5, 9, 30, 12)), "2026-01-05 09:30:12 +0000");
  }
}

TEST(DateTextTest, PatternsFollowZoneAndLocale) {
  const Date date = utc(2026, 1, 5, 9, 30, 12);
  {
    const ScopedTimeZone zone("America/New_York");
    const ScopedLocale locale("en_US");
    EXPECT_EQ(patternText(date, "EE, HH:mm:ss zz"), "Mon, 04:30:12 EST");
    EXPECT_EQ(patternText(date, "EE, MM-dd HH:mm:ss zz"), "Mon, 01-05 04:30:12 EST");
  }
  {
    const ScopedTimeZone zone("Europe/Berlin");
    const ScopedLocale locale("de_DE");
    EXPECT_EQ(patternText(date, "EE, HH:mm:ss zz"), "Mo., 10:30:12 MEZ");
    EXPECT_EQ(patternText(date + std::chrono::hours(24 * 180), "EE, HH:mm:ss zz"), "Sa., 11:30:12 MESZ");
  }
}

TEST(DateTextTest, StylesFollowZoneAndLocale) {
  using Style = DateTextStyle;
  const Date date = utc(2026, 1, 5, 9, 30, 12);
  {
    const ScopedTimeZone zone("America/New_York");
    const ScopedLocale locale("en_US");
    EXPECT_EQ(styledText(date, Style::Short, Style::None), "1/5/26");
    EXPECT_EQ(styledText(date, Style::Medium, Style::None), "Jan 5, 2026");
    EXPECT_EQ(styledText(date, Style::Long, Style::None), "January 5, 2026");
    EXPECT_EQ(styledText(date, Style::Full, Style::None), "Monday, January 5, 2026");
    EXPECT_EQ(styledText(date, Style::None, Style::None), "");
  }
  {
    const ScopedTimeZone zone("Europe/Berlin");
    const ScopedLocale locale("de_DE");
    EXPECT_EQ(styledText(date, Style::None, Style::Short), "10:30");
    EXPECT_EQ(styledText(date, Style::Medium, Style::Medium), "05.01.2026, 10:30:12");
  }
}

}  // namespace
}  // namespace quorl
