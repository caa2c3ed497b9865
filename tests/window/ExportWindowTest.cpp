#include <QTest>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>

#include "ScreenWindow.h"
#include "screens/export/ExportText.h"
#include "screens/export/view/SaveText.h"

namespace quorl {
namespace {

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
  /// Opens the dialog of folders, which reads them on a thread of its own.
  void browses() {
    tap("browseButton");
    pass(500ms);
  }
  /// The toolkit's own dialog, as the offscreen platform has none.
  QQuickItem* dialogButton(const QString& text) { return buttonBelow(window().contentItem(), text); }
  void choosesInDialog(const QString& name) {
    QQuickItem* folder = nullptr;
    ASSERT_TRUE(QTest::qWaitFor([&] {
      grab();
      folder = dialogButton(name);
      return folder != nullptr;
    })) << ::testing::PrintToString(texts());
    tap(folder);
    pass(300ms);
  }
  QQuickItem* buttonBelow(QQuickItem* root, const QString& text) {
    if (!root->isVisible() || root->objectName() == "saveSheetContent") return nullptr;
    const bool isNamed = root->property("text") == text || root->property("fileName") == text;
    if (isNamed && root->inherits("QQuickAbstractButton")) return root;
    for (QQuickItem* child : root->childItems())
      if (QQuickItem* button = buttonBelow(child, text)) return button;
    return nullptr;
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

TEST_F(ExportWindowTest, TheCrossThatClosesItIsThirtyByThirty) {
  launchOnExport();
  const QRectF cross = place(find("symbol", find("closeButton")));
  EXPECT_EQ(cross.size(), QSizeF(30, 30));
  EXPECT_EQ(cross.center(), place(find("closeButton")).center());
  EXPECT_GE(place(find("closeButton")).width(), 44);
  EXPECT_GE(place(find("closeButton")).height(), 44);
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

TEST_F(ExportWindowTest, AFolderWithoutItsWholePathIsRefused) {
  launchOnExport();
  chooses(0);
  for (const char* folder : {"", "saved", "./saved", "~"}) {
    SCOPED_TRACE(folder);
    view::SaveText::shared().setFolder(folder);
    saves();
    EXPECT_THAT(text("saveMessage"), HasSubstr("A folder is given by its whole path"));
  }
  EXPECT_TRUE(files().empty());
}

TEST_F(ExportWindowTest, AnErrorTellsItsReasonAndLeavesTheDialogOpen) {
  std::filesystem::create_directory(folder() / "a folder");
  std::ofstream(folder() / "a file") << "mine";
  launchOnExport();
  chooses(0);
  const QString fileName = view::SaveText::shared().fileName();
  const struct {
    std::string folder;
    QString name;
    const char* reason;
  } refused[] = {
      {folder().string() + "/missing", fileName, "No such file or directory"},
      {folder().string() + "/a file", fileName, "Not a directory"},
      {folder().string(), "a folder", "Is a directory"},
      {folder().string(), QString(300, 'n'), "File name too long"},
      {"/proc", fileName, "could not be written"},
  };
  for (const auto& [path, name, reason] : refused) {
    SCOPED_TRACE(reason);
    view::SaveText::shared().setFolder(QString::fromStdString(path));
    view::SaveText::shared().setFileName(name);
    saves();
    EXPECT_THAT(text("saveMessage"), HasSubstr(reason));
    EXPECT_THAT(text("saveMessage"), HasSubstr("The readings are kept"));
    EXPECT_TRUE(isShown("saveButton"));
    EXPECT_EQ(text("fileNameField"), name.toStdString());
  }
  EXPECT_EQ(files().size(), 2U);
  view::SaveText::shared().setFolder(QString::fromStdString(folder().string()));
  view::SaveText::shared().setFileName("at last.txt");
  saves();
  EXPECT_THAT(text("saveMessage"), HasSubstr("Saved "));
}

TEST_F(ExportWindowTest, AnErrorWhileReplacingKeepsWhatIsThere) {
  std::ofstream(folder() / "mine.txt") << "mine";
  launchOnExport();
  chooses(0);
  view::SaveText::shared().setFileName("mine.txt");
  saves();
  ASSERT_TRUE(isShown("replaceButton"));
  std::filesystem::remove(folder() / "mine.txt");
  std::filesystem::create_directory(folder() / "mine.txt");
  tap("replaceButton");
  pass(300ms);
  EXPECT_THAT(text("saveMessage"), HasSubstr("mine.txt could not be written: Is a directory."));
  EXPECT_TRUE(isShown("saveButton"));
  EXPECT_TRUE(std::filesystem::is_directory(folder() / "mine.txt"));
}

TEST_F(ExportWindowTest, TheQuestionIsAnsweredByKeyboard) {
  std::ofstream(folder() / "mine.txt") << "mine";
  launchOnExport();
  chooses(0);
  names("mine.txt");
  key(Qt::Key_Return);
  pass(300ms);
  ASSERT_TRUE(isShown("replaceButton"));
  key(Qt::Key_Escape);  // keeps it, and asks again
  pass(300ms);
  EXPECT_TRUE(isShown("saveButton"));
  EXPECT_TRUE(isShown("exportHeading"));
  EXPECT_TRUE(find("fileNameField")->hasActiveFocus());
  key(Qt::Key_Return);
  pass(300ms);
  EXPECT_TRUE(find("cancelSaveButton")->hasActiveFocus()) << "what does no harm is at hand";
  EXPECT_EQ(contents("mine.txt"), "mine");
  key(Qt::Key_Tab);
  key(Qt::Key_Return);
  pass(300ms);
  EXPECT_THAT(text("saveMessage"), HasSubstr("Saved "));
  EXPECT_TRUE(find("cancelSaveButton")->hasActiveFocus());
  key(Qt::Key_Return);
  pass(300ms);
  EXPECT_FALSE(isShown("saveMessage"));
  EXPECT_TRUE(isShown("exportHeading"));
}

TEST_F(ExportWindowTest, BrowseTakesTheFolderThatIsChosen) {
  std::filesystem::create_directory(folder() / "inside");
  launchOnExport();
  chooses(0);
  browses();
  choosesInDialog("inside");
  ASSERT_NE(dialogButton("Open"), nullptr);
  tap(dialogButton("Open"));
  pass(300ms);
  EXPECT_EQ(dialogButton("Open"), nullptr);
  EXPECT_EQ(text("folderField"), (folder() / "inside").string());
  saves();
  EXPECT_THAT(text("saveMessage"), HasSubstr((folder() / "inside").string()));
  EXPECT_FALSE(std::filesystem::is_empty(folder() / "inside"));
}

TEST_F(ExportWindowTest, ABrowseThatIsCancelledLeavesTheFolderAndMayBeginAgain) {
  std::filesystem::create_directory(folder() / "inside");
  launchOnExport();
  chooses(0);
  for (int turn = 0; turn < 2; ++turn) {
    browses();
    choosesInDialog("inside");
    ASSERT_NE(dialogButton("Cancel"), nullptr);
    tap(dialogButton("Cancel"));
    pass(300ms);
    EXPECT_EQ(dialogButton("Open"), nullptr);
    EXPECT_EQ(text("folderField"), folder().string());
  }
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
