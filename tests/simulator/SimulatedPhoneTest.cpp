#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "hosts/simulator/SimulatedPhone.h"
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
  EXPECT_EQ(FixedDocumentsDirectory(directory.path() / "file").path(), std::nullopt);
  EXPECT_EQ(FixedDocumentsDirectory(directory.path() / "file" / "below").path(), std::nullopt);
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
