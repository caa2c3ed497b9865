#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "screens/export/TextFile.h"
#include "support/FileSizeLimit.h"
#include "support/TemporaryDirectory.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class TextFileTest : public ::testing::Test {
 protected:
  std::filesystem::path file() const { return folder.path() / "export.txt"; }
  auto write(std::vector<std::string> pieces, Overwrite overwrite = Overwrite::no) {
    return writeTextFile(file(), textOf(std::move(pieces)), overwrite);
  }
  static SharedText textOf(std::vector<std::string> pieces) {
    return {"export.txt", [pieces = std::move(pieces)](const SharedText::Sink& sink) {
              for (const std::string& piece : pieces)
                if (!sink(piece)) return;
            }};
  }
  std::string contents() const {
    std::ifstream stream(file(), std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
  }
  std::vector<std::string> filesInFolder() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder.path()))
      names.push_back(entry.path().filename().string());
    return names;
  }

  test::TemporaryDirectory folder;
};

TEST_F(TextFileTest, HoldsThePiecesInTheirOrder) {
  const auto size = write({"one,", "two,", "three"});
  ASSERT_TRUE(size);
  EXPECT_EQ(*size, 13U);
  EXPECT_EQ(contents(), "one,two,three");
  EXPECT_THAT(filesInFolder(), ElementsAre("export.txt"));
}

TEST_F(TextFileTest, AnEmptyTextGivesAnEmptyFile) {
  ASSERT_TRUE(write({}));
  EXPECT_EQ(contents(), "");
  EXPECT_TRUE(std::filesystem::exists(file()));
}

TEST_F(TextFileTest, IsForItsOwnerAlone) {
  ASSERT_TRUE(write({"cells"}));
  using std::filesystem::perms;
  EXPECT_EQ(std::filesystem::status(file()).permissions(), perms::owner_read | perms::owner_write);
}

TEST_F(TextFileTest, AFileThatIsThereStaysUnlessItIsToBeOverwritten) {
  ASSERT_TRUE(write({"first"}));
  const auto second = write({"second"});
  ASSERT_FALSE(second);
  EXPECT_EQ(second.error().kind, TextFileError::Kind::exists);
  EXPECT_EQ(contents(), "first");
  ASSERT_TRUE(write({"second"}, Overwrite::yes));
  EXPECT_EQ(contents(), "second");
  EXPECT_THAT(filesInFolder(), ElementsAre("export.txt"));
}

TEST_F(TextFileTest, AFileThatAppearsWhileTheTextIsWrittenStays) {
  const SharedText text("export.txt", [this](const SharedText::Sink& sink) {
    std::ofstream(file()) << "somebody else's";
    sink("ours");
  });
  const auto size = writeTextFile(file(), text, Overwrite::no);
  ASSERT_FALSE(size);
  EXPECT_EQ(size.error().kind, TextFileError::Kind::exists);
  EXPECT_EQ(contents(), "somebody else's");
  EXPECT_THAT(filesInFolder(), ElementsAre("export.txt"));
}

TEST_F(TextFileTest, ANameMayBeAsLongAsTheFileSystemTakes) {
  const std::string longest(255, 'n');
  ASSERT_TRUE(writeTextFile(folder.path() / longest, textOf({"x"}), Overwrite::no));
  EXPECT_THAT(filesInFolder(), ElementsAre(longest));
  const auto size = writeTextFile(folder.path() / (longest + 'n'), textOf({"x"}), Overwrite::no);
  ASSERT_FALSE(size);
  EXPECT_EQ(size.error().reason, "File name too long");
  EXPECT_THAT(filesInFolder(), ElementsAre(longest));
}

TEST_F(TextFileTest, AFolderThatIsMissingIsTold) {
  const auto size = writeTextFile(folder.path() / "missing" / "export.txt", textOf({"x"}), Overwrite::no);
  ASSERT_FALSE(size);
  EXPECT_EQ(size.error().kind, TextFileError::Kind::notWritten);
  EXPECT_EQ(size.error().reason, "No such file or directory");
}

TEST_F(TextFileTest, AFolderOfThatNameIsNotOverwritten) {
  std::filesystem::create_directory(file());
  const auto size = write({"x"}, Overwrite::yes);
  ASSERT_FALSE(size);
  EXPECT_EQ(size.error().kind, TextFileError::Kind::notWritten);
  EXPECT_EQ(size.error().reason, "Is a directory");
}

TEST_F(TextFileTest, ADeviceThatIsFullEndsTheTextAndNothingIsLeft) {
  std::optional<test::FileSizeLimit> limit(std::in_place, 4096);
  int pieces = 0;
  const SharedText text("export.txt", [&pieces](const SharedText::Sink& sink) {
    const std::string piece(4096, 'x');
    while (sink(piece)) ++pieces;
  });
  const auto size = writeTextFile(file(), text, Overwrite::no);
  limit.reset();
  ASSERT_FALSE(size);
  EXPECT_EQ(size.error().reason, "File too large");
  EXPECT_EQ(pieces, 1);
  EXPECT_THAT(filesInFolder(), IsEmpty());
}

}  // namespace
}  // namespace quorl
