#pragma once

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <fmt/format.h>

namespace quorl::simulator::network {

/// A line is not as the form tells; `what` says how.
class BadScenarioLine : public std::runtime_error {
 public:
  template <typename... Args>
  explicit BadScenarioLine(fmt::format_string<Args...> form, Args&&... args)
      : std::runtime_error(fmt::format(form, std::forward<Args>(args)...)) {}
};

/// The words of one line: plain ones, taken in their order, and settings of the form key=value, taken by their key. A
/// text with blanks stands in double quotes, # begins a comment. Whatever is missing, out of range or left over is a
/// `BadScenarioLine`.
class ScenarioLine {
 public:
  explicit ScenarioLine(std::string_view line);

  bool isEmpty() const { return words_.empty(); }

  /// The next plain word; `what` names it in an error.
  std::string word(std::string_view what);
  /// The next plain word as a number.
  double number(std::string_view what, double low, double high);
  std::int64_t whole(std::string_view what, std::int64_t low, std::int64_t high);
  /// Whether one of the plain words is this one.
  bool flag(std::string_view name);

  std::optional<std::string> setting(std::string_view key);
  std::string neededSetting(std::string_view key);
  double numberSetting(std::string_view key, std::optional<double> otherwise, double low, double high);
  std::int64_t wholeSetting(std::string_view key, std::optional<std::int64_t> otherwise, std::int64_t low,
                            std::int64_t high);
  /// A list of texts between commas; none without the setting.
  std::vector<std::string> listSetting(std::string_view key);

  /// To be called once everything was taken.
  void finish() const;

  /// "[hours:]minutes:seconds", or "12.5s", in milliseconds.
  static std::uint64_t time(std::string_view text);
  static double parseNumber(std::string_view text, std::string_view what, double low, double high);
  static std::int64_t parseWhole(std::string_view text, std::string_view what, std::int64_t low, std::int64_t high);

 private:
  struct Word {
    std::string key;  // empty for a plain word
    std::string text;
    bool isTaken = false;
  };

  std::vector<Word> words_;
};

}  // namespace quorl::simulator::network
