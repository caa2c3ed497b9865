#include <cstddef>
#include <filesystem>
#include <iterator>
#include <string>

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "OutputFile.h"
#include "ToolRun.h"
#include "hosts/simulator/UsableDocuments.h"
#include "support/FileSizeLimit.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;
using tool::writeWholeFile;

class OutputFile : public testing::Test {
 protected:
  std::ptrdiff_t filesInDirectory() const {
    return std::distance(fs::directory_iterator(directory.path()), fs::directory_iterator());
  }

  TemporaryDirectory directory;
  const fs::path file = directory.path() / "file";
};

TEST_F(OutputFile, IsForItsOwnerAloneWhenNew) {
  ASSERT_TRUE(writeWholeFile(file, "text"));
  EXPECT_EQ(readFile(file), "text");
  EXPECT_EQ(fs::status(file).permissions(), fs::perms(0600));
  EXPECT_EQ(filesInDirectory(), 1);
}

TEST_F(OutputFile, ReplacesAnotherAndKeepsItsPermissions) {
  writeFile(file, "earlier and longer");
  fs::permissions(file, fs::perms(0640));
  ASSERT_TRUE(writeWholeFile(file, "text"));
  EXPECT_EQ(readFile(file), "text");
  EXPECT_EQ(fs::status(file).permissions(), fs::perms(0640));
  EXPECT_EQ(filesInDirectory(), 1);
}

TEST_F(OutputFile, OnAFullDiskTheEarlierOneStays) {
  writeFile(file, "earlier");
  {
    const FileSizeLimit limit(1000);
    const auto written = writeWholeFile(file, std::string(5000, 'x'));
    ASSERT_FALSE(written);
    EXPECT_EQ(written.error(), "File too large");
  }
  EXPECT_EQ(readFile(file), "earlier");
  EXPECT_EQ(filesInDirectory(), 1) << "nothing is left beside it";
}

TEST_F(OutputFile, StaysItsOwners) {
  // Only root can give a file away; anybody else has it already.
  const uid_t owner = geteuid() == 0 ? 65534 : geteuid();
  const gid_t group = geteuid() == 0 ? 65534 : getegid();
  writeFile(file, "earlier");
  fs::permissions(file, fs::perms(0600));
  ASSERT_EQ(chown(file.c_str(), owner, group), 0);
  ASSERT_TRUE(writeWholeFile(file, "text"));
  struct stat status {};
  ASSERT_EQ(stat(file.c_str(), &status), 0);
  EXPECT_EQ(status.st_uid, owner);
  EXPECT_EQ(status.st_gid, group);
  EXPECT_EQ(readFile(file), "text");
}

TEST_F(OutputFile, BehindALinkIsReplacedAndTheLinkStays) {
  writeFile(file, "earlier");
  const fs::path link = directory.path() / "link";
  fs::create_symlink("file", link);
  ASSERT_TRUE(writeWholeFile(link, "text"));
  EXPECT_TRUE(fs::is_symlink(link));
  EXPECT_EQ(readFile(file), "text");
}

TEST_F(OutputFile, BehindALinkToNothingIsMade) {
  const fs::path link = directory.path() / "link";
  fs::create_symlink("file", link);
  ASSERT_TRUE(writeWholeFile(link, "text"));
  EXPECT_TRUE(fs::is_symlink(link));
  EXPECT_EQ(readFile(file), "text");
}

TEST_F(OutputFile, MayHaveTheLongestName) {
  const fs::path longest = directory.path() / std::string(255, 'n');
  ASSERT_TRUE(writeWholeFile(longest, "text"));
  EXPECT_EQ(readFile(longest), "text");
}

TEST_F(OutputFile, ThatIsADeviceIsWrittenDirectly) {
  const auto full = writeWholeFile("/dev/full", "text");
  ASSERT_FALSE(full);
  EXPECT_EQ(full.error(), "No space left on device");
  EXPECT_TRUE(writeWholeFile("/dev/null", "text"));
  EXPECT_TRUE(fs::is_character_file("/dev/null"));
}

TEST_F(OutputFile, IsNeverAPartOfADatabase) {
  for (const char* name : {"metricPartV11.sqlite", "metricPartV11.sqlite-wal", "metricPartV11.sqlite-shm"}) {
    const fs::path part = directory.path() / name;
    EXPECT_FALSE(simulator::spareDatabase(part, directory.path())) << "before it is there";
    EXPECT_TRUE(simulator::spareDatabase(part, {})) << "a name alone is nothing";
    writeFile(part, "x");
    fs::create_hard_link(part, file);
    const auto spared = simulator::spareDatabase(file, directory.path());
    ASSERT_FALSE(spared) << name;
    EXPECT_EQ(spared.error(), file.string() + ": belongs to a database and is not overwritten");
    fs::remove(file);
  }
  EXPECT_TRUE(simulator::spareDatabase(file, directory.path()));
}

TEST_F(OutputFile, IsNoDatabaseOfAnotherDirectory) {
  writeFile(file, std::string("SQLite format 3\0...", 19));
  EXPECT_FALSE(simulator::spareDatabase(file, {}));
  for (const char* begin : {"\x37\x7f\x06\x82", "\x37\x7f\x06\x83", "\xd9\xd5\x05\xf9\x20\xa1\x63\xd7"}) {
    writeFile(file, begin);
    EXPECT_FALSE(simulator::spareDatabase(file, {}));
  }
  writeFile(file, "SQLite format 4");
  EXPECT_TRUE(simulator::spareDatabase(file, {}));
  EXPECT_TRUE(simulator::spareDatabase("/dev/null", {}));
}

}  // namespace
}  // namespace quorl::test
