#pragma once

#include <cstddef>
#include <memory>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include "base/Log.h"

namespace quorl::test {

struct LogLine {
  std::string category;  // empty for the plain error log
  LogLevel level = LogLevel::Default;
  std::string text;

  friend bool operator==(const LogLine&, const LogLine&) = default;
};

/// For failure messages of GoogleTest.
void PrintTo(const LogLine& line, std::ostream* out);

/// Records every line while it lives; the log goes back to where it went before when it goes away. Thread-safe.
class LogRecorder {
 public:
  LogRecorder();
  ~LogRecorder();
  LogRecorder(const LogRecorder&) = delete;
  LogRecorder& operator=(const LogRecorder&) = delete;

  std::vector<LogLine> lines() const;
  std::vector<std::string> texts() const;
  /// Texts of one category.
  std::vector<std::string> texts(std::string_view category) const;
  std::size_t count(std::string_view text) const;
  bool has(std::string_view text) const { return count(text) > 0; }
  bool has(const LogLine& line) const;
  void clear();

 private:
  struct Sink;
  std::shared_ptr<Sink> sink_;
  std::shared_ptr<LogSink> previous_;
};

}  // namespace quorl::test
