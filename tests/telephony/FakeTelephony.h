#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "base/Queue.h"
#include "platform/TelephonyClient.h"

namespace quorl::test {

/// A telephony client whose every answer a test sets, the odd ones included, and which keeps the order of its calls.
/// Cells and measurements answer on `worker`, which is not the main queue.
class FakeTelephony final : public HorvaneClientFactory {
 public:
  struct Slot {
    std::optional<HVCellInfo> cell;
    std::optional<HVError> cellError;
    std::optional<HVSignalStrengthMeasurements> measurements;
    std::optional<HVError> measurementsError;
    std::optional<HVBandInfo> bands;
  };

  std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) override {
    calls.emplace_back("initWithQueue " + queue.label());
    clientQueue = &queue;
    return std::make_unique<Client>(*this);
  }

  std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() override { return std::make_unique<NetworkInfo>(*this); }

  /// One call to the delegate, on the client's queue.
  void tell(std::function<void(HorvaneClientDelegate&)> call) {
    clientQueue->async([this, call = std::move(call)] {
      if (const auto live = delegate.lock()) call(*live);
    });
  }

  std::shared_ptr<Queue> worker;
  Queue* clientQueue = nullptr;
  std::weak_ptr<HorvaneClientDelegate> delegate;
  /// Such as "getSubscriptionInfo" and "copyCellInfo 1".
  std::vector<std::string> calls;
  std::optional<HVServiceSubscriptionInfo> subscriptions;
  std::optional<HVError> subscriptionsError;
  std::optional<std::map<std::string, HVCarrier>> providers = std::map<std::string, HVCarrier>();
  std::map<HVSubscriptionSlot, Slot> slots;

 private:
  class Client final : public HorvaneClient {
   public:
    explicit Client(FakeTelephony& fake) : fake_(fake) {}

    void setDelegate(std::weak_ptr<HorvaneClientDelegate> listener) override {
      fake_.calls.emplace_back("setDelegate");
      fake_.delegate = std::move(listener);
    }
    void getSubscriptionInfo(
        std::function<void(std::optional<HVServiceSubscriptionInfo>, std::optional<HVError>)> completion) override {
      fake_.calls.emplace_back("getSubscriptionInfo");
      fake_.clientQueue->async([completion = std::move(completion), info = fake_.subscriptions,
                                error = fake_.subscriptionsError] { completion(info, error); });
    }
    void copyCellInfo(const HVServiceSubscriptionContext& context,
                      std::function<void(std::optional<HVCellInfo>, std::optional<HVError>)> completion) override {
      fake_.calls.emplace_back("copyCellInfo " + std::to_string(context.slotID()));
      fake_.worker->async([completion = std::move(completion), slot = fake_.slots[context.slotID()]] {
        completion(slot.cell, slot.cellError);
      });
    }
    void getSignalStrengthMeasurements(
        const HVServiceDescriptor& descriptor,
        std::function<void(std::optional<HVSignalStrengthMeasurements>, std::optional<HVError>)> completion) override {
      fake_.calls.emplace_back("getSignalStrengthMeasurements " + std::to_string(descriptor.context().slotID()));
      fake_.worker->async([completion = std::move(completion), slot = fake_.slots[descriptor.context().slotID()]] {
        completion(slot.measurements, slot.measurementsError);
      });
    }
    std::optional<HVBandInfo> getBandInfo(const HVServiceSubscriptionContext& context,
                                          std::optional<HVError>& error) override {
      fake_.calls.emplace_back("getBandInfo " + std::to_string(context.slotID()));
      const auto& bands = fake_.slots[context.slotID()].bands;
      if (!bands) error = HVError{"no bands"};
      return bands;
    }

   private:
    FakeTelephony& fake_;
  };

  class NetworkInfo final : public HVTelephonyNetworkInfo {
   public:
    explicit NetworkInfo(FakeTelephony& fake) : fake_(fake) {}
    std::optional<std::map<std::string, HVCarrier>> subscriberProviders() override {
      fake_.calls.emplace_back("subscriberProviders");
      return fake_.providers;
    }

   private:
    FakeTelephony& fake_;
  };
};

}  // namespace quorl::test
