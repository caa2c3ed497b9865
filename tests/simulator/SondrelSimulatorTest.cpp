#include <algorithm>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <memory>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "capture/SondrelViewController.h"
#include "hosts/simulator/SimulatedPhone.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "support/FakePlatform.h"
#include "support/SteppedQueue.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;

/// Writes down what the library calls back.
class RecordingDelegate final : public SondrelDelegate {
 public:
  void didStateChanged(std::int64_t state, const std::optional<SondrelError>& error,
                       const std::optional<SondrelConfiguration>& config) override {
    onCall();
    events.push_back("state " + std::to_string(state));
    if (error) errors.push_back(error->text);
    if (config) confirmed = config;
  }
  void didCollectLogs(const std::optional<std::vector<SondrelObject>>& logs,
                      const std::optional<SondrelError>& error) override {
    onCall();
    events.push_back(logs ? "files " + std::to_string(logs->size()) : "no files");
    if (error) errors.push_back(error->text);
    for (const SondrelObject& object : logs.value_or(std::vector<SondrelObject>()))
      files.push_back(std::get<SondrelFileInformation>(object));
  }
  void configurationListAvailable(const std::optional<std::vector<SondrelObject>>& list) override {
    onCall();
    for (const SondrelObject& object : list.value()) configurations.push_back(std::get<std::string>(object));
  }

  std::vector<std::string> fileNames() const {
    std::vector<std::string> names;
    for (const SondrelFileInformation& file : files) names.push_back(file.fileName);
    return names;
  }

  std::function<void()> onCall = [] {};
  std::vector<std::string> events;
  std::vector<std::string> errors;
  std::vector<SondrelFileInformation> files;
  std::vector<std::string> configurations;
  std::optional<SondrelConfiguration> confirmed;
};

/// A chunk each half second, four to a batch.
class SondrelSimulatorTest : public testing::Test {
 protected:
  SondrelSimulatorTest() {
    options.folder = directory.path() / "Sondrel";
    delegate->onCall = [this] { EXPECT_TRUE(main->isCurrent()); };
  }

  void launch() {
    simulator.emplace(options, *main, time, time);
    library = simulator->makeSondrel();
    library->setDelegate(delegate);
  }
  void starts(const std::string& name = "Default", double chunkKb = 32, double maximumFiles = 256) {
    SondrelConfiguration configuration;
    configuration.setActiveConfig(name);
    configuration.setChunkFileSize(chunkKb);
    configuration.setMaxNumberOfLogs(maximumFiles);
    library->start(configuration);
    time.settle();
  }
  void stops() {
    library->stop();
    time.settle();
  }
  void resets() {
    library->reset();
    time.settle();
  }
  void passes(std::chrono::milliseconds duration) { time.advance(duration); }

  std::vector<std::string> onDisk() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(options.folder)) names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
  std::string contentOf(const char* name) const {
    std::ifstream file(options.folder / name);
    return {std::istreambuf_iterator<char>(file), {}};
  }

  test::VirtualTime time;
  std::shared_ptr<test::SteppedQueue> main = time.makeStepped("main");
  test::TemporaryDirectory directory;
  SondrelSimulator::Options options;
  std::shared_ptr<RecordingDelegate> delegate = std::make_shared<RecordingDelegate>();
  std::optional<SondrelSimulator> simulator;
  std::unique_ptr<Sondrel> library;
};

TEST_F(SondrelSimulatorTest, ConfirmsAStartWithItsConfiguration) {
  launch();
  starts("Voice", 64, 300);
  EXPECT_THAT(delegate->events, ElementsAre("state 1"));
  ASSERT_TRUE(delegate->confirmed);
  EXPECT_EQ(delegate->confirmed->activeConfig(), "Voice");
  EXPECT_EQ(delegate->confirmed->chunkFileSize(), 64.0);
  EXPECT_EQ(delegate->confirmed->maxNumberOfLogs(), 300.0);
}

TEST_F(SondrelSimulatorTest, WritesAChunkEachIntervalAndReportsThemInBatches) {
  launch();
  starts();
  passes(1999ms);
  EXPECT_THAT(onDisk(), SizeIs(3));
  EXPECT_THAT(delegate->events, ElementsAre("state 1"));
  passes(1ms);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 4"));
  EXPECT_THAT(delegate->fileNames(), ElementsAre("000001-Default.chunk", "000002-Default.chunk", "000003-Default.chunk",
                                                 "000004-Default.chunk"));
  EXPECT_EQ(onDisk(), delegate->fileNames());
  passes(4s);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 4", "files 4", "files 4"));
}

