#include <cerrno>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <unistd.h>

#include "hosts/simulator/SimulatedPhone.h"
#include "hosts/simulator/UsableDocuments.h"
#include "support/FakePlatform.h"
#include "support/SteppedQueue.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator {
namespace {

namespace fs = std::filesystem;

TEST(TrackedQueue, IsAtRestWhenTheLastTaskHasEnded) {
  test::VirtualTime time;
  int rests = 0;
  const auto activity = std::make_shared<Activity>([&rests] { ++rests; });
  TrackedQueue first(time.makeSerialQueue("first"), activity);
  TrackedQueue second(time.makeSerialQueue("second"), activity);
  EXPECT_TRUE(activity->isAtRest());
  bool wasAtRestInTask = true;
  first.async([&] { second.async([&] { wasAtRestInTask = activity->isAtRest(); }); });
  EXPECT_FALSE(activity->isAtRest());
  time.settle();
  EXPECT_TRUE(activity->isAtRest());
  EXPECT_FALSE(wasAtRestInTask);
  EXPECT_EQ(rests, 1) << "a task that queues another leaves no gap";
}

TEST(TrackedQueue, CountsATaskThatWaitsForItsTimeOnlyWhenItIsDue) {
  test::VirtualTime time;
  int rests = 0;
  const auto activity = std::make_shared<Activity>([&rests] { ++rests; });
  TrackedQueue queue(time.makeSerialQueue("queue"), activity);
  bool hasRun = false;
  queue.asyncAfter(std::chrono::seconds(10), [&] { hasRun = !activity->isAtRest(); });
  EXPECT_TRUE(activity->isAtRest());
  time.advance(std::chrono::seconds(10));
  EXPECT_TRUE(hasRun);
  EXPECT_EQ(rests, 1);
}

TEST(TrackedQueue, IsNotAtRestBeforeWhatATaskHoldsHasGone) {
  test::VirtualTime time;
  const auto activity = std::make_shared<Activity>([] {});
  TrackedQueue queue(time.makeSerialQueue("queue"), activity);
  bool wasAtRest = true;
  queue.async([held = std::shared_ptr<void>(new int(0), [&](void* value) {
                 delete static_cast<int*>(value);
                 wasAtRest = activity->isAtRest();
               })] {});
  time.settle();
  EXPECT_FALSE(wasAtRest);
}

class SimulatedPhoneTest : public testing::Test {
 protected:
  test::TemporaryDirectory directory;
  SimulatedPhone phone{{{}, directory.path() / "documents", {directory.path()}}};
};

TEST_F(SimulatedPhoneTest, WaitsForWorkThatWandersBetweenItsQueues) {
  Platform& platform = Platform::current();
  const auto worker = platform.queues.makeSerialQueue("worker");
  int turns = 0;
  std::function<void()> onMain = [&] {
    EXPECT_TRUE(platform.mainQueue.isCurrent());
    if (++turns < 500) worker->async([&] { platform.mainQueue.async(onMain); });
  };
  for (int round = 1; round <= 3; ++round) {
    turns = 0;
    platform.mainQueue.async(onMain);
    phone.runUntilAtRest();
    EXPECT_EQ(turns, 500);
  }
}

TEST_F(SimulatedPhoneTest, DoesNotWaitForWhatIsPlannedForLater) {
  bool hasRun = false;
  Platform::current().mainQueue.asyncAfter(std::chrono::hours(1), [&] { hasRun = true; });
  phone.runUntilAtRest();
  EXPECT_FALSE(hasRun);
}

TEST_F(SimulatedPhoneTest, IsThePlatformWhileItLives) {
  EXPECT_EQ(&Platform::current().zelkor, &phone.baseband());
  EXPECT_EQ(&Platform::current().documents, &phone.documents());
}

TEST(DescribedDevice, AnswersWhatItWasToldAndNothingElse) {
  DescribedDevice told({"mav20", "Tabrin", true, false, {"Sondrel"}});
  EXPECT_EQ(told.text("BasebandChipset"), "mav20");
  EXPECT_EQ(told.text("DeviceClass"), "Tabrin");
  EXPECT_EQ(told.text("SomethingElse"), std::nullopt);
  EXPECT_TRUE(told.boolean("InternalBuild"));
  EXPECT_FALSE(told.boolean("CarrierInstallCapability"));
  EXPECT_FALSE(told.boolean("SomethingElse"));
  EXPECT_TRUE(told.hasClass("Sondrel"));
  EXPECT_FALSE(told.hasClass("sondrel"));

  DescribedDevice silent({});
  EXPECT_EQ(silent.text("BasebandChipset"), std::nullopt);
  EXPECT_EQ(silent.text("DeviceClass"), std::nullopt);
  EXPECT_TRUE(DescribedDevice({{}, {}, false, true, {}}).boolean("CarrierInstallCapability"));
}

TEST(ResourceDirectories, AnswerTheFirstFileOfThatNameAndType) {
  const test::TemporaryDirectory first;
  const test::TemporaryDirectory second;
  std::ofstream(second.path() / "Quorl1.deviceconfig") << "x";
  ResourceDirectories resources({first.path() / "missing", first.path(), second.path()});
  EXPECT_EQ(resources.path("Quorl1", "deviceconfig"), second.path() / "Quorl1.deviceconfig");
  EXPECT_EQ(resources.path("Quorl2", "deviceconfig"), std::nullopt);
  std::ofstream(first.path() / "Quorl1.deviceconfig") << "y";
  EXPECT_EQ(resources.path("Quorl1", "deviceconfig"), first.path() / "Quorl1.deviceconfig");
  fs::create_directory(first.path() / "Quorl2.deviceconfig");
  EXPECT_EQ(resources.path("Quorl2", "deviceconfig"), std::nullopt) << "a directory is no resource";
}

/// To the superuser everything is permitted; while this lives, the process is not.
class OrdinaryUser {
 public:
  OrdinaryUser() { EXPECT_TRUE(!isSuperuser_ || ::seteuid(kNobody) == 0); }
  ~OrdinaryUser() { EXPECT_TRUE(!isSuperuser_ || ::seteuid(0) == 0); }
  OrdinaryUser(const OrdinaryUser&) = delete;
  OrdinaryUser& operator=(const OrdinaryUser&) = delete;

