// The program itself, as it is started from a desktop.

#include <QProcess>
#include <QProcessEnvironment>
#include <algorithm>
#include <csignal>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "hosts/simulator/Recording.h"
#include "store/RawDatabase.h"
#include "support/FileSizeLimit.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

class SimulatorProgram : public ::testing::Test {
 protected:
  struct Ended {
    int code = -1;
    std::string errors;
    std::string output = {};  // what was not waited for
  };

  void start(const std::vector<std::string>& options) {
    QStringList arguments{"--documents", QString::fromStdString(documents.string())};
    for (const std::string& option : options) arguments << QString::fromStdString(option);
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("QT_QPA_PLATFORM", "offscreen");
    environment.insert("QT_QUICK_BACKEND", "software");
    environment.insert("XDG_RUNTIME_DIR", QString::fromStdString(directory.path().string()));
    environment.insert("LC_ALL", "C.UTF-8");
    environment.insert("TZ", "UTC");
    process.setProcessEnvironment(environment);
    process.start(QUORL_SIMULATOR, arguments);
    ASSERT_TRUE(process.waitForStarted());
  }
  bool waitsForOutput(const std::string& text) {
    while (output.find(text) == std::string::npos) {
      if (!process.waitForReadyRead(kLongestRunMs)) return false;
      output += process.readAllStandardOutput().toStdString();
    }
    return true;
  }
  Ended end() {
    EXPECT_TRUE(process.waitForFinished(kLongestRunMs));
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1,
            process.readAllStandardError().toStdString(), process.readAllStandardOutput().toStdString()};
  }
  /// Waits while the program runs.
  template <typename Condition>
  bool waitsUntil(Condition condition) {
    constexpr int kLookMs = 10;
    for (int waited = 0; waited < kLongestRunMs && process.state() != QProcess::NotRunning; waited += kLookMs) {
      if (condition()) return true;
      process.waitForFinished(kLookMs);
    }
    return condition();
  }
  /// Whether the program has a handler for a signal by now.
  bool catches(int signal) const {
    std::ifstream status("/proc/" + std::to_string(process.processId()) + "/status");
    for (std::string line; std::getline(status, line);)
      if (line.starts_with("SigCgt:")) return (std::stoull(line.substr(7), nullptr, 16) >> (signal - 1) & 1U) != 0;
    return false;
  }
  std::vector<std::string> documentNames() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(documents)) names.push_back(entry.path().filename());
    return names;
  }
  /// Starts on a month of history, and waits until it is being written.
  bool startsHistory() {
    start({"--history-days", "31", "--seconds", "0.1"});
    return waitsUntil([this] {
      if (!std::filesystem::exists(documents)) return false;
      const auto names = documentNames();
      return std::any_of(names.begin(), names.end(),
                         [](const auto& name) { return name.starts_with(".quorl-history-"); });
    });
  }
  Ended run(const std::vector<std::string>& options) {
    start(options);
    return end();
  }
  std::string single(const std::string& sql) { return RawDatabase(database).column(sql).at(0); }

  static constexpr int kLongestRunMs = 60000;

  std::string output;  // so far
  TemporaryDirectory directory;
  const std::filesystem::path documents = directory.path() / "documents";
  const std::filesystem::path database = documents / "metricPartV11.sqlite";
  QProcess process;
};

TEST_F(SimulatorProgram, OpensOnACityWithAHistory) {
  start({"--print", "--history-days", "2"});
  const bool showsBoth = waitsForOutput("Serving Cell Info") && waitsForOutput("Priority of the camped LTE band");
  process.terminate();
  const Ended ended = end();
  EXPECT_TRUE(showsBoth) << "a system without a language reads English: " << output;
  EXPECT_EQ(ended.code, 0) << ended.errors;
  EXPECT_THAT(ended.errors, testing::AllOf(StartsWith("quorl-simulator: a history of "), HasSubstr(" over 2 days")));
  EXPECT_EQ(std::count(ended.errors.begin(), ended.errors.end(), '\n'), 1) << "no warning: " << ended.errors;
  EXPECT_GT(std::stoi(single("SELECT count(DISTINCT date(collected_on)) FROM Metric")), 1);
  EXPECT_EQ(single("SELECT count(DISTINCT subs_id) FROM Metric WHERE metric_tech <> 'RAT'"), "2");
}

TEST_F(SimulatorProgram, ASecondStartFindsWhatTheFirstLeft) {
  run({"--seconds", "0.1", "--history-days", "1"});
  const int rows = std::stoi(single("SELECT count(*) FROM Metric"));
  const Ended ended = run({"--seconds", "0.1", "--history-days", "5"});
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "");
  EXPECT_GE(std::stoi(single("SELECT count(*) FROM Metric")), rows);
}

