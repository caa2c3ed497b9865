#include <QCoreApplication>
#include <chrono>
#include <csignal>

#include <gtest/gtest.h>

#include "hosts/desktop/QuitOnSignal.h"

namespace quorl::desktop {
namespace {

TEST(QuitOnSignal, IsAskedBySignalsToEnd) {
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
    const QuitOnSignal quitting;
    EXPECT_FALSE(quitting.isAsked());
    std::raise(signal);
    EXPECT_TRUE(quitting.isAsked()) << signal;
    EXPECT_TRUE(quitting.isAsked(std::chrono::hours(1))) << "and does not wait for another";
  }
}

TEST(QuitOnSignal, ASignalToBeIgnoredStaysIgnored) {
  const auto before = std::signal(SIGHUP, SIG_IGN);
  {
    const QuitOnSignal quitting;
    std::raise(SIGHUP);
    EXPECT_FALSE(quitting.isAsked());
    std::raise(SIGTERM);
    EXPECT_TRUE(quitting.isAsked());
  }
  EXPECT_EQ(std::signal(SIGHUP, before), SIG_IGN);
  EXPECT_EQ(std::signal(SIGTERM, SIG_DFL), SIG_DFL) << "the others are as they were";
}

TEST(QuitOnSignal, EndsOnceThoughTheSignalCameBefore) {
  QuitOnSignal quitting;
  std::raise(SIGTERM);
  int ends = 0;
  quitting.whenAsked([&ends] { ++ends; });
  EXPECT_EQ(ends, 0) << "not within the call";
  while (ends == 0) QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
  std::raise(SIGINT);
  QCoreApplication::processEvents();
  EXPECT_EQ(ends, 1);
}

}  // namespace
}  // namespace quorl::desktop
