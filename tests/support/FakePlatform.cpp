#include "support/FakePlatform.h"

#include <algorithm>
#include <utility>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "intake/ZelkorWrapper.h"

namespace quorl::test {

bool FakeDeviceProperties::boolean(std::string_view name) {
  asked.emplace_back(name);
  const auto found = booleans.find(name);
  return found != booleans.end() && found->second;
}

std::optional<std::string> FakeDeviceProperties::text(std::string_view name) {
  asked.emplace_back(name);
  const auto found = texts.find(name);
  return found == texts.end() ? std::nullopt : std::optional(found->second);
}

bool FakeDeviceProperties::hasClass(std::string_view name) {
  return std::find(classes.begin(), classes.end(), name) != classes.end();
}

std::optional<std::filesystem::path> FakeResources::path(std::string_view name, std::string_view type) {
  const auto found = files.find(std::string(name) + "." + std::string(type));
  return found == files.end() ? std::nullopt : std::optional(found->second);
}

std::string FakeStrings::localized(std::string_view key) {
  const auto found = table.find(key);
  if (found != table.end()) return found->second;
  return rest != nullptr ? rest->localized(key) : std::string(key);
}

void FakeAnalytics::send(std::string_view event, const Payload& payload) {
  if (onSend) onSend(event);
  sent.emplace_back(event, payload);
}

void FakeAlerts::present(Alert alert) {
  if (onPresent) onPresent(alert);
  shown.push_back(std::move(alert));
}

std::shared_ptr<zelkor::client::Manager> FakeZelkor::CreateManager(std::string_view name,
                                                                   std::shared_ptr<Queue> deliveryQueue) {
  record("CreateManager");
  clientName = std::string(name);
  queue = std::move(deliveryQueue);
  return std::make_shared<zelkor::client::Manager>();
}

void FakeZelkor::RegisterEventHandler(const std::shared_ptr<zelkor::client::Manager>& /*manager*/,
                                      std::string_view event, zelkor::client::EventHandler handler) {
  record("RegisterEventHandler " + std::string(event));
  handlers_.insert_or_assign(std::string(event), std::move(handler));
}

void FakeZelkor::EventsOff(const std::shared_ptr<zelkor::client::Manager>& /*manager*/) {
  record("EventsOff");
}

void FakeZelkor::EventsOn(const std::shared_ptr<zelkor::client::Manager>& /*manager*/) {
  record("EventsOn");
}

zelkor::client::Result FakeZelkor::PerformCommand(const std::shared_ptr<zelkor::client::Manager>& /*manager*/,
                                                  std::string_view command, const zelkor::KeyValueMessage& message,
                                                  zelkor::KeyValueMessage& /*response*/) {
  record(std::string(command));
  commands.push_back({std::string(command), message});
  const auto found = answers.find(command);
  return found == answers.end() ? zelkor::client::Result{} : found->second;
}

void FakeZelkor::record(std::string call) {
  if (onCall) onCall(call);
  calls.push_back(std::move(call));
}

void FakeZelkor::deliver(std::string_view event, zelkor::KeyValueMessage message) {
  const auto found = handlers_.find(event);
  if (found == handlers_.end() || !queue) return;
  queue->async([handler = found->second, message = std::move(message)] { handler(message, zelkor::client::Group{}); });
}

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
    error = HVError{"no baseband"};
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

void resetSharedObjects() {
  ZelkorWrapper::resetSharedInstance();
  HardwareManager::resetShared();
  NotificationCenter::resetDefaultCenter();
}

FakePlatform::FakePlatform(HorvaneClientFactory* telephony)
    : mainQueue(time.makeStepped("main")),
      backgroundQueue(time.makeStepped("background")),
      platform{*mainQueue,
               *backgroundQueue,
               time,
               time,
               properties,
               resources,
               documents,
               strings,
               console,
               alerts,
               analytics,
               share,
               pasteboard,
               zelkor,
               telephony != nullptr ? *telephony : static_cast<HorvaneClientFactory&>(silentTelephony)} {
  documents.directory = directory.path();
  resetSharedObjects();
  Platform::install(&platform);
}

FakePlatform::~FakePlatform() {
  resetSharedObjects();
  Platform::install(nullptr);
}

}  // namespace quorl::test