TEST_F(SondrelSimulatorTest, AFileIsToldOfWithItsSizeAsTextAndItsTime) {
  launch();
  const Date begin = time.now();
  starts("Default", 96);
  passes(2s);
  ASSERT_THAT(delegate->files, SizeIs(4));
  EXPECT_EQ(delegate->files[0].fileSize, "96 KB");
  EXPECT_EQ(delegate->files[0].timestamp, begin + 500ms);
  EXPECT_EQ(delegate->files[3].timestamp, begin + 2s);
}

TEST_F(SondrelSimulatorTest, AChunkHasTheChosenSizeInUnitsOf1024BytesAndTakesLittleOfTheDisk) {
  launch();
  starts("Default", 1024);
  passes(500ms);
  const fs::path path = options.folder / "000001-Default.chunk";
  struct stat status {};
  ASSERT_EQ(stat(path.c_str(), &status), 0);
  EXPECT_EQ(status.st_size, 1024 * 1024);
  EXPECT_LE(status.st_blocks * 512, 64 * 1024);
}

TEST_F(SondrelSimulatorTest, AChunkAndItsFolderAreForTheirOwnerAlone) {
  launch();
  starts();
  passes(500ms);
  EXPECT_EQ(fs::status(options.folder / "000001-Default.chunk").permissions(), fs::perms(0600));
  EXPECT_EQ(fs::status(options.folder).permissions(), fs::perms(0700));
}

TEST_F(SondrelSimulatorTest, AChunkSaysWhatItIs) {
  launch();
  starts("RF and Power");
  passes(500ms);
  const std::string content = contentOf("000001-RF-and-Power.chunk");
  EXPECT_THAT(content, testing::StartsWith("simulated baseband log\nconfiguration: RF and Power\nchunk: 1\n"
                                           "begun: 2026-01-05 09:30:12 +0000\n"));
  EXPECT_EQ(content.size(), 32U * 1024);
}

TEST_F(SondrelSimulatorTest, AChunkHoldsWhatTheBasebandDidMeanwhile) {
  options.log = std::make_shared<BasebandLog>();
  launch();
  options.log->add("before the capture");
  starts("Default", 1);
  options.log->add("first");
  options.log->add("second");
  passes(500ms);
  options.log->add(std::string(900, 'x'));
  options.log->add(std::string(200, 'y'));
  passes(500ms);
  passes(500ms);
  const auto logOf = [this](const char* name) {
    const std::string content = contentOf(name);
    EXPECT_EQ(content.size(), 1024U);
    const std::size_t begin = content.find("+0000\n") + 6;
    return content.substr(begin, content.find('\0') - begin);
  };
  EXPECT_EQ(logOf("000001-Default.chunk"), "first\nsecond\n");
  EXPECT_EQ(logOf("000002-Default.chunk"), std::string(900, 'x') + "\n") << "what has no room waits for the next";
  EXPECT_EQ(logOf("000003-Default.chunk"), std::string(200, 'y') + "\n");
  stops();
  EXPECT_FALSE(options.log->isOpen()) << "nothing is kept for nobody";
}

TEST_F(SondrelSimulatorTest, KeepsTheNewestFilesUpToTheMaximum) {
  launch();
  starts("Default", 32, 6);
  passes(5s);
  EXPECT_THAT(onDisk(), ElementsAre("000005-Default.chunk", "000006-Default.chunk", "000007-Default.chunk",
                                    "000008-Default.chunk", "000009-Default.chunk", "000010-Default.chunk"));
}

TEST_F(SondrelSimulatorTest, AStopReportsWhatWaitsForItsBatchAndThenTheState) {
  launch();
  starts();
  passes(1s);
  stops();
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 2", "state 0"));
  passes(10s);
  EXPECT_THAT(onDisk(), SizeIs(2));
}

TEST_F(SondrelSimulatorTest, AStopWithoutACaptureSaysNothing) {
  launch();
  stops();
  starts();
  stops();
  stops();
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "state 0"));
}

