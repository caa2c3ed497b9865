#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "base/Queue.h"
#include "platform/KeyValueMessage.h"

// The baseband manager's client library, as far as the product needs it. The real one is a closed part of the target
// device; hosts without it supply the same operations.

namespace quorl::zelkor {

// Events, commands and keys. The texts of the five incoming keys are what arrives on the channel.
inline constexpr std::string_view kEventTrigger = "kEventTrigger";
inline constexpr std::string_view kEventMetric = "kEventMetric";

inline constexpr std::string_view kCommandAddConfiguration = "kCommandAddConfiguration";
inline constexpr std::string_view kCommandClearConfiguration = "kCommandClearConfiguration";
inline constexpr std::string_view kCommandQueryMetric = "kCommandQueryMetric";

inline constexpr std::string_view kKeyAppID = "kKeyAppID";
inline constexpr std::string_view kKeyPayload = "kKeyPayload";
inline constexpr std::string_view kKeyPayloadType = "kKeyPayloadType";
inline constexpr std::string_view kKeyTriggerRef = "kKeyTriggerRef";
inline constexpr std::string_view kKeyTriggerType = "kKeyTriggerType";
inline constexpr std::string_view kKeyTriggerID = "kKeyTriggerID";
inline constexpr std::string_view kKeyProfileID = "kKeyProfileID";
inline constexpr std::string_view kKeyMetricID = "kKeyMetricID";

namespace client {

/// A client's registration with the baseband manager. Opaque; each library derives its own.
class Manager {
 public:
  virtual ~Manager() = default;
};

/// Handed to every event handler; the product ignores it.
struct Group {};

using EventHandler = std::function<void(const KeyValueMessage& message, const Group& group)>;

/// Result of a command: code 0 means success, any other code comes with a text that says what is wrong.
struct Result {
  int code = 0;
  std::string text;
};

/// The five operations of the library. All may be called on any thread.
class Library {
 public:
  virtual ~Library() = default;

  /// A handle bound to `clientName`, whose events are delivered on `queue`, one at a time and in order.
  virtual std::shared_ptr<Manager> CreateManager(std::string_view clientName, std::shared_ptr<Queue> queue) = 0;
  /// Sets the handler of one event of this handle. A later registration for the same event replaces the earlier one.
  virtual void RegisterEventHandler(const std::shared_ptr<Manager>& manager, std::string_view event,
                                    EventHandler handler) = 0;
  /// Stops event delivery to this handle.
  virtual void EventsOff(const std::shared_ptr<Manager>& manager) = 0;
  /// Starts event delivery to this handle.
  virtual void EventsOn(const std::shared_ptr<Manager>& manager) = 0;
  /// Carries out `command` before it returns. `response` may be filled; the product never looks at it.
  virtual Result PerformCommand(const std::shared_ptr<Manager>& manager, std::string_view command,
                                const KeyValueMessage& message, KeyValueMessage& response) = 0;
};

}  // namespace client
}  // namespace quorl::zelkor
