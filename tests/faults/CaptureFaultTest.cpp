#include <chrono>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <system_error>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "capture/SondrelViewController.h"
#include "faults/BreakablePhone.h"
#include "support/FileSizeLimit.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using ::testing::HasSubstr;
using ::testing::SizeIs;

/// The capture screen over a folder that cannot be written at times, while metrics go on arriving.
class CaptureFault : public testing::Test {
 protected:
  CaptureFault() {
    phone.launch();
    screen->viewDidLoad();
  }

  void captures(std::chrono::milliseconds duration) {
    screen->didTapStart();
    phone.passes(300ms + duration);
  }
  std::size_t files() const {
    std::error_code missing;
    return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder, missing), fs::directory_iterator()));
  }
  const std::vector<Alert>& alerts() const { return phone.host.alerts.shown; }

  BreakablePhone phone;
  const fs::path folder = phone.host.directory.path() / "Sondrel";
  const std::shared_ptr<SondrelViewController> screen = SondrelViewController::make();
};

TEST_F(CaptureFault, AChunkThatTheSystemRefusesIsToldAndEarlierFilesStay) {
  captures(4s);
  ASSERT_EQ(files(), 8U);
  {
    const FileSizeLimit limit(16 * 1024);
    phone.passes(10s);
  }
  ASSERT_THAT(alerts(), SizeIs(1));
  EXPECT_EQ(alerts()[0].title,
            "A log file cannot be written: File too large. Earlier files are kept. Make room, then start again.");
  EXPECT_EQ(alerts()[0].message, "Error Occured");
  EXPECT_EQ(files(), 8U) << "no part of the one that failed either";
  EXPECT_EQ(screen->numberOfRows(), 8U);

  captures(2s);
  EXPECT_THAT(alerts(), SizeIs(1));
  EXPECT_EQ(files(), 12U) << "with room again, it goes on behind them";
}

TEST_F(CaptureFault, AFileInThePlaceOfTheFolderIsToldAtEachStartAndLeftAlone) {
  std::ofstream(folder) << "somebody's notes";
  captures(5s);
  captures(5s);
  ASSERT_THAT(alerts(), SizeIs(2));
  EXPECT_THAT(alerts()[0].title, HasSubstr("The log folder cannot be written"));
  EXPECT_EQ(contentOf(folder), "somebody's notes");
  EXPECT_EQ(screen->numberOfRows(), 0U);
}

TEST_F(CaptureFault, AFolderThatGoesMeanwhileEndsTheCaptureAndTheMetricsGoOn) {
  captures(2s);
  fs::remove_all(folder);
  phone.metricsArrive(10);
  ASSERT_THAT(alerts(), SizeIs(1));
  EXPECT_THAT(alerts()[0].title, HasSubstr("No such file or directory"));
  phone.metricsArrive(10);
  EXPECT_EQ(phone.storedRows(), 20 * kRowsOfNasEvent);
  captures(2s);
  EXPECT_EQ(files(), 4U) << "the next start makes the folder anew";
}

}  // namespace
}  // namespace quorl::test
