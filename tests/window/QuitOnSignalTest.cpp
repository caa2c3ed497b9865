#include <QCoreApplication>
#include <array>
#include <chrono>
#include <csignal>
#include <cstddef>

#include <gtest/gtest.h>

#include "hosts/desktop/QuitOnSignal.h"

namespace quorl::desktop {
namespace {

constexpr std::array kSignals{SIGINT, SIGTERM, SIGHUP};

/// Whoever started the tests may want these ignored.
class QuitOnSignalTest : public testing::Test {
 protected:
  void SetUp() override {
    for (std::size_t i = 0; i < kSignals.size(); ++i) before_.at(i) = std::signal(kSignals.at(i), SIG_DFL);
  }
  void TearDown() override {
    for (std::size_t i = 0; i < kSignals.size(); ++i) std::signal(kSignals.at(i), before_.at(i));
  }

 private:
  std::array<void (*)(int), kSignals.size()> before_{};
};

TEST_F(QuitOnSignalTest, IsAskedBySignalsToEnd) {
  for (const int signal : kSignals) {
    const QuitOnSignal quitting;
    EXPECT_FALSE(quitting.isAsked());
    std::raise(signal);
    ASSERT_TRUE(quitting.isAsked()) << signal;
    EXPECT_TRUE(quitting.isAsked(std::chrono::minutes(1))) << "and does not wait for another";
  }
}

TEST_F(QuitOnSignalTest, ASignalToBeIgnoredStaysIgnored) {
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

TEST_F(QuitOnSignalTest, EndsOnceThoughTheSignalCameBefore) {
  QuitOnSignal quitting;
  std::raise(SIGTERM);
  int ends = 0;
  quitting.whenAsked([&ends] { ++ends; });
  EXPECT_EQ(ends, 0) << "not within the call";
  while (ends == 0) QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
  QCoreApplication::processEvents();
  EXPECT_EQ(ends, 1);
}

TEST_F(QuitOnSignalTest, ASecondSignalOfAnyKindEndsTheProcess) {
  const QuitOnSignal quitting;
  std::raise(SIGINT);
  for (const int signal : kSignals) EXPECT_EQ(std::signal(signal, SIG_DFL), SIG_DFL) << signal;
}

}  // namespace
}  // namespace quorl::desktop
