#pragma once

#include <memory>
#include <mutex>
#include <string_view>
#include <vector>

#include "platform/ZelkorClient.h"

namespace quorl::simulator {

/// Codes with which the simulated baseband manager answers a command. 0 is success.
enum class CommandCode {
  Success = 0,
  ForeignManager = 1,        // the handle was not made by this library
  UnknownCommand = 2,        // no command of that name
  MissingKey = 3,            // a key that the command must carry is not there
  UnexpectedKey = 4,         // a key that the command does not carry
  WrongType = 5,             // a value of another type than the key's
  UnknownApplication = 6,    // an application id other than 2
  UnknownPayloadType = 7,    // a payload type other than 0
  EmptyConfiguration = 8,    // a configuration without content
  MissingConfiguration = 9,  // a query while no configuration is added
};

/// A baseband manager in this process, behind the same five operations as the device's own.
///
/// It checks every command key by key and says what is wrong. It makes no events of its own: the host hands them in
/// with `deliver`. A client gets an event only while it has a configuration and its events are on, so playing starts
/// with the first and ends when either goes. It does not look into a configuration, and delivers whatever it is given.
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

  /// Queues one event for every client that may have it now. False when there is none; the event is gone then.
  bool deliver(std::string_view event, const zelkor::KeyValueMessage& message);

 private:
  class Client;

  std::mutex mutex_;
  std::vector<std::weak_ptr<Client>> clients_;  // guarded by mutex_
};

}  // namespace quorl::simulator
