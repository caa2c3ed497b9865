#include "base/Signal.h"

#include <boost/signals2/signal.hpp>

namespace quorl {

struct SignalCore::Slots {
  boost::signals2::signal<void(const void*)> signal;
};

SignalCore::SignalCore() : slots_(std::make_shared<Slots>()) {}

SignalCore::~SignalCore() = default;

Connection SignalCore::connect(std::function<void(const void*)> handler) {
  return Connection(std::make_shared<boost::signals2::scoped_connection>(slots_->signal.connect(std::move(handler))));
}

void SignalCore::tell(const void* arguments) {
  // A handler may destroy the signal's owner.
  const std::shared_ptr<Slots> slots = slots_;
  slots->signal(arguments);
}

}  // namespace quorl
