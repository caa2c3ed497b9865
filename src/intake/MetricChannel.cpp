#include "intake/MetricChannel.h"

#include "app/HardwareManager.h"
#include "intake/ZelkorWrapper.h"
#include "platform/Platform.h"

namespace quorl::metric_channel {

std::optional<std::filesystem::path> configurationPath(const HardwareManager& hardware) {
  return Platform::current().resources.path(hardware.deviceConfigFileName(), kConfigurationType);
}

bool requestSnapshot(ZelkorWrapper& wrapper, const HardwareManager& hardware) {
  return wrapper.querySpecificMetric(kAppId, kTriggerRef, kTriggerType, hardware.metricTriggerID(), kProfileID,
                                     kMetricID);
}

}  // namespace quorl::metric_channel
