#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>

#include "ScreenWindow.h"
#include "screens/export/ExportText.h"
#include "screens/export/view/SaveText.h"

namespace quorl {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using namespace std::chrono_literals;

/// Ids are made anew with each read.
std::string withoutIds(const std::string& text) {
  return std::regex_replace(text, std::regex("id: [0-9A-F-]{36}"), "id: ");
}

class ExportWindowTest : public test::ScreenWindowTest {
 protected:
  ExportWindowTest() {
    isInternalBuild();
    std::filesystem::create_directory(folder());
    view::SaveText::shared().setFolder(QString::fromStdString(folder().string()));
  }

  std::filesystem::path folder() const { return phone.directory.path() / "saved"; }
  void launchOnExport() {
    launch();
    tap("exportButton");
    pass(500ms);
  }
  void chooses(int option) {
    tap("exportOption" + QString::number(option));
    pass(300ms);
  }
  void saves() {
    tap("saveButton");
    pass(300ms);
  }
  void names(const QString& fileName) {
    find("fileNameField")->forceActiveFocus();
    key(Qt::Key_A, Qt::ControlModifier);
    types(fileName);
  }
  std::vector<std::string> files() const {
    std::vector<std::string> found;
    for (const auto& entry : std::filesystem::directory_iterator(folder()))
      found.push_back(entry.path().filename().string());
    return found;
  }
  std::string contents(const std::string& fileName) const {
    std::ifstream stream(folder() / fileName, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
  }
  std::string wholeText(AttributeDetailTimeFrame timeFrame) {
    std::string text;
    store().exportMetrics(timeFrame, [&](const ExportedMetrics& metrics, const std::optional<SQLiteError>&) {
      text = exportText(metrics);
    });
    settle();
    return text;
  }
};

TEST_F(ExportWindowTest, OffersThreeTimeFrames) {
  launchOnExport();
  EXPECT_EQ(text("exportHeading"), "Select a time frame to export all metrics");
  EXPECT_EQ(text("exportOption0"), "Daily");
  EXPECT_EQ(text("exportOption1"), "Weekly");
  EXPECT_EQ(text("exportOption2"), "Monthly");
  EXPECT_FALSE(isShown("exportLoading"));
  tap("closeButton");
  pass(500ms);
  EXPECT_FALSE(isShown("exportHeading"));
}

TEST_F(ExportWindowTest, WritesTheTextOfTheFrameToAFileOfItsName) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  hasStored(reading("LTE", "Tx Power", "band", "3, and a comma"));
  launchOnExport();
  chooses(2);
  EXPECT_THAT(text("fileNameField"), MatchesRegex("quorl-monthly-[0-9-]+\\.txt"));
  saves();
  EXPECT_THAT(text("saveMessage"), HasSubstr("Saved "));
  ASSERT_THAT(files(), ElementsAre(MatchesRegex("quorl-monthly-[0-9-]+\\.txt")));
  const std::string written = contents(files()[0]);
  EXPECT_THAT(written, ::testing::StartsWith("QuorlInternal_4.Metric(id: "));
  EXPECT_EQ(withoutIds(written), withoutIds(wholeText(AttributeDetailTimeFrame::monthly)));
  tap("cancelSaveButton");
  pass(300ms);
  EXPECT_FALSE(isShown("saveMessage"));
}

TEST_F(ExportWindowTest, AFrameWithoutRowsGivesAnEmptyFile) {
  launchOnExport();
  chooses(0);
  names("empty.txt");
  saves();
  EXPECT_THAT(files(), ElementsAre("empty.txt"));
  EXPECT_EQ(contents("empty.txt"), "");
}

TEST_F(ExportWindowTest, AFileThatIsThereIsOverwrittenOnlyWhenTheUserSaysSo) {
  hasStored(reading("LTE", "Tx Power", "power", "11"));
  std::ofstream(folder() / "mine.txt") << "mine";
  launchOnExport();
  chooses(0);
  names("mine.txt");
  saves();
  EXPECT_EQ(text("saveMessage"), "mine.txt exists already. Replace it?");
  EXPECT_EQ(contents("mine.txt"), "mine");
  tap("cancelSaveButton");  // keeps it, and asks again
  EXPECT_EQ(text("fileNameField"), "mine.txt");
  EXPECT_EQ(contents("mine.txt"), "mine");
  saves();
  tap("replaceButton");
  pass(300ms);
  EXPECT_THAT(contents("mine.txt"), HasSubstr("attributeValue: 11"));
  EXPECT_THAT(files(), ElementsAre("mine.txt"));
}

TEST_F(ExportWindowTest, AFolderThatCannotBeWrittenIsToldAndAnotherCanBeChosen) {
  launchOnExport();
  chooses(0);
  const std::string missing = (folder() / "missing").string();
  view::SaveText::shared().setFolder(QString::fromStdString(missing));
  saves();
  EXPECT_THAT(text("saveMessage"), HasSubstr(missing));
  EXPECT_THAT(text("saveMessage"), HasSubstr("could not be written: No such file or directory."));
  EXPECT_THAT(text("saveMessage"), HasSubstr("Choose another folder or name, and save again."));
  view::SaveText::shared().chooseFolder(QUrl::fromLocalFile(QString::fromStdString(folder().string())));
  saves();
  EXPECT_THAT(text("saveMessage"), HasSubstr("Saved "));
  EXPECT_EQ(files().size(), 1U);
}

TEST_F(ExportWindowTest, ANameThatIsNoneIsRefused) {
  launchOnExport();
  chooses(0);
  for (const char* name : {"a/b.txt", "..", " "}) {
    SCOPED_TRACE(name);
    names(name);
    saves();
    EXPECT_THAT(text("saveMessage"), HasSubstr("A file needs a name"));
  }
  EXPECT_TRUE(files().empty());
}

TEST_F(ExportWindowTest, TheKeyboardSavesAndEscapeCancels) {
  launchOnExport();
  find("exportOption0")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_Return);
  pass(300ms);
  key(Qt::Key_Escape);
  pass(300ms);
  EXPECT_FALSE(isShown("fileNameField"));
  EXPECT_TRUE(isShown("exportHeading"));
  find("exportOption0")->forceActiveFocus(Qt::TabFocusReason);
  key(Qt::Key_Return);
  pass(300ms);
  key(Qt::Key_Return);  // in the field of the name
  pass(300ms);
  EXPECT_EQ(files().size(), 1U);
}

TEST_F(ExportWindowTest, TheWindowShowsThatItGathersAndStaysSoAfterAFailedReadAsMeant) {
  launch();
  store().executeDashboardStatement("DROP TABLE Metric", [](bool, const std::optional<SQLiteError>&) {});
  settle();
  tap("exportButton");
  pass(500ms);
  chooses(1);
  EXPECT_TRUE(isShown("exportLoading"));
  EXPECT_EQ(text("loadingLabel"), "Gathering metrics from database");
  pass(10s);
  EXPECT_TRUE(isShown("exportLoading"));
  EXPECT_FALSE(isShown("fileNameField"));
  tap("closeButton");
  pass(500ms);
  EXPECT_FALSE(isShown("exportLoading"));
}

}  // namespace
}  // namespace quorl