TEST_F(SimulatorProgram, EndsWholeWhenItIsAskedTo) {
  const auto recording = directory.path() / "way.jsonl";
  start({"--history-days", "0", "--print", "--record", recording.string()});
  ASSERT_TRUE(process.waitForReadyRead()) << "it prints once the window stands";
  process.terminate();
  const Ended ended = end();
  EXPECT_EQ(ended.code, 0) << ended.errors;
  const auto read = simulator::readRecording(recording);
  ASSERT_TRUE(read);
  EXPECT_TRUE(read->faults.empty());
}

TEST_F(SimulatorProgram, SaysWhichVersionItIs) {
  const Ended ended = run({"--version"});
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "");
  EXPECT_THAT(ended.output, testing::MatchesRegex("quorl-simulator [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

TEST_F(SimulatorProgram, RecordsIntoNoDatabase) {
  run({"--seconds", "0.1", "--history-days", "0"});
  const Ended ended = run({"--seconds", "0.1", "--record", database.string()});
  EXPECT_EQ(ended.code, 1);
  EXPECT_EQ(ended.errors, "quorl-simulator: " + database.string() + ": belongs to a database and is not overwritten\n");
  EXPECT_EQ(RawDatabase(database).column("PRAGMA integrity_check").at(0), "ok");
}

TEST_F(SimulatorProgram, RecordsIntoNoDatabaseThatItMakesItself) {
  std::filesystem::create_directory(documents);
  process.setWorkingDirectory(QString::fromStdString(documents.string()));
  const Ended ended = run({"--seconds", "0.1", "--history-days", "1", "--record", database.filename().string()});
  EXPECT_EQ(ended.code, 1);
  EXPECT_THAT(ended.errors, HasSubstr("belongs to a database and is not overwritten\n"));
  EXPECT_FALSE(std::filesystem::exists(database));
}

TEST_F(SimulatorProgram, StoresAllThatItWasDeliveredBeforeItEnds) {
  const auto recording = directory.path() / "way.jsonl";
  const Ended ended = run({"--history-days", "0", "--speed", "1000", "--seconds", "1", "--record", recording.string()});
  EXPECT_EQ(ended.code, 0) << ended.errors;
  const auto replayed = directory.path() / "replayed";
  QProcess tool;
  tool.start(QUORL_TOOL, {"replay", "--chipset", "mav20", "--documents", QString::fromStdString(replayed.string()),
                          QString::fromStdString(recording.string())});
  ASSERT_TRUE(tool.waitForFinished(kLongestRunMs));
  ASSERT_EQ(tool.exitCode(), 0);
  const std::string rows = "SELECT count(*) FROM Metric WHERE metric_tech <> 'RAT'";
  EXPECT_EQ(single(rows), RawDatabase(replayed / "metricPartV11.sqlite").column(rows).at(0));
}

TEST_F(SimulatorProgram, ATypingMistakeIsToldInALine) {
  const Ended scenario = run({"--scenario", "moon"});
  EXPECT_EQ(scenario.code, 2);
  EXPECT_THAT(scenario.errors, StartsWith("quorl-simulator: "));
  EXPECT_THAT(scenario.errors, HasSubstr("moon"));
  EXPECT_FALSE(std::filesystem::exists(database));
  const Ended both = run({"--scenario", "city", "--recording", QUORL_SOURCE_DIR "/resources/recordings/mav.jsonl"});
  EXPECT_EQ(both.code, 2);
  EXPECT_THAT(both.errors, StartsWith("quorl-simulator: "));
  EXPECT_FALSE(std::filesystem::exists(documents)) << "nothing was tried";
  const Ended record = run({"--history-days", "0", "--record", "/no/such/folder/way.jsonl"});
  EXPECT_EQ(record.code, 1);
  EXPECT_EQ(record.errors, "quorl-simulator: /no/such/folder/way.jsonl: No such file or directory\n");
}

TEST_F(SimulatorProgram, ADeviceOfUnknownFamilyHasNoPast) {
  const Ended ended = run({"--chipset", "none", "--seconds", "0.1"});
  EXPECT_EQ(ended.code, 0) << ended.errors;
  EXPECT_EQ(ended.errors, "") << "nothing is written before the product tells what is wrong";
}

TEST_F(SimulatorProgram, PlaysARecordingBesideATelephonyScript) {
  const Ended ended = run({"--recording", QUORL_SOURCE_DIR "/resources/recordings/ice.jsonl", "--chipset", "ice15",
                           "--speed", "1000", "--seconds", "1.5", "--device-class", "Tabrin"});
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "");
  EXPECT_GT(std::stoi(single("SELECT count(*) FROM Metric WHERE metric_tech = 'RAT'")), 0);
  EXPECT_GT(std::stoi(single("SELECT count(*) FROM Metric WHERE metric_tech <> 'RAT'")), 0);
}

TEST_F(SimulatorProgram, AHistoryThatWasCutShortIsMadeAgain) {
  ASSERT_TRUE(startsHistory());
  process.kill();
  end();
  EXPECT_FALSE(std::filesystem::exists(database)) << "nobody takes the half for the whole";
  EXPECT_EQ(documentNames().size(), 1U);
  const Ended again = run({"--history-days", "1", "--seconds", "0.1"});
  EXPECT_EQ(again.code, 0);
  EXPECT_THAT(again.errors, StartsWith("quorl-simulator: a history of "));
  for (const std::string& name : documentNames()) EXPECT_THAT(name, StartsWith("metricPartV11.sqlite"));
}

TEST_F(SimulatorProgram, ASignalEndsItWithinTheHistory) {
  ASSERT_TRUE(startsHistory());
  process.terminate();
  const Ended ended = end();
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "");
  EXPECT_THAT(documentNames(), testing::IsEmpty());
}

