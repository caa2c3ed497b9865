#include <algorithm>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"
#include "telephony/CarrierNameSegmentView.h"
#include "telephony/HorvaneMetricDetails.h"
#include "telephony/HorvaneViewModel.h"

namespace quorl::test {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;

CarrierInfoObject sim(HVSubscriptionSlot slot, std::string name, bool isPresent = true) {
  CarrierInfoObject record;
  record.carrierName = std::move(name);
  record.simSlot = slot;
  record.isSimPresent = isPresent;
  record.simSlotKey = simSlotKeyForSlot(slot);
  return record;
}

Notification carrierUpdate(std::vector<CarrierInfoObject> carriers) {
  return {notification::kCarrierUpdate, std::make_shared<const Notification::UserInfo>(
                                            Notification::UserInfo{{notification::kCarriersKey, std::move(carriers)}})};
}

/// The shell's root model with a bar on it.
class CarrierBarTest : public ::testing::Test {
 protected:
  void update(std::vector<CarrierInfoObject> carriers) {
    updateFromCarrierNotification(carrierUpdate(std::move(carriers)), root.get());
  }
  void press(std::size_t index) { bar.tabButtons().at(index).press(); }

  std::vector<std::string> titles() const {
    std::vector<std::string> result;
    for (const TabButton& tab : bar.tabButtons()) result.push_back(tab.title());
    return result;
  }
  std::vector<bool> lit() const {
    std::vector<bool> result;
    for (const TabButton& tab : bar.tabButtons()) result.push_back(tab.isSelected());
    return result;
  }
  std::vector<std::string> descriptions() const {
    std::vector<std::string> result;
    for (const auto& entry : root->carriers()) result.push_back(entry->description());
    return result;
  }

