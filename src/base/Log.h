#pragma once

#include <atomic>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>

#include <fmt/format.h>

namespace quorl {

enum class LogLevel : std::uint8_t { Default, Error };

/// Receives every line that somebody listens to. Called on the thread that logs; must be thread-safe.
class LogSink {
 public:
  virtual ~LogSink() = default;
  /// Asked before a line is rendered; false means that its text is never built.
  virtual bool isEnabled(std::string_view category, LogLevel level) const = 0;
  /// `category` is empty for the plain error log.
  virtual void write(std::string_view category, LogLevel level, std::string_view text) = 0;
};

/// Directs all lines to `sink` from now on; null silences the log. Answers the sink that it replaces. Lines that are
/// being written meanwhile keep the earlier sink alive.
std::shared_ptr<LogSink> installLogSink(std::shared_ptr<LogSink> sink);

namespace log_detail {

/// What a placeholder of a log line asks for: "%{public}s", "%@", "%d", "%ld", "%u" and "%i" take the argument's
/// natural text, "%x" a number in lower-case hexadecimal.
struct Placeholder {
  std::size_t begin;
  std::size_t end;
  bool hexadecimal;
};

/// The next placeholder at or after `from`, if any. "%%" is none, and so is a "%" before a blank.
constexpr std::optional<Placeholder> nextPlaceholder(std::string_view format, std::size_t from) {
  for (std::size_t i = from; i + 1 < format.size(); ++i) {
    if (format[i] != '%') continue;
    std::size_t at = i + 1;
    if (format[at] == '%') {
      ++i;
      continue;
    }
    if (format[at] == '{') {
      at = format.find('}', at);
      if (at == std::string_view::npos) return std::nullopt;
      ++at;
    }
    while (at < format.size() && (format[at] == 'l' || format[at] == 't')) ++at;
    if (at >= format.size()) return std::nullopt;
    const char kind = format[at];
    if (kind == 's' || kind == '@' || kind == 'd' || kind == 'i' || kind == 'u' || kind == 'x')
      return Placeholder{i, at + 1, kind == 'x'};
  }
  return std::nullopt;
}

constexpr std::size_t countPlaceholders(std::string_view format) {
  std::size_t count = 0;
  std::size_t at = 0;
  while (const auto placeholder = nextPlaceholder(format, at)) {
    ++count;
    at = placeholder->end;
  }
  return count;
}

/// Not constexpr: reaching it in a constant expression is the compile error.
void logLineAndArgumentsDisagree();

/// A log line as it stands in the code, checked at compile time against the number of its arguments.
template <typename... Args>
class FormatString {
 public:
  consteval FormatString(const char* format) : format_(format) {
    if (countPlaceholders(format_) != sizeof...(Args)) logLineAndArgumentsDisagree();
  }
  constexpr std::string_view view() const { return format_; }

 private:
  std::string_view format_;
};

template <typename T>
concept HasLogText = requires(const T& value) {
  { logText(value) } -> std::convertible_to<std::string>;
};

template <typename T>
std::string render(const T& value, bool hexadecimal) {
  if constexpr (HasLogText<T>) {
    return logText(value);
  } else if constexpr (std::is_same_v<T, bool>) {
    return value ? "1" : "0";
  } else if constexpr (std::is_integral_v<T>) {
    return hexadecimal ? fmt::format("{:x}", value) : fmt::format("{}", value);
  } else {
    return std::string(std::string_view(value));
  }
}

/// A view of one argument that knows how to render itself when its placeholder is reached.
struct Argument {
  const void* value;
  std::string (*render)(const void* value, bool hexadecimal);
};

std::string renderLine(std::string_view format, const Argument* arguments, std::size_t count);

std::shared_ptr<LogSink> currentSink();
extern std::atomic<bool> anySink;

}  // namespace log_detail

/// The logger of one category. Lines carry "%{public}s" placeholders and are written in the code as they stand.
///
/// An argument is an integer, a text, or a type with a free function `std::string logText(const T&)` found by
/// argument-dependent look-up. Nothing is rendered, and `logText` not called, when nobody listens. Thread-safe.
class Logger {
 public:
  /// `category` must have static storage duration.
  explicit constexpr Logger(std::string_view category) : category_(category) {}

  template <typename... Args>
  void log(log_detail::FormatString<std::type_identity_t<Args>...> format, const Args&... args) const {
    write(LogLevel::Default, format.view(), args...);
  }
  template <typename... Args>
  void error(log_detail::FormatString<std::type_identity_t<Args>...> format, const Args&... args) const {
    write(LogLevel::Error, format.view(), args...);
  }

  /// Whether a line of `level` would reach anybody; for callers whose arguments are costly to get at.
  bool isEnabled(LogLevel level) const {
    if (!log_detail::anySink.load(std::memory_order_acquire)) return false;
    const std::shared_ptr<LogSink> sink = log_detail::currentSink();
    return sink && sink->isEnabled(category_, level);
  }

 private:
  template <typename... Args>
  void write(LogLevel level, std::string_view format, const Args&... args) const {
    if (!log_detail::anySink.load(std::memory_order_acquire)) return;
    const std::shared_ptr<LogSink> sink = log_detail::currentSink();
    if (!sink || !sink->isEnabled(category_, level)) return;
    const log_detail::Argument arguments[sizeof...(Args) + 1] = {
        {&args, [](const void* value,
                   bool hexadecimal) { return log_detail::render(*static_cast<const Args*>(value), hexadecimal); }}...,
        {}};
    sink->write(category_, level, log_detail::renderLine(format, arguments, sizeof...(Args)));
  }

  std::string_view category_;
};

/// The plain error log, outside all categories.
inline constexpr Logger plainErrorLog{std::string_view{}};

}  // namespace quorl
