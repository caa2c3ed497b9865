#include <csignal>
#include <filesystem>
#include <string>

#include <gtest/gtest.h>
#include <unistd.h>

#include "RunDocuments.h"
#include "ToolRun.h"
#include "hosts/simulator/UsableDocuments.h"
#include "support/TemporaryDirectory.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;
using tool::RunDocuments;

class RunDocumentsTest : public testing::Test {
 protected:
  /// What a run is like that its user ends.
  [[noreturn]] static void endByA(int signal) {
    std::signal(signal, SIG_DFL);  // whoever started the tests may want it ignored
    alarm(kLongestSeconds);
    const auto documents = RunDocuments::make("");
    const fs::path path = (*documents)->path();
    kill(getpid(), signal);  // comes before there is anything
    if (!simulator::prepareDocuments(path)) _exit(1);
    writeFile(path / "file", "x");
    (*documents)->settled();
    for (;;) pause();
  }

  static constexpr unsigned kLongestSeconds = 60;

  const TemporaryDirectory directory;
  const ScopedVariable place{"TMPDIR", directory.path().string()};
};

TEST_F(RunDocumentsTest, GoWithASignalThatEndsTheRun) {
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
    EXPECT_EXIT(endByA(signal), testing::KilledBySignal(signal), "");
    EXPECT_TRUE(fs::is_empty(directory.path())) << signal;
  }
}

TEST_F(RunDocumentsTest, StayWhereTheUserNamedThem) {
  const fs::path named = directory.path() / "named";
  {
    const auto documents = RunDocuments::make(named.string());
    ASSERT_TRUE(documents);
    EXPECT_TRUE((*documents)->isNamed());
    ASSERT_TRUE(simulator::prepareDocuments((*documents)->path()));
  }
  EXPECT_TRUE(fs::is_directory(named));
}

TEST_F(RunDocumentsTest, WithoutAPlaceForTemporaryFilesAreAnError) {
  const std::string missing = (directory.path() / "missing").string();
  const std::string fault = "there is no directory for temporary files (TMPDIR): No such file or directory";
  {
    const ScopedVariable unusable("TMPDIR", missing);
    const auto documents = RunDocuments::make("");
    ASSERT_FALSE(documents);
    EXPECT_EQ(documents.error(), fault);
  }
  const fs::path script = directory.path() / "script.jsonl";
  writeFile(script, "");
  const ToolResult run =
      runProgram("/usr/bin/env", {"TMPDIR=" + missing, QUORL_TOOL, "carriers", "--telephony", script.string()});
  EXPECT_EQ(run.exitCode, 1);
  EXPECT_EQ(run.output, "");
  EXPECT_EQ(run.errors, "quorl-tool: " + fault + "\n");
}

}  // namespace
}  // namespace quorl::test