TEST_F(SimulatorProgram, AHistoryThatDoesNotFitIsToldAndLeavesNothing) {
  {
    const FileSizeLimit limit(128 * 1024);  // goes on to the program
    start({"--history-days", "1", "--seconds", "0.1"});
  }
  const Ended ended = end();
  EXPECT_EQ(ended.code, 1);
  EXPECT_THAT(ended.errors, StartsWith("quorl-simulator: " + database.string() + ": "));
  EXPECT_THAT(documentNames(), testing::IsEmpty());
}

TEST_F(SimulatorProgram, RowsThatCouldNotBeStoredAreToldAtOnceAndInTheEnd) {
  run({"--history-days", "0", "--seconds", "0.1"});
  RawDatabase other(database);
  other.run("BEGIN IMMEDIATE");
  start({});
  std::string errors;
  EXPECT_TRUE(waitsUntil([&] {
    errors += process.readAllStandardError().toStdString();
    return errors.ends_with('\n');
  }));
  EXPECT_EQ(errors, "quorl-simulator: 1 row could not be stored: database is locked\n");
  process.terminate();
  const Ended ended = end();
  EXPECT_EQ(ended.code, 1);
  EXPECT_THAT(ended.errors,
              testing::MatchesRegex("quorl-simulator: [0-9]+ rows could not be stored: database is locked\n"));
}

TEST_F(SimulatorProgram, UnusableDocumentsAreToldInALine) {
  std::ofstream(documents) << "a file";
  const Ended ended = run({"--seconds", "0.1"});
  EXPECT_EQ(ended.code, 1);
  EXPECT_EQ(ended.errors, "quorl-simulator: " + documents.string() + ": Not a directory\n");
}

TEST_F(SimulatorProgram, EndsWhileItWaitsForTheReaderOfItsRecording) {
  const auto pipe = directory.path() / "pipe";
  ASSERT_EQ(::mkfifo(pipe.c_str(), S_IRUSR | S_IWUSR), 0);
  start({"--history-days", "0", "--record", pipe.string()});
  ASSERT_TRUE(waitsUntil([this] { return catches(SIGTERM); }));
  process.terminate();
  const Ended ended = end();
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "");
  EXPECT_FALSE(std::filesystem::exists(database)) << "the product was not started";
}

TEST_F(SimulatorProgram, RecordsIntoAPipeOnceItIsRead) {
  const auto pipe = directory.path() / "pipe";
  const auto copy = directory.path() / "copy.jsonl";
  ASSERT_EQ(::mkfifo(pipe.c_str(), S_IRUSR | S_IWUSR), 0);
  start({"--history-days", "0", "--record", pipe.string(), "--seconds", "1"});
  ASSERT_TRUE(waitsUntil([this] { return std::filesystem::exists(documents); }));
  QProcess reader;
  reader.setStandardOutputFile(QString::fromStdString(copy.string()));
  reader.start("cat", {QString::fromStdString(pipe.string())});
  const Ended ended = end();
  EXPECT_EQ(ended.code, 0) << ended.errors;
  ASSERT_TRUE(reader.waitForFinished(kLongestRunMs));
  const auto read = simulator::readRecording(copy);
  ASSERT_TRUE(read);
  EXPECT_FALSE(read->events.empty());
  EXPECT_TRUE(read->faults.empty());
}

TEST_F(SimulatorProgram, EndsWholeWhenNobodyReadsWhatItPrints) {
  const auto recording = directory.path() / "way.jsonl";
  QProcess head;
  process.setStandardOutputProcess(&head);
  start({"--history-days", "0", "--print", "--record", recording.string()});
  head.start("head", {"-1"});
  ASSERT_TRUE(head.waitForFinished(kLongestRunMs));
  EXPECT_THAT(head.readAllStandardOutput().toStdString(), StartsWith("Dashboard"));
  const Ended ended = end();
  EXPECT_EQ(ended.code, 1);
  EXPECT_EQ(ended.errors, "quorl-simulator: standard output cannot be written\n");
  const auto read = simulator::readRecording(recording);
  ASSERT_TRUE(read);
  EXPECT_FALSE(read->events.empty());
  EXPECT_TRUE(read->faults.empty());
}

