#include <csignal>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <random>
#include <set>
#include <stdexcept>
#include <string>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "base/Clock.h"
#include "hosts/simulator/EpochTime.h"
#include "store/RawDatabase.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

/// The product in a process of its own, taking metrics without end.
class Writer {
 public:
  Writer(const std::filesystem::path& documents, std::uint64_t firstMs) {
    int ends[2] = {};
    if (pipe2(ends, O_CLOEXEC) != 0) throw std::runtime_error("no pipe");
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
    std::string program = QUORL_FAULT_WRITER;
    std::string folder = documents.string();
    std::string first = std::to_string(firstMs);
    std::string zone = "TZ=UTC";
    char* words[] = {program.data(), folder.data(), first.data(), nullptr};
    char* environment[] = {zone.data(), nullptr};
    const int error = posix_spawn(&process_, program.c_str(), &actions, nullptr, words, environment);
    posix_spawn_file_actions_destroy(&actions);
    close(ends[1]);
    reports_.reset(fdopen(ends[0], "r"));
    if (error != 0) throw std::runtime_error("cannot run " + program);
  }
  Writer(const Writer&) = delete;
  Writer& operator=(const Writer&) = delete;

  /// The next reported row; empty once the process is gone.
  std::string nextReport() {
    char line[32];
    if (std::fgets(line, sizeof line, reports_.get()) == nullptr) return {};
    std::string report = line;
    if (report.back() == '\n') report.pop_back();
    return report;
  }

  /// Kills the process in whatever it is doing and waits for its end. Answers its status, as `waitpid` does.
  int kill() {
    ::kill(process_, SIGKILL);
    int status = 0;
    waitpid(process_, &status, 0);
    return status;
  }

 private:
  struct Close {
    void operator()(std::FILE* file) const { std::fclose(file); }
  };
  pid_t process_ = 0;
  std::unique_ptr<std::FILE, Close> reports_;
};

class KilledProcess : public testing::Test {
 protected:
  /// What is wrong with the database file, "ok" if nothing is.
  std::string integrity() { return database().column("PRAGMA integrity_check").at(0); }
  std::set<std::string> storedTimestamps() {
    const auto rows = database().column("SELECT attribute_value FROM Metric WHERE attribute_name = 'timestamp'");
    return {rows.begin(), rows.end()};
  }

  RawDatabase database() const { return RawDatabase(documents / "metricPartV11.sqlite"); }

  TemporaryDirectory directory;
  const std::filesystem::path documents = directory.path() / "documents";
};

TEST_F(KilledProcess, NoReportedRowIsLostAndTheFileStaysWhole) {
  constexpr int kKills = 200;
  constexpr std::uint64_t kMsPerRun = 1'000'000;  // one for each metric of a run, and many left over
  // The last run's metrics are of now; those of thirty days ago would go at the next start.
  std::uint64_t firstMs = simulator::millisecondsSince1970(SystemClock().now()) - kKills * kMsPerRun;
  std::mt19937 moments(20251121);
  std::set<std::string> reported;
  for (int kill = 0; kill < kKills; ++kill, firstMs += kMsPerRun) {
    Writer writer(documents, firstMs);
    for (std::size_t left = 1 + moments() % 120; left > 0; --left) {
      const std::string report = writer.nextReport();
      ASSERT_NE(report, "") << "the product ended by itself in run " << kill;
      reported.insert(report);
    }
    ASSERT_EQ(WTERMSIG(writer.kill()), SIGKILL);
    // What was told before the end and not yet heard.
    for (std::string report = writer.nextReport(); !report.empty(); report = writer.nextReport())
      reported.insert(report);

    ASSERT_EQ(integrity(), "ok") << "after kill " << kill;
  }
  const std::set<std::string> stored = storedTimestamps();
  std::size_t lost = 0;
  for (const std::string& row : reported) lost += stored.contains(row) ? 0U : 1U;
  EXPECT_EQ(lost, 0U) << "of " << reported.size();
  EXPECT_GT(reported.size(), std::size_t{kKills});
  std::printf("kills: %d\nreported metrics: %zu, lost: %zu\n", kKills, reported.size(), lost);
}

}  // namespace
}  // namespace quorl::test
