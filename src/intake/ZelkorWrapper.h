#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string_view>

#include "platform/ZelkorClient.h"

namespace quorl {

/// Receives what the channel delivers, on the main thread.
class ZelkorWrapperDelegate {
 public:
  virtual ~ZelkorWrapperDelegate() = default;
  /// A trigger event.
  virtual void eventsDidUpdate(const zelkor::KeyValueMessage& dictionary) = 0;
  /// A metric.
  virtual void metricsDidUpdate(const zelkor::KeyValueMessage& dictionary) = 0;
};

/// The product's one client of the baseband manager: four wishes become commands, two kinds of event become delegate
/// calls on the main thread. Main thread only.
class ZelkorWrapper {
 public:
  /// The single instance, made from the installed platform on first use.
  static ZelkorWrapper& sharedInstance();
  /// Forgets the instance; for tests, between cases.
  static void resetSharedInstance();

  bool addVexilConfigForAppId(std::string_view appId, const std::filesystem::path& protofFilePath);
  bool removeVexilConfigForAppid(std::string_view appId);
  bool querySpecificMetric(std::string_view appId, std::int32_t triggerRef, std::int32_t triggerType,
                           std::int32_t triggerID, std::int32_t profileID, std::int32_t metricID);
  void listen();
  std::shared_ptr<ZelkorWrapperDelegate> delegate() const;
  void setDelegate(std::weak_ptr<ZelkorWrapperDelegate> delegate);

 private:
  ZelkorWrapper();
};

}  // namespace quorl