TEST_F(SondrelSimulatorTest, AStartWhileRunningGoesOnWithTheNewSettings) {
  launch();
  starts();
  passes(1s);
  starts("Voice", 64);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 2", "state 1"));
  passes(2s);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 2", "state 1", "files 4"));
  EXPECT_EQ(delegate->files.back().fileName, "000006-Voice.chunk");
  EXPECT_EQ(delegate->files.back().fileSize, "64 KB");
}

TEST_F(SondrelSimulatorTest, AResetRemovesTheFilesAndACaptureGoesOn) {
  launch();
  starts();
  passes(1s);
  resets();
  EXPECT_THAT(onDisk(), IsEmpty());
  passes(2s);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 4")) << "without the two that were discarded";
  EXPECT_EQ(delegate->files.front().fileName, "000003-Default.chunk");
}

TEST_F(SondrelSimulatorTest, AResetRemovesFilesOfEarlierRunsAndNothingElse) {
  launch();
  fs::create_directory(options.folder);
  std::ofstream(options.folder / "000041-Voice.chunk") << "old";
  std::ofstream(options.folder / "notes.txt") << "mine";
  std::ofstream(options.folder / "notes.chunk") << "mine";
  resets();
  EXPECT_THAT(onDisk(), ElementsAre("notes.chunk", "notes.txt"));
}

TEST_F(SondrelSimulatorTest, FilesOfEarlierRunsCountForTheMaximum) {
  launch();
  fs::create_directory(options.folder);
  std::ofstream(options.folder / "000041-Voice.chunk") << "old";
  starts("Default", 32, 2);
  passes(500ms);
  EXPECT_THAT(onDisk(), ElementsAre("000041-Voice.chunk", "000042-Default.chunk"));
  passes(500ms);
  EXPECT_THAT(onDisk(), ElementsAre("000042-Default.chunk", "000043-Default.chunk"));
}

TEST_F(SondrelSimulatorTest, AnswersTheListOfConfigurations) {
  launch();
  library->getConfigurationList();
  EXPECT_THAT(delegate->configurations, IsEmpty()) << "not before the call has returned";
  time.settle();
  EXPECT_THAT(delegate->configurations, ElementsAre("Default", "Voice", "Data Throughput", "Mobility", "Registration",
                                                    "RF and Power", "Everything"));
}

TEST_F(SondrelSimulatorTest, AFolderThatCannotBeMadeIsAnErrorState) {
  options.folder = directory.path() / "missing" / "Sondrel";
  launch();
  starts();
  EXPECT_THAT(delegate->events, ElementsAre("state 2"));
  EXPECT_THAT(delegate->errors,
              ElementsAre("The log folder cannot be written: No such file or directory. Nothing is captured."));
  passes(10s);
  EXPECT_THAT(delegate->events, SizeIs(1));
  resets();
  EXPECT_THAT(delegate->events, ElementsAre("state 2", "state 2"));
}

TEST_F(SondrelSimulatorTest, AFileInTheFoldersPlaceIsAnErrorState) {
  std::ofstream(options.folder) << "a file";
  launch();
  starts();
  EXPECT_THAT(delegate->events, ElementsAre("state 2"));
  EXPECT_THAT(delegate->errors, ElementsAre(HasSubstr("Not a directory")));
}

TEST_F(SondrelSimulatorTest, AFullDiskIsReportedInPlaceOfFilesAndEndsTheCapture) {
  options.capacity = 5 * 32 * 1024;
  launch();
  starts();
  passes(10s);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 4", "files 1", "no files", "state 0"));
  EXPECT_THAT(delegate->errors, ElementsAre("A log file cannot be written: No space left on device. Earlier files are "
                                            "kept. Make room, then start again."));
  EXPECT_THAT(onDisk(), SizeIs(5));
}

TEST_F(SondrelSimulatorTest, AfterAFullDiskAResetMakesRoom) {
  options.capacity = 2 * 32 * 1024;
  launch();
  starts();
  passes(2s);
  resets();
  starts();
  passes(1s);
  EXPECT_THAT(onDisk(), SizeIs(2));
}

TEST_F(SondrelSimulatorTest, AFolderThatGoesDuringACaptureEndsIt) {
  launch();
  starts();
  passes(500ms);
  fs::remove_all(options.folder);
  passes(10s);
  EXPECT_THAT(delegate->events, ElementsAre("state 1", "files 1", "no files", "state 0"));
  EXPECT_THAT(delegate->errors, ElementsAre(HasSubstr("No such file or directory")));
}

