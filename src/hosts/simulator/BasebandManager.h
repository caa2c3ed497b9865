#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <string_view>
#include <vector>

#include "hosts/simulator/CommandCode.h"
#include "platform/ZelkorClient.h"

namespace quorl::simulator {

/// A client asks for the current values of metrics: of one, or of all in its configuration.
struct SnapshotRequest {
  std::vector<std::int64_t> metrics;  // the ids it wants, in the order of its configuration
  std::int64_t triggerRef = 0;        // comes back with each event
  /// Queues one metric event for the client that asks. False when the configuration that it asked under is gone.
  std::function<bool(const zelkor::KeyValueMessage& message)> deliver;
};

/// A baseband manager in this process, behind the same five operations as the device's own.
///
/// It checks every command key by key, and a configuration too, and says what is wrong. It makes no events of its own:
/// the host hands them in. A client gets an event only while it has a configuration and its events are on, so playing
/// starts with the first and ends when either goes.
///
/// Thread-safe. A handler runs on the queue of its manager and may call the library, but must not wait for a thread
/// that does: commands that withdraw something wait for the handler at hand, so that nothing comes after them.
class BasebandManager final : public zelkor::client::Library {
 public:
  std::shared_ptr<zelkor::client::Manager> CreateManager(std::string_view clientName,
                                                         std::shared_ptr<Queue> queue) override;
  void RegisterEventHandler(const std::shared_ptr<zelkor::client::Manager>& manager, std::string_view event,
                            zelkor::client::EventHandler handler) override;
  void EventsOff(const std::shared_ptr<zelkor::client::Manager>& manager) override;
  void EventsOn(const std::shared_ptr<zelkor::client::Manager>& manager) override;
  zelkor::client::Result PerformCommand(const std::shared_ptr<zelkor::client::Manager>& manager,
                                        std::string_view command, const zelkor::KeyValueMessage& message,
                                        zelkor::KeyValueMessage& response) override;

  /// Queues one event for every client that may have it now. False when there is none; the event is gone then. What a
  /// configuration selects does not matter: a recording is what was delivered, and goes as it is.
  bool deliver(std::string_view event, const zelkor::KeyValueMessage& message);
  /// The same for a metric event that comes up by itself: only clients whose configuration lists its id get it.
  bool deliverSelected(const zelkor::KeyValueMessage& message);

  /// Who answers queries from now on; without one a query is accepted and brings nothing. Called inside the command
  /// and on its thread, once per query; it may deliver at once or later.
  void setSnapshotSource(std::function<void(SnapshotRequest request)> source);

 private:
  class Client;

  std::vector<std::shared_ptr<Client>> liveClients();

  std::mutex mutex_;
  std::function<void(SnapshotRequest)> snapshotSource_;  // guarded by mutex_
  std::vector<std::weak_ptr<Client>> clients_;           // guarded by mutex_
};

}  // namespace quorl::simulator
