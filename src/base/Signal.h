#pragma once

#include <functional>
#include <utility>

#include <boost/signals2/signal.hpp>

namespace quorl {

/// Ends a subscription when it goes away.
using Connection = boost::signals2::scoped_connection;

/// Tells whoever listens that something has happened. Handlers run inside the call, in the order of connection.
template <typename... Args>
class Signal {
 public:
  using Handler = std::function<void(Args...)>;

  [[nodiscard]] Connection connect(Handler handler) { return signal_.connect(std::move(handler)); }
  void operator()(Args... args) { signal_(args...); }

 private:
  boost::signals2::signal<void(Args...)> signal_;
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
  boost::signals2::signal<void(const T&)> changed_;
};

}  // namespace quorl