  FakePlatform platform;
  HardwareManager& hardware = HardwareManager::shared();
  std::shared_ptr<HorvaneViewModel> root = std::make_shared<HorvaneViewModel>();
  CarrierNameSegmentView bar{root};
  std::vector<std::int32_t> selections;
  NotificationCenter::Observation selection = NotificationCenter::defaultCenter().observe(
      notification::kSubsIdSelectionChange, [this](const Notification& posted) {
        EXPECT_FALSE(posted.userInfo);
        selections.push_back(hardware.currentSubsId());
      });
};

TEST_F(CarrierBarTest, RootBeginsWithoutNameSimAndCarriers) {
  EXPECT_EQ(root->description(), "(, false, 0)");
  EXPECT_THAT(root->carriers(), IsEmpty());
  EXPECT_THAT(root->carrierCurrentSubsIdMap(), IsEmpty());
  EXPECT_NE(root->id(), HorvaneViewModel().id());
}

TEST_F(CarrierBarTest, RecordsWithASimBecomeEntriesInOrder) {
  update({sim(2, "Testnet Two"), sim(1, "Testnet None", false), sim(1, "Testnet One")});
  EXPECT_THAT(descriptions(), ElementsAre("(Testnet Two, true, 1)", "(Testnet One, true, 0)"));
  EXPECT_THAT(root->carrierCurrentSubsIdMap(), ElementsAre(Pair("Testnet One", 0), Pair("Testnet Two", 1)));
  EXPECT_NE(root->carriers()[0]->id(), root->carriers()[1]->id());
}

TEST_F(CarrierBarTest, SlotKeyDecidesTheSubscription) {
  CarrierInfoObject odd = sim(1, "Testnet Odd");
  odd.simSlotKey = "something else";
  update({odd});
  EXPECT_THAT(descriptions(), ElementsAre("(Testnet Odd, true, 1)"));
}

TEST_F(CarrierBarTest, NotificationWithoutCarriersIsIgnored) {
  update({sim(1, "Testnet One")});
  updateFromCarrierNotification({notification::kCarrierUpdate, nullptr}, root.get());
  updateFromCarrierNotification(
      {notification::kCarrierUpdate, std::make_shared<const Notification::UserInfo>(
                                         Notification::UserInfo{{notification::kCarriersKey, std::string("text")}})},
      root.get());
  EXPECT_THAT(titles(), ElementsAre("Testnet One"));
}

TEST_F(CarrierBarTest, NotificationWhileThereIsNoRootIsIgnored) {
  updateFromCarrierNotification(carrierUpdate({sim(1, "Testnet One")}), nullptr);
  EXPECT_THAT(titles(), IsEmpty());
}

TEST_F(CarrierBarTest, UpdateCopiesEntriesWithTheirIdentityAndLeavesOutThoseWithoutASim) {
  const auto entry = std::make_shared<const HorvaneViewModel>("Testnet One", true, 0, Uuid::make());
  const auto absent = std::make_shared<const HorvaneViewModel>("Testnet None", false, 1, Uuid::make());
  root->update({entry, absent});
  ASSERT_EQ(root->carriers().size(), 1U);
  EXPECT_NE(root->carriers()[0], entry);
  EXPECT_EQ(root->carriers()[0]->id(), entry->id());
  EXPECT_THAT(root->carrierCurrentSubsIdMap(), ElementsAre(Pair("Testnet One", 0)));
}

TEST_F(CarrierBarTest, UpdateAnnouncesTheEmptyingAndEachEntry) {
  update({sim(1, "Testnet Old")});
  std::vector<std::size_t> seen;
  const auto observation = root->observeChanges([&] { seen.push_back(root->carriers().size()); });
  update({sim(1, "Testnet One"), sim(2, "Testnet Two")});
  EXPECT_THAT(seen, ElementsAre(0, 1, 2));
}

TEST_F(CarrierBarTest, ObservationEndsWithItsHandle) {
  int seen = 0;
  {
    const auto observation = root->observeChanges([&] { ++seen; });
  }
  update({sim(1, "Testnet One")});
  EXPECT_EQ(seen, 0);
}

TEST_F(CarrierBarTest, NoSimEmptiesTheBarAndTheMapKeepsItsLines) {
  update({sim(1, "Testnet One")});
  update({});
  EXPECT_THAT(titles(), IsEmpty());
  EXPECT_THAT(root->carrierCurrentSubsIdMap(), ElementsAre(Pair("Testnet One", 0)));
}

TEST_F(CarrierBarTest, SingleSimIsLitFromTheStartAndTheBarSelectsNothing) {
  hardware.setCurrentSubsId(1);
  update({sim(2, "Testnet Two")});
  EXPECT_THAT(lit(), ElementsAre(true));
  EXPECT_EQ(bar.tab(), "");
  EXPECT_EQ(hardware.currentSubsId(), 1);
  EXPECT_THAT(selections, IsEmpty());
}

TEST_F(CarrierBarTest, FirstTabIsLitUntilAnotherIsPressed) {
  update({sim(1, "Testnet One"), sim(2, "Testnet Two")});
  EXPECT_THAT(lit(), ElementsAre(true, false));
  press(1);
  EXPECT_THAT(lit(), ElementsAre(false, true));
  EXPECT_EQ(hardware.currentSubsId(), 1);
}

TEST_F(CarrierBarTest, PressTakesItsStepsInOrderSoThatListenersStillSeeTheOldTitle) {
  update({sim(1, "Testnet One"), sim(2, "Testnet Two")});
  hardware.setTabSelectedTitle("Testnet One");
  std::vector<std::string> steps;
  const auto bars = bar.observeChanges(
      [&] { steps.push_back("bar shows " + bar.tab() + ", subs " + std::to_string(hardware.currentSubsId())); });
  const auto posts =
      NotificationCenter::defaultCenter().observe(notification::kSubsIdSelectionChange, [&](const Notification&) {
        steps.push_back("posted, subs " + std::to_string(hardware.currentSubsId()) + ", title " +
                        hardware.tabSelectedTitle());
      });
  press(1);
  EXPECT_THAT(steps, ElementsAre("bar shows Testnet Two, subs 0", "posted, subs 1, title Testnet One"));
  EXPECT_EQ(hardware.tabSelectedTitle(), "Testnet Two");
}

TEST_F(CarrierBarTest, PressOfASelectedTabGoesThroughAllStepsAgain) {
  update({sim(1, "Testnet One"), sim(2, "Testnet Two")});
  press(1);
  hardware.setCurrentSubsId(0);
  hardware.setTabSelectedTitle("");
  press(1);
  EXPECT_THAT(selections, ElementsAre(1, 1));
  EXPECT_EQ(hardware.tabSelectedTitle(), "Testnet Two");
}

TEST_F(CarrierBarTest, TabWithoutATitleChoosesByItsEntryAndNotByTheMap) {
  update({sim(2, "")});
  update({sim(1, ""), sim(2, "")});
  EXPECT_THAT(root->carrierCurrentSubsIdMap(), ElementsAre(Pair("", 1)));
  press(0);
  EXPECT_EQ(hardware.currentSubsId(), 0);
  EXPECT_EQ(hardware.tabSelectedTitle(), "");
  press(1);
  EXPECT_EQ(hardware.currentSubsId(), 1);
}

TEST_F(CarrierBarTest, CarriersOfOneNameLightUpTogetherAndBothChooseTheLaterOnesSubscription) {
  update({sim(1, "Testnet"), sim(2, "Testnet")});
  press(0);
  EXPECT_THAT(lit(), ElementsAre(true, true));
  EXPECT_EQ(hardware.currentSubsId(), 1);
  press(1);
  EXPECT_EQ(hardware.currentSubsId(), 1);
}

TEST_F(CarrierBarTest, TitleThatTheMapDoesNotKnowChoosesSubscription0) {
  hardware.setCurrentSubsId(1);
  TabButton stray(std::make_shared<SelectedTitle>(), 0, "Testnet Unknown", root);
  stray.press();
  EXPECT_EQ(hardware.currentSubsId(), 0);
}

TEST_F(CarrierBarTest, NamelessTabThatOutlivedItsCarrierLeavesTheSubscription) {
  update({sim(1, "")});
  TabButton stale = bar.tabButtons().at(0);
  update({});
  hardware.setCurrentSubsId(1);
  stale.press();
  EXPECT_THAT(selections, ElementsAre(1));
}

TEST_F(CarrierBarTest, ChosenTitleSurvivesAnUpdateOfTheCarriers) {
  update({sim(1, "Testnet One"), sim(2, "Testnet Two")});
  press(1);
  update({sim(1, "Testnet One")});
  EXPECT_EQ(bar.tab(), "Testnet Two");
  EXPECT_THAT(lit(), ElementsAre(false));
}

TEST_F(CarrierBarTest, PressMayRebuildTheBarUnderTheTab) {
  update({sim(1, "Testnet One")});
  auto tabs = bar.tabButtons();
  const auto rebuild = bar.observeChanges([&] { tabs = bar.tabButtons(); });
  const auto drop = NotificationCenter::defaultCenter().observe(notification::kSubsIdSelectionChange,
                                                                [&](const Notification&) { tabs.clear(); });
  tabs[0].press();
  EXPECT_EQ(hardware.tabSelectedTitle(), "Testnet One");
}

TEST(HorvaneMetricDetailsTest, EachBandRowIsOneCellWithItsValueAndNoSecondText) {
  std::vector<Metric> rows(2);
  rows[0].attributeName = "LTE";
  rows[0].attributeValue = "1,3";
  rows[1].attributeValue = "78";
  const HorvaneMetricDetails grid(rows, "Active Bands");
  EXPECT_EQ(grid.sectionTitle(), "Active Bands");
  ASSERT_EQ(grid.numberOfCells(), 2U);
  EXPECT_EQ(grid.cellAt(0).mainText, "1,3");
  EXPECT_EQ(grid.cellAt(1).mainText, "78");
  EXPECT_EQ(grid.cellAt(0).secondText, "");
  EXPECT_TRUE(grid.cellAt(0).isSecondTextHidden());
}

TEST(TabButtonTest, TheCapsuleSwingsALittleOverAndSettles) {
  EXPECT_EQ(TabButton::springProgress(0), 0);
  double highest = 0;
  for (double seconds = 0.01; seconds < TabButton::kSpringDurationS; seconds += 0.01)
    highest = std::max(highest, TabButton::springProgress(seconds));
  EXPECT_GT(highest, 1.005);
  EXPECT_LT(highest, 1.02);
  EXPECT_NEAR(TabButton::springProgress(TabButton::kSpringDurationS - 0.001), 1, 0.001);
  EXPECT_EQ(TabButton::springProgress(TabButton::kSpringDurationS), 1);
}

}  // namespace
}  // namespace quorl::test