TEST_F(SimulatorProgram, TellsWhenItCannotPrint) {
  process.setStandardOutputFile("/dev/full");
  const Ended ended = run({"--history-days", "0", "--print"});
  EXPECT_EQ(ended.code, 1);
  EXPECT_EQ(ended.errors, "quorl-simulator: standard output cannot be written\n");
}

TEST_F(SimulatorProgram, PrintsIntoNoOtherFileForWantOfStandardOutput) {
  const auto recording = directory.path() / "way.jsonl";
  process.setChildProcessModifier([] { ::close(STDOUT_FILENO); });
  const Ended silent = run({"--history-days", "0", "--record", recording.string(), "--seconds", "1"});
  EXPECT_EQ(silent.code, 0) << silent.errors;
  const auto read = simulator::readRecording(recording);
  ASSERT_TRUE(read);
  EXPECT_FALSE(read->events.empty());
  EXPECT_TRUE(read->faults.empty());
  const Ended printing = run({"--print", "--seconds", "1"});
  EXPECT_EQ(printing.code, 1);
  EXPECT_EQ(printing.errors, "quorl-simulator: standard output cannot be written\n");
}

TEST_F(SimulatorProgram, TakesPicturesWhenItIsAskedToEnd) {
  const auto pictures = directory.path() / "pictures";
  start({"--history-days", "0", "--screenshots", pictures.string()});
  ASSERT_TRUE(waitsForOutput("measurements ")) << "what the product prints is shown";
  process.terminate();
  const Ended ended = end();
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "");
  EXPECT_GT(std::filesystem::file_size(pictures / "DashboardViewController.png"), 0U);
}

TEST_F(SimulatorProgram, TellsOfEachPictureThatCannotBeWritten) {
  const auto picture = directory.path() / "DashboardViewController.png";
  std::filesystem::create_directory(picture);
  const Ended ended =
      run({"--history-days", "0", "--screenshots", directory.path().string(), "--seconds", "0.1", "--print"});
  EXPECT_EQ(ended.code, 1);
  EXPECT_THAT(ended.errors, StartsWith("quorl-simulator: " + picture.string() + ": "));
  EXPECT_THAT(ended.output, testing::Not(HasSubstr("measurements "))) << "standard output is for results";
}

TEST_F(SimulatorProgram, ShowsNoControlCharacters) {
  run({"--history-days", "0", "--seconds", "0.1"});
  RawDatabase(database).run(
      "INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type,"
      " is_attribute_graphable, metric_id, subs_id, collected_on)"
      " SELECT 'LTE', 'sly ' || char(27) || '[31m', 'a', '1', 'INT', 0, '1', column1, datetime('now')"
      " FROM (VALUES (0), (1))");
  start({"--print"});
  EXPECT_TRUE(waitsForOutput("sly .[31m")) << output;
  process.terminate();
  end();
  EXPECT_THAT(run({"--scenario", "sly \033[31m"}).errors, HasSubstr("\"sly .[31m\""));
}

TEST_F(SimulatorProgram, WhatIsAMonthAwayDoesNotComeAtOnce) {
  const auto recording = directory.path() / "way.jsonl";
  const auto script = directory.path() / "sims.jsonl";
  const auto shipped =
      simulator::readRecording(std::filesystem::path(QUORL_SOURCE_DIR "/resources/recordings/mav.jsonl"));
  ASSERT_TRUE(shipped);
  simulator::RecordedEvent far = shipped->events.front();
  std::ofstream lines(recording);
  for (const std::uint64_t atMs : {std::uint64_t{2200000000}, std::uint64_t{2592000000000}, UINT64_MAX}) {
    far.atMs = atMs;
    lines << simulator::recordingLine(far) << '\n';
  }
  lines.close();
  std::ofstream(script) << "{\"atMs\": 0, \"event\": \"simInserted\", \"slot\": 1}\n"
                           "{\"atMs\": 2592000000, \"event\": \"simRemoved\", \"slot\": 1}\n";
  start({"--recording", recording.string(), "--telephony", script.string(), "--seconds", "2500000"});
  ASSERT_TRUE(waitsForOutput("measurements "));
  process.terminate();
  const Ended ended = end();
  EXPECT_EQ(ended.code, 0);
  EXPECT_EQ(ended.errors, "") << "no timer overflows";
  EXPECT_EQ(single("SELECT count(*) FROM Metric WHERE metric_tech <> 'RAT'"), "0");
}

}  // namespace
}  // namespace quorl::test
