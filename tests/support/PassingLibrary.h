#pragma once

#include <memory>
#include <string_view>
#include <utility>

#include "platform/ZelkorClient.h"

namespace quorl::test {

/// A baseband manager's library that passes everything on to another, for a test to come between them. The other must
/// outlive it.
class PassingLibrary : public zelkor::client::Library {
 public:
  explicit PassingLibrary(Library& inner) : inner_(inner) {}

  std::shared_ptr<zelkor::client::Manager> CreateManager(std::string_view clientName,
                                                         std::shared_ptr<Queue> queue) override {
    return inner_.CreateManager(clientName, std::move(queue));
  }
  void RegisterEventHandler(const std::shared_ptr<zelkor::client::Manager>& manager, std::string_view event,
                            zelkor::client::EventHandler handler) override {
    inner_.RegisterEventHandler(manager, event, std::move(handler));
  }
  void EventsOff(const std::shared_ptr<zelkor::client::Manager>& manager) override { inner_.EventsOff(manager); }
  void EventsOn(const std::shared_ptr<zelkor::client::Manager>& manager) override { inner_.EventsOn(manager); }
  zelkor::client::Result PerformCommand(const std::shared_ptr<zelkor::client::Manager>& manager,
                                        std::string_view command, const zelkor::KeyValueMessage& message,
                                        zelkor::KeyValueMessage& response) override {
    return inner_.PerformCommand(manager, command, message, response);
  }

 private:
  Library& inner_;
};

}  // namespace quorl::test
