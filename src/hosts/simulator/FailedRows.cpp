#include "hosts/simulator/FailedRows.h"

#include <fmt/format.h>

#include "shell/LogCategories.h"

namespace quorl::simulator {
namespace {

constexpr std::string_view kFailedInsert = "error occurred while inserting";

bool tellsOfRows(std::string_view category, LogLevel level) {
  return level == LogLevel::Error &&
         (category == log_category::kMetricService || category == log_category::kHorvaneService);
}

/// What the database says, out of `... ---> Optional(Prepare(message: "database is locked"))`; the line if it says
/// nothing.
std::string_view reasonIn(std::string_view line) {
  constexpr std::string_view kBefore = "(message: \"";
  const std::size_t begin = line.find(kBefore);
  const std::size_t end = line.rfind('"');
  if (begin == std::string_view::npos || end < begin + kBefore.size()) return line;
  return line.substr(begin + kBefore.size(), end - begin - kBefore.size());
}

}  // namespace

bool FailedRows::isEnabled(std::string_view category, LogLevel level) const {
  return tellsOfRows(category, level) || (output_ && output_->isEnabled(category, level));
}

void FailedRows::write(std::string_view category, LogLevel level, std::string_view text) {
  if (tellsOfRows(category, level) && text.starts_with(kFailedInsert)) {
    const std::lock_guard lock(mutex_);
    if (count_++ == 0) firstReason_ = reasonIn(text);
  }
  if (output_ && output_->isEnabled(category, level)) output_->write(category, level, text);
}

std::string FailedRows::report() const {
  const std::lock_guard lock(mutex_);
  const std::uint64_t rows = count();
  if (rows == 0) return {};
  return fmt::format("{} row{} could not be stored: {}", rows, rows == 1 ? "" : "s", firstReason_);
}

}  // namespace quorl::simulator
