#include "app/AppDelegate.h"

#include <utility>

#include "app/HardwareManager.h"
#include "base/FatalStop.h"
#include "intake/MetricChannel.h"
#include "intake/ZelkorWrapper.h"
#include "platform/Platform.h"
#include "shell/AnalyticsManager.h"
#include "shell/BaseViewController.h"
#include "shell/Logs.h"
#include "store/PersistanceStore.h"

namespace quorl {

bool AppDelegate::onLaunch() {
  window_ = std::make_unique<Window>();
  HardwareManager& hardware = HardwareManager::shared();
  ZelkorWrapper& wrapper = ZelkorWrapper::sharedInstance();
  auto store = std::make_shared<PersistanceStore>(hardware, wrapper);
  auto root = std::make_shared<BaseViewController>(store);
  window_->setRootViewController(RootNavigationController::make(std::move(store), std::move(root)));
  window_->makeVisible();
  generalLog.log("Appdelegate - instantiated root view controller");
  AnalyticsManager(Platform::current().analytics).sendAnalytics(AnalyticsInteractionTypes::AppLaunch, {});
  try {
    hardware.validateBaseband();
  } catch (const HardwareException&) {
    presentBasebandError();
  }
  return true;
}

void AppDelegate::onBecomeActive() {
  generalLog.log("Appdelegate - applicationDidBecomeActive");
  const HardwareManager& hardware = HardwareManager::shared();
  ZelkorWrapper& wrapper = ZelkorWrapper::sharedInstance();
  const auto path = metric_channel::configurationPath(hardware);
  if (!path) {
    metricRelatedLog.error("Metric Log File path doesn't exist");
    return;
  }
  if (!wrapper.addVexilConfigForAppId(metric_channel::kAppId, *path)) return;
  wrapper.listen();
  metric_channel::requestSnapshot(wrapper, hardware);
  metricRelatedLog.log("successfully started listening Zelkor applicationDidBecomeActive");
}

void AppDelegate::onEnterBackground() {
  generalLog.log("Appdelegate - applicationDidEnterBackground");
  withdraw();
}

void AppDelegate::onTerminate() {
  generalLog.log("Appdelegate - applicationWillTerminate");
  withdraw();
}

void AppDelegate::withdraw() {
  ZelkorWrapper::sharedInstance().removeVexilConfigForAppid(metric_channel::kAppId);
}

void AppDelegate::presentBasebandError() {
  if (!window_ || !window_->rootViewController()) return;
  Platform::current().alerts.present(
      {"Error Occured", "Unable to get baseband information. Please try again or file a bug report.", "Done", [] {
         generalLog.log("Appdelegate - error dialog - unknown baseband");
         fatalStop("unknown baseband");
       }});
}

}  // namespace quorl
