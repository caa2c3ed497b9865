#include <gtest/gtest.h>

#include "shell/AnalyticsManager.h"
#include "shell/LogCategories.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"

namespace quorl {
namespace {

TEST(AnalyticsTest, EachInteractionHasARawValueAndAnEventName) {
  EXPECT_EQ(rawValue(AnalyticsInteractionTypes::AppLaunch), "AppLaunch");
  EXPECT_EQ(eventName(AnalyticsInteractionTypes::AppLaunch), "com.ardent.quorlMenu.appLaunch");
  EXPECT_EQ(rawValue(AnalyticsInteractionTypes::unknown), "unknown");
  EXPECT_EQ(eventName(AnalyticsInteractionTypes::unknown), "com.ardent.quorlMenu.unknown");
}

TEST(AnalyticsTest, OnlyTheRawValuesGiveACase) {
  EXPECT_EQ(analyticsInteractionType("AppLaunch"), AnalyticsInteractionTypes::AppLaunch);
  EXPECT_EQ(analyticsInteractionType("unknown"), AnalyticsInteractionTypes::unknown);
  EXPECT_EQ(analyticsInteractionType("appLaunch"), std::nullopt);
  EXPECT_EQ(analyticsInteractionType("com.ardent.quorlMenu.appLaunch"), std::nullopt);
  EXPECT_EQ(analyticsInteractionType(""), std::nullopt);
}

TEST(AnalyticsTest, TheSinkGetsTheEventNameAndThePayload) {
  test::FakeAnalytics sink;
  AnalyticsManager manager(sink);
  manager.sendAnalytics(AnalyticsInteractionTypes::AppLaunch, {});
  manager.sendAnalytics(AnalyticsInteractionTypes::unknown, {{"tab", "Dashboard"}});
  ASSERT_EQ(sink.sent.size(), 2U);
  EXPECT_EQ(sink.sent[0].first, "com.ardent.quorlMenu.appLaunch");
  EXPECT_TRUE(sink.sent[0].second.empty());
  EXPECT_EQ(sink.sent[1].first, "com.ardent.quorlMenu.unknown");
  EXPECT_EQ(sink.sent[1].second, (AnalyticsSink::Payload{{"tab", "Dashboard"}}));
}

TEST(NamesTest, LogCategories) {
  EXPECT_STREQ(log_category::kAppUi, "app-ui");
  EXPECT_STREQ(log_category::kMetricRelated, "metric-related");
  EXPECT_STREQ(log_category::kSondrel, "sondrel");
  EXPECT_STREQ(log_category::kGeneral, "general");
  EXPECT_STREQ(log_category::kDashboard, "dashboard");
  EXPECT_STREQ(log_category::kAllMetrics, "allmetrics");
  EXPECT_STREQ(log_category::kMetricService, "metric-service");
  EXPECT_STREQ(log_category::kDatabase, "database");
  EXPECT_STREQ(log_category::kFormatting, "formatting");
  EXPECT_STREQ(log_category::kMetricDetail, "metricDetail");
  EXPECT_STREQ(log_category::kHorvaneService, "horvane-service");
  EXPECT_STREQ(log_category::kFallbackSubsystem, "QuorlInternal-4");
}

TEST(NamesTest, Notifications) {
  EXPECT_STREQ(notification::kNewZelkorMetric, "NewZelkorMetric");
  EXPECT_STREQ(notification::kNewHVMetric, "NewHVMetric");
  EXPECT_STREQ(notification::kCarrierUpdate, "carrierUpdate");
  EXPECT_STREQ(notification::kSubsIdSelectionChange, "subsIdSelectionChange");
  EXPECT_STREQ(notification::kRemovedDashboardMetric, "removedDashboardMetric");
  EXPECT_STREQ(notification::kMetricObjectKey, "metricObject");
  EXPECT_STREQ(notification::kCarriersKey, "carriers");
}

}  // namespace
}  // namespace quorl
