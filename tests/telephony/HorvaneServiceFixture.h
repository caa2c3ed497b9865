#pragma once

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "shell/LogCategories.h"
#include "shell/NotificationNames.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "telephony/FakeStore.h"
#include "telephony/FakeTelephony.h"
#include "telephony/HorvaneService.h"

namespace quorl::test {

/// A phone on virtual time with the service in it.
class HorvaneServiceTest : public ::testing::Test {
 protected:
  HorvaneServiceTest() { telephony.worker = platform.time.makeStepped("telephony"); }

  static HVCellInfo cellOf(HVCellDictionary dictionary) {
    HVCellInfo info;
    info.legacyInfo.emplace().emplace_back(std::move(dictionary));
    return info;
  }

  void internalBuild() { platform.properties.booleans["InternalBuild"] = true; }

  /// A SIM whose carrier, cell and signal are known.
  void insertSim(HVSubscriptionSlot slot, const std::string& carrier) {
    setPresence(slot, true);
    telephony.providers->insert_or_assign(simSlotKeyForSlot(slot), HVCarrier{carrier});
    telephony.slots[slot].cell = cellOf({{"kHVCellMonitorTAC", std::int64_t{100 + slot}}});
    telephony.slots[slot].measurements = HVSignalStrengthMeasurements{-90 - slot, "rsrp " + std::to_string(-90 - slot)};
  }

  void removeSim(HVSubscriptionSlot slot) { setPresence(slot, false); }

  /// Makes the service and lets everything that follows from it happen.
  void start() {
    service = HorvaneService::make(store);
    settle();
  }

  void settle() { platform.time.settle(); }

  void activate() {
    NotificationCenter::defaultCenter().post(notification::kDidBecomeActive);
    settle();
  }

  void monitor(HVSubscriptionSlot slot, bool isSimPresent, HVCellInfo info) {
    telephony.tell([=](HorvaneClientDelegate& delegate) {
      delegate.cellMonitorUpdate(HVServiceSubscriptionContext(slot, isSimPresent), info);
    });
    settle();
  }
  void monitor(HVSubscriptionSlot slot, bool isSimPresent) {
    monitor(slot, isSimPresent, telephony.slots[slot].cell.value_or(HVCellInfo{}));
  }

  HardwareManager& hardware() { return HardwareManager::shared(); }

  /// The carriers that the last "carrierUpdate" told of.
  const std::vector<CarrierInfoObject>& carriers() const { return updates.back(); }
  std::vector<HVSubscriptionSlot> slots() const {
    std::vector<HVSubscriptionSlot> result;
    for (const CarrierInfoObject& record : carriers()) result.push_back(record.simSlot);
    return result;
  }

  std::size_t calls(const std::string& name) const {
    return static_cast<std::size_t>(std::count(telephony.calls.begin(), telephony.calls.end(), name));
  }
  std::size_t errors(const std::string& text) const {
    const auto lines = log.lines();
    return static_cast<std::size_t>(
        std::count(lines.begin(), lines.end(), LogLine{log_category::kHorvaneService, LogLevel::Error, text}));
  }
  bool logged(const std::string& text) const {
    return log.has(LogLine{log_category::kHorvaneService, LogLevel::Default, text});
  }

  FakeTelephony telephony;
  FakePlatform platform{&telephony};
  LogRecorder log;
  FakeStore store{*platform.mainQueue};
  std::shared_ptr<HorvaneService> service;

  // Everything that was posted, and whether all of it came on the main queue.
  std::vector<std::string> posted;
  std::vector<std::vector<CarrierInfoObject>> updates;
  std::vector<Metric> newMetrics;
  bool allOnMain = true;

 private:
  void setPresence(HVSubscriptionSlot slot, bool isPresent) {
    if (!telephony.subscriptions) telephony.subscriptions.emplace().subscriptions.emplace();
    auto& contexts = *telephony.subscriptions->subscriptions;
    std::erase_if(contexts, [&](const auto& context) { return context.slotID() == slot; });
    contexts.emplace_back(slot, isPresent);
    std::sort(contexts.begin(), contexts.end(),
              [](const auto& left, const auto& right) { return left.slotID() < right.slotID(); });
  }

  void heard(const Notification& notification) {
    posted.push_back(notification.name);
    allOnMain = allOnMain && platform.mainQueue->isCurrent();
    if (const auto* list = notification.entry<std::vector<CarrierInfoObject>>(notification::kCarriersKey))
      updates.push_back(*list);
    if (const auto* row = notification.entry<Metric>(notification::kMetricObjectKey)) newMetrics.push_back(*row);
  }
  NotificationCenter::Observation observe(const char* name) {
    return NotificationCenter::defaultCenter().observe(name, [this](const Notification& n) { heard(n); });
  }

  NotificationCenter::Observation carrierUpdates_ = observe(notification::kCarrierUpdate);
  NotificationCenter::Observation selections_ = observe(notification::kSubsIdSelectionChange);
  NotificationCenter::Observation metrics_ = observe(notification::kNewHVMetric);
};

}  // namespace quorl::test
