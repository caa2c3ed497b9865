// The program itself, as it is started from a desktop.

#include <QProcess>
#include <QProcessEnvironment>
#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/simulator/Recording.h"
#include "store/RawDatabase.h"
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
            process.readAllStandardError().toStdString()};
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

TEST_F(SimulatorProgram, ATypingMistakeIsToldInALine) {
  const Ended scenario = run({"--scenario", "moon"});
  EXPECT_EQ(scenario.code, 1);
  EXPECT_THAT(scenario.errors, StartsWith("quorl-simulator: "));
  EXPECT_THAT(scenario.errors, HasSubstr("moon"));
  EXPECT_FALSE(std::filesystem::exists(database));
  EXPECT_NE(run({"--scenario", "city", "--recording", QUORL_SOURCE_DIR "/resources/recordings/mav.jsonl"}).code, 0);
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

}  // namespace
}  // namespace quorl::test
