#include "hosts/simulator/SilentTelephony.h"

namespace quorl::simulator {
namespace {

class SilentClient final : public HorvaneClient {
 public:
  void setDelegate(std::weak_ptr<HorvaneClientDelegate> /*delegate*/) override {}
  void getSubscriptionInfo(
      std::function<void(std::optional<HVServiceSubscriptionInfo>, std::optional<HVError>)> /*completion*/) override {}
  void copyCellInfo(const HVServiceSubscriptionContext& /*context*/,
                    std::function<void(std::optional<HVCellInfo>, std::optional<HVError>)> /*completion*/) override {}
  void getSignalStrengthMeasurements(const HVServiceDescriptor& /*descriptor*/,
                                     std::function<void(std::optional<HVSignalStrengthMeasurements>,
                                                        std::optional<HVError>)> /*completion*/) override {}
  std::optional<HVBandInfo> getBandInfo(const HVServiceSubscriptionContext& /*context*/,
                                        std::optional<HVError>& error) override {
    error = HVError{"no SIM"};
    return std::nullopt;
  }
};

class SilentNetworkInfo final : public HVTelephonyNetworkInfo {
 public:
  std::optional<std::map<std::string, HVCarrier>> subscriberProviders() override { return std::nullopt; }
};

}  // namespace

std::unique_ptr<HorvaneClient> SilentTelephony::initWithQueue(Queue& /*queue*/) {
  return std::make_unique<SilentClient>();
}

std::unique_ptr<HVTelephonyNetworkInfo> SilentTelephony::networkInfo() {
  return std::make_unique<SilentNetworkInfo>();
}

}  // namespace quorl::simulator