TEST_F(SondrelSimulatorTest, SettingsThatMakeNoSenseAreErrorStates) {
  launch();
  starts("Nonsense");
  starts("Default", 0);
  starts("Default", 1e12);
  starts("Default", 32, 0);
  library->start(SondrelConfiguration());
  time.settle();
  EXPECT_THAT(delegate->events, ElementsAre("state 2", "state 2", "state 2", "state 2", "state 2"));
  EXPECT_THAT(delegate->errors, ElementsAre("There is no log configuration \"Nonsense\".", HasSubstr("0 KB"),
                                            HasSubstr("1000000000000 KB"), "There cannot be 0 log files.",
                                            "There is no log configuration \"\"."));
  EXPECT_FALSE(fs::exists(options.folder));
}

TEST_F(SondrelSimulatorTest, ALibraryObjectThatGoesTakesItsCaptureAlong) {
  launch();
  starts();
  passes(1s);
  library.reset();
  passes(10s);
  EXPECT_THAT(onDisk(), SizeIs(2));
  EXPECT_THAT(delegate->events, ElementsAre("state 1"));
}

TEST_F(SondrelSimulatorTest, ADelegateThatIsGoneHearsNothing) {
  launch();
  starts();
  delegate.reset();
  passes(10s);
  EXPECT_THAT(onDisk(), SizeIs(20));
}

/// The screen on the simulated library.
TEST_F(SondrelSimulatorTest, ServesTheScreenFromStartOverAWrapToReset) {
  test::FakePlatform platform;
  options.folder = platform.directory.path() / "Sondrel";
  SondrelSimulator served(options, *platform.mainQueue, platform.time, platform.time);
  platform.platform.sondrel = &served;
  const auto screen = SondrelViewController::make();
  screen->viewDidLoad();
  screen->didTapStart();
  platform.time.advance(300ms + 2s);
  EXPECT_EQ(screen->maxNumberOfLogs(), 256);
  EXPECT_EQ(screen->numberOfRows(), 4U);
  platform.time.advance(126s);
  EXPECT_EQ(screen->numberOfRows(), 256U);
  platform.time.advance(2s);
  EXPECT_EQ(screen->numberOfRows(), 8U) << "the list has wrapped";
  EXPECT_THAT(onDisk(), SizeIs(256));
  screen->didTapStop();
  platform.time.advance(1s);
  screen->didTapReset();
  platform.time.advance(1s);
  EXPECT_EQ(screen->numberOfRows(), 0U);
  EXPECT_THAT(onDisk(), IsEmpty());
  EXPECT_THAT(platform.alerts.shown, IsEmpty());
}

TEST(SondrelSimulatorThreads, ACaptureOnRealThreadsReachesTheMainQueue) {
  const test::TemporaryDirectory directory;
  SimulatedPhone::Options description;
  description.device.systemClasses = {"Sondrel"};
  description.documents = directory.path();
  SimulatedPhone phone(description);
  ASSERT_NE(Platform::current().sondrel, nullptr);
  const auto delegate = std::make_shared<RecordingDelegate>();
  delegate->onCall = [] { EXPECT_TRUE(Platform::current().mainQueue.isCurrent()); };
  const auto library = Platform::current().sondrel->makeSondrel();
  library->setDelegate(delegate);
  SondrelConfiguration configuration;
  configuration.setActiveConfig("Default");
  configuration.setChunkFileSize(32);
  configuration.setMaxNumberOfLogs(256);
  library->start(configuration);
  phone.runUntilAtRest();
  library->stop();
  phone.runUntilAtRest();
  // On a slow machine a chunk may have come between them.
  ASSERT_FALSE(delegate->events.empty());
  EXPECT_EQ(delegate->events.front(), "state 1");
  EXPECT_EQ(delegate->events.back(), "state 0");
  EXPECT_TRUE(fs::is_directory(directory.path() / "Sondrel"));
}

TEST(SondrelSimulatorThreads, APhoneWithoutTheClassHasNoLibrary) {
  const test::TemporaryDirectory directory;
  SimulatedPhone phone({{}, directory.path(), {}});
  EXPECT_EQ(Platform::current().sondrel, nullptr);
}

}  // namespace
}  // namespace quorl::simulator
