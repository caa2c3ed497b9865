#include "app/HardwareManager.h"

#include <memory>
#include <mutex>

#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

constexpr char kUnknown[] = "unknown";
constexpr char kTabletClass[] = "Tabrin";
constexpr char kPhoneClass[] = "Quillo";
constexpr char kIceConfigFileName[] = "Quorl1";
constexpr char kMavConfigFileName[] = "Quorl2";
constexpr std::int32_t kIceTriggerID = 8323091;
constexpr std::int32_t kMavTriggerID = 5202011;

std::mutex sharedMutex;
std::unique_ptr<HardwareManager> sharedInstance;  // guarded by sharedMutex

}  // namespace

HardwareException::HardwareException(HardwareError error)
    : std::runtime_error("unableToGetBasebandInfo"), error_(error) {}

HardwareManager& HardwareManager::shared() {
  const std::lock_guard lock(sharedMutex);
  if (!sharedInstance) sharedInstance = std::make_unique<HardwareManager>();
  return *sharedInstance;
}

void HardwareManager::resetShared() {
  const std::lock_guard lock(sharedMutex);
  sharedInstance.reset();
}

HardwareManager::HardwareManager() {
  DeviceProperties& properties = Platform::current().deviceProperties;
  isInternalBuild_ = properties.boolean("InternalBuild");
  isCarrierBuild_ = properties.boolean("CarrierInstallCapability");
  isInternalOrCarrierBuild_ = isInternalBuild_ || isCarrierBuild_;
  basebandChipset_ = properties.text("BasebandChipset").value_or(kUnknown);
  const std::string deviceClass = properties.text("DeviceClass").value_or(kUnknown);
  isMavDevice_ = basebandChipset_.find("mav") != std::string::npos;
  isIceDevice_ = basebandChipset_.find("ice") != std::string::npos;
  deviceClass_ = deviceClass == kTabletClass ? kTabletClass : kPhoneClass;
  generalLog.log(
      "Hardware manager - init - basebandchipset: %{public}@ - deviceClass: %{public}@ - isMavDevice: %{public}d",
      basebandChipset_, deviceClass_, isMavDevice_);
  deviceConfigFileName_ = isIceDevice_ ? kIceConfigFileName : kMavConfigFileName;
  metricTriggerID_ = isIceDevice_ ? kIceTriggerID : kMavTriggerID;
  carrierObservation_ = NotificationCenter::defaultCenter().observe(
      notification::kCarrierUpdate, [this](const Notification& update) { processCarriers(update); });
  const bool isSondrelAvailable = properties.hasClass("Sondrel");
  sondrelLog.log("Base view controller - is sondrel available %{public}s", isSondrelAvailable ? "TRUE" : "FALSE");
  isSondrelCompatible_ = isSondrelAvailable && isMavDevice_ && isInternalOrCarrierBuild_;
}

void HardwareManager::validateBaseband() const {
  if (basebandChipset_ != kUnknown) return;
  generalLog.log("Hardware manager - init - unknown chipset: %{public}@ - deviceClass: %{public}@ throwing error",
                 basebandChipset_, deviceClass_);
  throw HardwareException(HardwareError::unableToGetBasebandInfo);
}

void HardwareManager::processCarriers(const Notification& notification) {
  if (const auto* carriers = notification.entry<std::vector<CarrierInfoObject>>(notification::kCarriersKey))
    carriers_ = *carriers;
}

}  // namespace quorl
