#include <chrono>
#include <cstdint>
#include <ostream>

#include <gtest/gtest.h>

#include "screens/history/GraphView.h"
#include "screens/metriclist/AllMetricsViewController.h"
#include "shell/TimeTexts.h"
#include "support/TimeZoneAndLocale.h"

// What a person reads of a time: several zones, both kinds of daylight-saving change, two languages.

namespace quorl {
namespace {

Date at(std::int64_t seconds) {
  return Date(std::chrono::seconds(seconds));
}

constexpr std::int64_t kMondayMorning = 1767605412;  // 2026-01-05 09:30:12 UTC

struct Place {
  const char* zone;
  const char* locale;
  std::int64_t seconds;
  const char* time;
  const char* date;
  const char* bar;
  const char* day;
};

void PrintTo(const Place& place, std::ostream* out) {
  *out << place.zone << " " << place.locale << " " << place.seconds;
}

class TimeTextsTest : public ::testing::TestWithParam<Place> {};

TEST_P(TimeTextsTest, ReadAsTheDevicesZoneAndLocaleWantIt) {
  const Place& place = GetParam();
  const test::ScopedTimeZone zone(place.zone);
  const test::ScopedLocale locale(place.locale);
  EXPECT_EQ(timeText(at(place.seconds)), place.time);
  EXPECT_EQ(dateText(at(place.seconds)), place.date);
  EXPECT_EQ(barLabel(at(place.seconds), 0), place.bar);
  EXPECT_EQ(barLabel(at(place.seconds), 1), place.day);
  EXPECT_EQ(barLabel(at(place.seconds), 2), place.day);
  AllMetricsRowItem row;
  row.timeStamp = at(place.seconds);
  EXPECT_EQ(AllMetricsViewController::timeText(row), place.date);
}

INSTANTIATE_TEST_SUITE_P(Zones, TimeTextsTest,
                         ::testing::Values(Place{"UTC", "en_US", kMondayMorning, "Mon, 09:30:12 UTC",
                                                 "Mon, 01-05 09:30:12 UTC", "09:30 UTC", "Mon, 01/05"},
                                           Place{"Asia/Tokyo", "en_US", kMondayMorning, "Mon, 18:30:12 GMT+9",
                                                 "Mon, 01-05 18:30:12 GMT+9", "18:30 GMT+9", "Mon, 01/05"},
                                           // Another day than in UTC, on both sides.
                                           Place{"America/Los_Angeles", "en_US", 1767571200, "Sun, 16:00:00 PST",
                                                 "Sun, 01-04 16:00:00 PST", "16:00 PST", "Sun, 01/04"},
                                           Place{"Pacific/Auckland", "en_US", 1767605412, "Mon, 22:30:12 GMT+13",
                                                 "Mon, 01-05 22:30:12 GMT+13", "22:30 GMT+13", "Mon, 01/05"},
                                           Place{"Asia/Kathmandu", "en_US", kMondayMorning, "Mon, 15:15:12 GMT+5:45",
                                                 "Mon, 01-05 15:15:12 GMT+5:45", "15:15 GMT+5:45", "Mon, 01/05"}));

INSTANTIATE_TEST_SUITE_P(ClocksGoForward, TimeTextsTest,
                         ::testing::Values(
                             // New York, 2026-03-08: 01:59:59 is followed by 03:00:00.
                             Place{"America/New_York", "en_US", 1772953199, "Sun, 01:59:59 EST",
                                   "Sun, 03-08 01:59:59 EST", "01:59 EST", "Sun, 03/08"},
                             Place{"America/New_York", "en_US", 1772953200, "Sun, 03:00:00 EDT",
                                   "Sun, 03-08 03:00:00 EDT", "03:00 EDT", "Sun, 03/08"}));

INSTANTIATE_TEST_SUITE_P(ClocksGoBack, TimeTextsTest,
                         ::testing::Values(
                             // New York, 2026-11-01: 01:30 comes twice.
                             Place{"America/New_York", "en_US", 1793511000, "Sun, 01:30:00 EDT",
                                   "Sun, 11-01 01:30:00 EDT", "01:30 EDT", "Sun, 11/01"},
                             Place{"America/New_York", "en_US", 1793514600, "Sun, 01:30:00 EST",
                                   "Sun, 11-01 01:30:00 EST", "01:30 EST", "Sun, 11/01"}));

INSTANTIATE_TEST_SUITE_P(German, TimeTextsTest,
                         ::testing::Values(Place{"Europe/Berlin", "de_DE", kMondayMorning, "Mo., 10:30:12 MEZ",
                                                 "Mo., 01-05 10:30:12 MEZ", "10:30 MEZ", "Mo., 01/05"},
                                           // 2026-03-29: 01:59:59 is followed by 03:00:00.
                                           Place{"Europe/Berlin", "de_DE", 1774745999, "So., 01:59:59 MEZ",
                                                 "So., 03-29 01:59:59 MEZ", "01:59 MEZ", "So., 03/29"},
                                           Place{"Europe/Berlin", "de_DE", 1774746000, "So., 03:00:00 MESZ",
                                                 "So., 03-29 03:00:00 MESZ", "03:00 MESZ", "So., 03/29"},
                                           // 2026-10-25: 02:30 comes twice.
                                           Place{"Europe/Berlin", "de_DE", 1792888200, "So., 02:30:00 MESZ",
                                                 "So., 10-25 02:30:00 MESZ", "02:30 MESZ", "So., 10/25"},
                                           Place{"Europe/Berlin", "de_DE", 1792891800, "So., 02:30:00 MEZ",
                                                 "So., 10-25 02:30:00 MEZ", "02:30 MEZ", "So., 10/25"}));

}  // namespace
}  // namespace quorl
