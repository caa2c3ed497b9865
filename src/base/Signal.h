#pragma once

#include <functional>
#include <memory>
#include <tuple>
#include <utility>

namespace quorl {

/// Ends a subscription when it goes away. A handler that runs at that moment on another thread may still finish.
class Connection {
 public:
  Connection() = default;
  explicit Connection(std::shared_ptr<void> subscription) : subscription_(std::move(subscription)) {}
  Connection(Connection&&) noexcept = default;
  Connection& operator=(Connection&&) noexcept = default;

  void disconnect() { subscription_.reset(); }

 private:
  std::shared_ptr<void> subscription_;
};

/// The type-blind part of `Signal`, so that whoever includes this header does not compile the library behind it.
class SignalCore {
 public:
  SignalCore();
  ~SignalCore();
  SignalCore(const SignalCore&) = delete;
  SignalCore& operator=(const SignalCore&) = delete;

  Connection connect(std::function<void(const void* arguments)> handler);
  void tell(const void* arguments);

 private:
  struct Slots;
  std::shared_ptr<Slots> slots_;
};

/// Tells whoever listens that something has happened. Handlers run inside the call, in the order of connection.
/// Thread-safe.
template <typename... Args>
class Signal {
 public:
  using Handler = std::function<void(Args...)>;

  [[nodiscard]] Connection connect(Handler handler) {
    return core_.connect([handler = std::move(handler)](const void* arguments) {
      std::apply(handler, *static_cast<const std::tuple<Args...>*>(arguments));
    });
  }
  void operator()(Args... args) {
    const std::tuple<Args...> arguments(args...);
    core_.tell(&arguments);
  }

 private:
  SignalCore core_;
};

/// A value whose every assignment is told to its subscribers, equal or not. One thread.
template <typename T>
class Published {
 public:
  using Handler = std::function<void(const T&)>;

  explicit Published(T value = T()) : value_(std::move(value)) {}

  const T& get() const { return value_; }
  void set(T value) {
    value_ = std::move(value);
    announce();
  }
  /// Changes the value in place.
  template <typename Change>
  void modify(Change&& change) {
    std::forward<Change>(change)(value_);
    announce();
  }
  /// `handler` runs with the present value before this returns, and then at every change.
  [[nodiscard]] Connection subscribe(Handler handler) {
    handler(value_);
    return changed_.connect(std::move(handler));
  }

 private:
  void announce() { changed_(value_); }

  T value_;
  Signal<const T&> changed_;
};

}  // namespace quorl