 private:
  static constexpr uid_t kNobody = 65534;

  const bool isSuperuser_ = ::geteuid() == 0;
};

TEST(FixedDocumentsDirectory, IsMadeForItsUserAlone) {
  const test::TemporaryDirectory directory;
  const fs::path wanted = directory.path() / "new" / "documents";
  EXPECT_EQ(FixedDocumentsDirectory(wanted).path(), wanted);
  EXPECT_EQ(fs::status(wanted).permissions(), fs::perms(0700));
  const fs::path withSlash = directory.path() / "other" / "";
  EXPECT_EQ(FixedDocumentsDirectory(withSlash).path(), withSlash);
  EXPECT_EQ(fs::status(withSlash).permissions(), fs::perms(0700));
}

TEST(FixedDocumentsDirectory, ThatIsThereKeepsItsPermissions) {
  const test::TemporaryDirectory directory;
  fs::permissions(directory.path(), fs::perms(0750));
  EXPECT_EQ(FixedDocumentsDirectory(directory.path()).path(), directory.path());
  EXPECT_EQ(fs::status(directory.path()).permissions(), fs::perms(0750));
}

TEST(FixedDocumentsDirectory, ThatCannotBeMadeIsNone) {
  const test::TemporaryDirectory directory;
  std::ofstream(directory.path() / "file") << "x";
  for (const fs::path& path : {directory.path() / "file", directory.path() / "file" / "below"}) {
    EXPECT_EQ(FixedDocumentsDirectory(path).path(), std::nullopt);
    EXPECT_EQ(errno, ENOTDIR) << path;
  }
}

TEST(FixedDocumentsDirectory, ThatMayNotBeMadeSaysSo) {
  const test::TemporaryDirectory directory;
  fs::permissions(directory.path(), fs::perms(0555));
  const OrdinaryUser user;
  for (const fs::path& path : {directory.path() / "documents", directory.path() / "new" / "documents"}) {
    EXPECT_EQ(FixedDocumentsDirectory(path).path(), std::nullopt);
    EXPECT_EQ(errno, EACCES) << path;
  }
}

TEST(PrepareDocuments, MakesAMissingFolderAndLeavesNothingInIt) {
  const test::TemporaryDirectory directory;
  const fs::path documents = directory.path() / "new" / "documents";
  EXPECT_TRUE(prepareDocuments(documents));
  EXPECT_TRUE(fs::is_directory(documents));
  EXPECT_TRUE(fs::is_empty(documents));
}

TEST(PrepareDocuments, TellsWhyAStoreCannotLiveThere) {
  const test::TemporaryDirectory directory;
  std::ofstream(directory.path() / "file") << "x";
  const auto noFolder = prepareDocuments(directory.path() / "file");
  ASSERT_FALSE(noFolder);
  EXPECT_EQ(noFolder.error(), (directory.path() / "file").string() + ": Not a directory");
  const fs::path database = directory.path() / "metricPartV11.sqlite";
  std::ofstream(database) << "this is a text and long enough not to be taken for an empty database, whatever it says";
  const auto noDatabase = prepareDocuments(directory.path());
  ASSERT_FALSE(noDatabase);
  EXPECT_EQ(noDatabase.error(), database.string() + ": file is not a database");
}

TEST(PrepareDocuments, TellsOfAFolderThatCannotBeWritten) {
  const test::TemporaryDirectory directory;
  fs::permissions(directory.path(), fs::perms(0555));
  const OrdinaryUser user;
  const auto prepared = prepareDocuments(directory.path());
  ASSERT_FALSE(prepared);
  EXPECT_EQ(prepared.error(), directory.path().string() + ": Permission denied");
}

TEST(GettextStrings, AnswerTheKeyWithoutATranslation) {
  GettextStrings strings({});
  EXPECT_EQ(strings.localized("Serving Cell Info"), "Serving Cell Info");
  EXPECT_EQ(strings.localized(""), "");
}

TEST(PrintedAlerts, PrintTheDialogAndPressItsButtonLater) {
  test::VirtualTime time;
  const auto queue = time.makeStepped("main");
  test::FakeConsole console;
  PrintedAlerts alerts(console, *queue);
  int presses = 0;
  alerts.present({"Title", "Message.", "Done", [&presses] { ++presses; }});
  EXPECT_EQ(console.lines, std::vector<std::string>{"Title: Message. [Done]"});
  EXPECT_EQ(presses, 0);
  time.settle();
  EXPECT_EQ(presses, 1);
  alerts.present({"Title", "Message.", "Done", {}});
  time.settle();
  EXPECT_EQ(presses, 1);
}

TEST(KeptShare, KeepsTheTextThatWasSharedLast) {
  KeptShare share;
  EXPECT_EQ(share.text(), std::nullopt);
  share.share({"", [](const SharedText::Sink& sink) { sink("one"); }});
  share.share({"", [](const SharedText::Sink& sink) { sink("two"); }});
  EXPECT_EQ(share.text(), "two");
}

TEST(KeptPasteboard, KeepsTheTextThatWasCopiedLast) {
  KeptPasteboard pasteboard;
  pasteboard.setText("one");
  pasteboard.setText("two");
  EXPECT_EQ(pasteboard.text(), "two");
}

}  // namespace
}  // namespace quorl::simulator
