#include "screens/export/ExportText.h"

#include <array>
#include <charconv>
#include <chrono>
#include <cstdint>
#include <optional>
#include <string_view>
#include <utility>

#include "base/DateText.h"

namespace quorl {
namespace {

/// All that is not the rows' own texts: field names, separators, id, time, flags and a number.
constexpr std::size_t kFixedSize = 352;
/// Of a piece of the text.
constexpr std::size_t kPieceSize = 64 * 1024;

void appendTwoDigits(char*& at, std::int64_t value) {
  *at++ = static_cast<char>('0' + value / 10);
  *at++ = static_cast<char>('0' + value % 10);
}

/// Writes times as `utcText` does, for many in a row: the text of the day is kept, as rows lie close together.
class UtcTextWriter {
 public:
  void append(std::string& text, Date date) {
    const auto seconds = std::chrono::floor<std::chrono::seconds>(date);
    const auto day = std::chrono::floor<std::chrono::days>(seconds);
    if (day != day_ || dayText_.empty()) {
      day_ = day;
      dayText_ = utcText(date);
      dayText_.erase(dayText_.find(' '));
    }
    const std::int64_t second = (seconds - day).count();
    std::array<char, 9> clock;  // " 09:30:12"
    char* at = clock.data();
    *at++ = ' ';
    appendTwoDigits(at, second / 3600);
    *at++ = ':';
    appendTwoDigits(at, second / 60 % 60);
    *at++ = ':';
    appendTwoDigits(at, second % 60);
    text.append(dayText_).append(clock.data(), clock.size()).append(" +0000");
  }

 private:
  std::chrono::sys_days day_{};
  std::string dayText_;
};

void appendUuid(std::string& text, const Uuid& id) {
  constexpr char kDigits[] = "0123456789ABCDEF";
  std::array<char, 36> digits;
  std::size_t at = 0;
  for (std::size_t i = 0; i < id.bytes.size(); ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) digits[at++] = '-';
    digits[at++] = kDigits[id.bytes[i] >> 4];
    digits[at++] = kDigits[id.bytes[i] & 0xF];
  }
  text.append(digits.data(), digits.size());
}

void appendInteger(std::string& text, std::int32_t value) {
  std::array<char, 12> digits;
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), value).ptr;
  text.append(digits.data(), end);
}

std::string_view boolText(bool value) {
  return value ? "true" : "false";
}

/// What a record of an export has of the fields that only other records use, too.
struct Extras {
  std::string_view attributeValueType;
  bool graphable = false;
  bool isBookmarked = false;
  const std::optional<std::string>* sectionNumber = nullptr;
};

void append(std::string& text, const ExportedMetric& metric, const Extras& extras, UtcTextWriter& times) {
  text.append("QuorlInternal_4.Metric(id: ");
  appendUuid(text, metric.id);
  text.append(", metricTech: ").append(metric.metricTech);
  text.append(", metricName: ").append(metric.metricName);
  text.append(", attributeName: ").append(metric.attributeName);
  text.append(", attributeNameNonLocalized: ").append(metric.attributeNameNonLocalized);
  text.append(", attributeValue: ").append(metric.attributeValue);
  text.append(", attributeValueType: ").append(extras.attributeValueType);
  text.append(", collectedOn: ");
  times.append(text, metric.collectedOn);
  text.append(", metricId: ").append(metric.metricId);
  text.append(", subsId: ");
  appendInteger(text, metric.subsId);
  text.append(", graphable: ").append(boolText(extras.graphable));
  text.append(", isBookmarked: ").append(boolText(extras.isBookmarked));
  if (extras.sectionNumber != nullptr && *extras.sectionNumber) {
    text.append(", sectionNumber: Optional(\"").append(**extras.sectionNumber).append("\"))");
  } else {
    text.append(", sectionNumber: nil)");
  }
}

std::size_t sizeOfTexts(const ExportedMetric& metric) {
  return metric.metricTech.size() + metric.metricName.size() + metric.attributeName.size() +
         metric.attributeNameNonLocalized.size() + metric.attributeValue.size() + metric.metricId.size();
}

}  // namespace

void appendMetricText(std::string& text, const Metric& metric) {
  UtcTextWriter times;
  append(text,
         {metric.id, metric.metricTech, metric.metricName, metric.attributeName, metric.attributeNameNonLocalized,
          metric.attributeValue, metric.collectedOn, metric.metricId, metric.subsId},
         {metric.attributeValueType, metric.graphable, metric.isBookmarked, &metric.sectionNumber}, times);
}

std::string exportText(const ExportedMetrics& metrics) {
  std::size_t size = 0;
  for (std::size_t i = 0; i < metrics.size(); ++i) size += kFixedSize + sizeOfTexts(metrics.row(i));
  std::string text;
  text.reserve(size);
  UtcTextWriter times;
  for (std::size_t i = 0; i < metrics.size(); ++i) {
    if (i > 0) text.push_back(',');
    append(text, metrics.row(i), {}, times);
  }
  return text;
}

SharedText sharedExportText(ExportedMetrics metrics, std::string fileName) {
  return {std::move(fileName), [metrics = std::move(metrics)](const SharedText::Sink& sink) {
            std::string piece;
            UtcTextWriter times;
            for (std::size_t i = 0; i < metrics.size(); ++i) {
              if (i > 0) piece.push_back(',');
              append(piece, metrics.row(i), {}, times);
              if (piece.size() < kPieceSize) continue;
              if (!sink(piece)) return;
              piece.clear();
            }
            if (!piece.empty()) sink(piece);
          }};
}

}  // namespace quorl
