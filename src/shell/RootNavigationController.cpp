#include "shell/RootNavigationController.h"

#include <chrono>
#include <utility>

#include "app/HardwareManager.h"
#include "intake/MetricChannel.h"
#include "intake/MetricService.h"
#include "intake/ZelkorWrapper.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "store/PersistanceStore.h"

namespace quorl {
namespace {

constexpr std::chrono::seconds kFirstRefreshDelay{10};

}  // namespace

std::shared_ptr<RootNavigationController> RootNavigationController::make(std::shared_ptr<PersistanceStore> store,
                                                                         std::shared_ptr<BaseViewController> root) {
  return std::shared_ptr<RootNavigationController>(new RootNavigationController(std::move(store), std::move(root)));
}

RootNavigationController::RootNavigationController(std::shared_ptr<PersistanceStore> store,
                                                   std::shared_ptr<BaseViewController> root)
    : persistanceStore_(std::move(store)), rootScreen_(std::move(root)) {
  startMetricChannel();
  tint_ = "ButtonSelected";
  barTint_ = "Background";
}

RootNavigationController::~RootNavigationController() {
  appUiLog.error("root navigation vc deinit called");
}

void RootNavigationController::startMetricChannel() {
  const HardwareManager& hardware = HardwareManager::shared();
  const auto path = metric_channel::configurationPath(hardware);
  if (!path) {
    metricRelatedLog.error("Metric Log File path doesn't exist");
    return;
  }
  ZelkorWrapper& wrapper = persistanceStore_->metricService().zelkorShared();
  if (!wrapper.addVexilConfigForAppId(metric_channel::kAppId, *path)) return;
  wrapper.listen();
  metric_channel::requestSnapshot(wrapper, hardware);
  metricRelatedLog.log("successfully started listening Zelkor %{public}s config name", hardware.deviceConfigFileName());
}

void RootNavigationController::viewDidLoad() {
  metricRelatedLog.log("device type: %{public}s", HardwareManager::shared().isIceDevice() ? "ice" : "mav");
  Platform::current().mainQueue.asyncAfter(kFirstRefreshDelay, [weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->refreshMetrics();
  });
}

void RootNavigationController::refreshMetrics() {
  metric_channel::requestSnapshot(persistanceStore_->metricService().zelkorShared(), HardwareManager::shared());
}

}  // namespace quorl
