#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string_view>

#include "base/Clock.h"
#include "base/Queue.h"
#include "platform/ZelkorClient.h"

namespace quorl {

/// Receives what the channel delivers, on the main thread.
class ZelkorWrapperDelegate {
 public:
  virtual ~ZelkorWrapperDelegate() = default;
  /// A trigger event, with the whole message of the channel.
  virtual void eventsDidUpdate(const zelkor::KeyValueMessage& dictionary) = 0;
  /// A metric, with those of the keys of reference, profile, app, metric id and payload that arrived.
  virtual void metricsDidUpdate(const zelkor::KeyValueMessage& dictionary) = 0;
};

/// The product's one client of the baseband manager: four wishes become commands, two kinds of event become delegate
/// calls on the main thread. It keeps no record of what the baseband manager was told.
///
/// Main thread only. Events come on the wrapper's queue and are handed over to the main queue in order of arrival.
class ZelkorWrapper {
 public:
  /// The single instance, made from the installed platform on first use.
  static ZelkorWrapper& sharedInstance();
  /// Forgets the instance and its queue; for tests, between cases. Handlers that are registered become harmless.
  static void resetSharedInstance();

  ZelkorWrapper(const ZelkorWrapper&) = delete;
  ZelkorWrapper& operator=(const ZelkorWrapper&) = delete;

  /// The serial queue on which the client library delivers; made once in a process.
  static const std::shared_ptr<Queue>& queue();

  // The three commands run before they return and answer whether the baseband manager took them. An `appId` other than
  // "quorl" answers false and sends nothing.

  /// Sends the whole content of the file as configuration. A file that cannot be read answers false and sends nothing.
  bool addVexilConfigForAppId(std::string_view appId, const std::filesystem::path& protofFilePath);
  /// Clears the configuration, and with it the subscription.
  bool removeVexilConfigForAppid(std::string_view appId);
  /// Asks for a snapshot of metrics, which arrive as metric events.
  bool querySpecificMetric(std::string_view appId, std::int32_t triggerRef, std::int32_t triggerType,
                           std::int32_t triggerID, std::int32_t profileID, std::int32_t metricID);

  /// Registers both event handlers and restarts delivery. Has no guard: it may be called again at any time.
  void listen();

  /// Null when there is none, or none any more.
  std::shared_ptr<ZelkorWrapperDelegate> delegate() const;
  /// Never kept alive by the wrapper.
  void setDelegate(std::weak_ptr<ZelkorWrapperDelegate> delegate);

 private:
  class DelegateSlot;

  ZelkorWrapper();
  zelkor::client::Result performCommand(std::string_view operation, std::string_view command,
                                        const zelkor::KeyValueMessage& message) const;

  // Constant after construction.
  zelkor::client::Library& library_;
  Queue& mainQueue_;
  const Clock& clock_;
  std::shared_ptr<zelkor::client::Manager> zelkorManager_;
  std::shared_ptr<DelegateSlot> delegate_;
};

}  // namespace quorl
