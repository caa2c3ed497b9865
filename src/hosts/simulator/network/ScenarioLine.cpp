#include "hosts/simulator/network/ScenarioLine.h"

#include <cctype>
#include <charconv>
#include <cmath>
#include <system_error>
#include <utility>

#include <fmt/format.h>

namespace quorl::simulator::network {
namespace {

bool isBlank(char c) {
  return c == ' ' || c == '\t' || c == '\r';
}

}  // namespace

ScenarioLine::ScenarioLine(std::string_view line) {
  std::size_t at = 0;
  while (at < line.size()) {
    if (isBlank(line[at])) {
      ++at;
      continue;
    }
    if (line[at] == '#') return;
    Word word;
    bool isQuoted = false;
    while (at < line.size() && (isQuoted || !isBlank(line[at]))) {
      const char c = line[at++];
      if (static_cast<unsigned char>(c) < 0x20 && c != '\t') throw BadScenarioLine("a control character");
      if (c == '"') {
        isQuoted = !isQuoted;
      } else if (c == '=' && !isQuoted && word.key.empty() && !word.text.empty()) {
        word.key = std::move(word.text);
        word.text.clear();
      } else {
        word.text += c;
      }
    }
    if (isQuoted) throw BadScenarioLine("a text without its closing quote");
    words_.push_back(std::move(word));
  }
}

std::string ScenarioLine::word(std::string_view what) {
  for (Word& word : words_) {
    if (word.isTaken || !word.key.empty()) continue;
    word.isTaken = true;
    return word.text;
  }
  throw BadScenarioLine("{} is missing", what);
}

double ScenarioLine::number(std::string_view what, double low, double high) {
  return parseNumber(word(what), what, low, high);
}

std::int64_t ScenarioLine::whole(std::string_view what, std::int64_t low, std::int64_t high) {
  return parseWhole(word(what), what, low, high);
}

bool ScenarioLine::flag(std::string_view name) {
  for (Word& word : words_) {
    if (word.isTaken || !word.key.empty() || word.text != name) continue;
    word.isTaken = true;
    return true;
  }
  return false;
}

std::optional<std::string> ScenarioLine::setting(std::string_view key) {
  std::optional<std::string> found;
  for (Word& word : words_) {
    if (word.key != key) continue;
    if (found) throw BadScenarioLine("{} stands twice", key);
    word.isTaken = true;
    found = word.text;
  }
  return found;
}

std::string ScenarioLine::neededSetting(std::string_view key) {
  auto found = setting(key);
  if (!found) throw BadScenarioLine("{}= is missing", key);
  return *std::move(found);
}

double ScenarioLine::numberSetting(std::string_view key, std::optional<double> otherwise, double low, double high) {
  const auto found = setting(key);
  if (!found && otherwise) return *otherwise;
  if (!found) throw BadScenarioLine("{}= is missing", key);
  return parseNumber(*found, key, low, high);
}

std::int64_t ScenarioLine::wholeSetting(std::string_view key, std::optional<std::int64_t> otherwise, std::int64_t low,
                                        std::int64_t high) {
  const auto found = setting(key);
  if (!found && otherwise) return *otherwise;
  if (!found) throw BadScenarioLine("{}= is missing", key);
  return parseWhole(*found, key, low, high);
}

std::vector<std::string> ScenarioLine::listSetting(std::string_view key) {
  std::vector<std::string> list;
  const auto found = setting(key);
  if (!found) return list;
  std::string_view rest = *found;
  while (true) {
    const std::size_t comma = rest.find(',');
    if (rest.substr(0, comma).empty()) throw BadScenarioLine("{}= has an empty entry", key);
    list.emplace_back(rest.substr(0, comma));
    if (comma == std::string_view::npos) return list;
    rest.remove_prefix(comma + 1);
  }
}

void ScenarioLine::finish() const {
  for (const Word& word : words_) {
    if (word.isTaken) continue;
    if (word.key.empty()) throw BadScenarioLine("\"{}\" has no meaning here", word.text);
    throw BadScenarioLine("{}= has no meaning here", word.key);
  }
}

double ScenarioLine::parseNumber(std::string_view text, std::string_view what, double low, double high) {
  double value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc() || end != text.data() + text.size() || !std::isfinite(value))
    throw BadScenarioLine("{} is no number: {}", what, text);
  if (value < low || value > high) throw BadScenarioLine("{} must be between {} and {}", what, low, high);
  return value;
}

std::int64_t ScenarioLine::parseWhole(std::string_view text, std::string_view what, std::int64_t low,
                                      std::int64_t high) {
  std::int64_t value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error == std::errc::result_out_of_range) throw BadScenarioLine("{} must be between {} and {}", what, low, high);
  if (error != std::errc() || end != text.data() + text.size())
    throw BadScenarioLine("{} is no whole number: {}", what, text);
  if (value < low || value > high) throw BadScenarioLine("{} must be between {} and {}", what, low, high);
  return value;
}

std::uint64_t ScenarioLine::time(std::string_view text) {
  constexpr double kLongestSeconds = 30.0 * 86400.0;
  if (!text.empty() && text.back() == 's')
    return static_cast<std::uint64_t>(
        std::floor(parseNumber(text.substr(0, text.size() - 1), "time", 0, kLongestSeconds) * 1000.0 + 0.5));
  std::uint64_t seconds = 0;
  std::size_t parts = 0;
  std::string_view rest = text;
  while (true) {
    const std::size_t colon = rest.find(':');
    const std::string_view part = rest.substr(0, colon);
    const bool isFirst = parts == 0;
    if (part.size() > 3 || (!isFirst && part.size() != 2)) break;
    seconds = seconds * 60 + static_cast<std::uint64_t>(parseWhole(part, "time", 0, isFirst ? 720 : 59));
    ++parts;
    if (colon == std::string_view::npos) {
      if (parts == 2 || parts == 3) return seconds * 1000;
      break;
    }
    rest.remove_prefix(colon + 1);
  }
  throw BadScenarioLine("time must be hours:minutes:seconds, minutes:seconds or a number with s: {}", text);
}

}  // namespace quorl::simulator::network
