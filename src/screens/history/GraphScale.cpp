#include "screens/history/GraphScale.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>

#include <fmt/format.h>

#include "base/NumberText.h"
#include "screens/history/GraphView.h"

namespace quorl {
namespace {

/// Between two labels.
constexpr double kLabelGap = 8;
constexpr std::size_t kTickCount = 3;
/// Leading digits of round numbers. No two neighbours are further apart than 3 is from 2, so that an axis from 0 has
/// a step that gives it exactly three.
constexpr std::array<double, 9> kRoundDigits{1, 1.5, 2, 3, 4, 5, 6, 8, 10};

std::string tickText(double value) {
  constexpr std::array<std::pair<double, const char*>, 3> kSuffixes{{{1e9, "G"}, {1e6, "M"}, {1e4, "k"}}};
  for (const auto& [limit, suffix] : kSuffixes) {
    if (std::abs(value) < limit) continue;
    return fmt::format("{:.4g}{}", value / (limit == 1e4 ? 1e3 : limit), suffix);
  }
  return fmt::format("{:.4g}", value);
}

/// The greatest round number up to `limit`, which is positive.
double roundStep(double limit) {
  const double decade = std::pow(10, std::floor(std::log10(limit)));
  for (auto digit = kRoundDigits.rbegin(); digit != kRoundDigits.rend(); ++digit)
    if (*digit * decade <= limit * (1 + 1e-9)) return *digit * decade;
  return decade;
}

/// The round number before `step`.
double smallerStep(double step) {
  return roundStep(step * 0.99);
}

}  // namespace

GraphScale::GraphScale(const std::vector<Metric>& rows, double maxValue, double plotHeight)
    : maxValue_(maxValue), areaHeight_(plotHeight) {
  if (rows.empty() || availableBarHeight(plotHeight) <= 0) return;
  double least = 0;
  double greatest = 0;
  for (const Metric& row : rows) {
    const double value = realPrefix(row.attributeValue);
    least = std::min(least, value);
    greatest = std::max(greatest, value);
  }
  // A greatest integer of 0 gives nothing else a height; fractions and negative values are measured by their largest.
  if (maxValue_ == 0 && (least < 0 || greatest > 0)) maxValue_ = -least > greatest ? least : greatest;

  double up = 0;
  double down = 0;
  for (const Metric& row : rows) {
    const double height = barHeight(row.attributeValue, maxValue_, areaHeight_);
    up = std::max(up, height);
    down = std::max(down, -height);
  }
  if (up + down > plotHeight) {
    const double shrink = availableBarHeight(plotHeight) / (up + down);
    areaHeight_ = kBarAreaReserve + availableBarHeight(plotHeight) * shrink;
    down *= shrink;
  }
  baseline_ = plotHeight - down;
  makeTicks(least, greatest);
}

double GraphScale::height(std::string_view value) const {
  const double height = barHeight(value, maxValue_, areaHeight_);
  return std::isfinite(height) ? height : 0;
}

void GraphScale::makeTicks(double least, double greatest) {
  const auto add = [this](double value) {
    const double height =
        maxValue_ == 0 ? availableBarHeight(areaHeight_) : value * availableBarHeight(areaHeight_) / maxValue_;
    ticks_.push_back({baseline_ - height, tickText(value)});
  };
  if (least == greatest) {
    add(0);
    return;
  }
  const auto firstOf = [&](double step) { return std::ceil(least / step - 1e-9); };
  const auto countOf = [&](double step) {
    return static_cast<std::size_t>(std::floor(greatest / step + 1e-9) - firstOf(step)) + 1;
  };
  double step = roundStep(greatest - least);
  while (countOf(step) < kTickCount) step = smallerStep(step);
  // A fourth, where there is one, would be beside 0 on the longer side.
  double first = firstOf(step);
  if (countOf(step) > kTickCount && -least > greatest) ++first;
  for (std::size_t i = 0; i < kTickCount; ++i) add((first + static_cast<double>(i)) * step);
}

std::size_t labelStride(double labelWidth, double barPitch) {
  if (barPitch <= 0) return 1;
  return std::max<std::size_t>(1, static_cast<std::size_t>(std::ceil((labelWidth + kLabelGap) / barPitch)));
}

std::string shortValue(std::string_view value) {
  double number = 0;
  const auto [end, error] = std::from_chars(value.data(), value.data() + value.size(), number);
  if (error != std::errc() || end != value.data() + value.size() || !std::isfinite(number)) return std::string(value);
  const std::size_t point = value.find('.');
  if (point == std::string_view::npos || value.find_first_of("eE") != std::string_view::npos) return std::string(value);
  std::string text = fmt::format("{:.2f}", number);
  text.erase(text.find_last_not_of('0') + 1);
  if (text.ends_with('.')) text.pop_back();
  return text == "-0" ? "0" : text;
}

std::string graphCaption(const std::vector<Metric>& rows, int segmentIndex) {
  if (rows.empty()) return {};
  double sum = 0;
  for (const Metric& row : rows) sum += realPrefix(row.attributeValue);
  const char* unit = segmentIndex == 0 ? "reading" : "day";
  return fmt::format("{} {}{} · mean {}", rows.size(), unit, rows.size() == 1 ? "" : "s",
                     shortValue(fmt::format("{:.2f}", sum / static_cast<double>(rows.size()))));
}

}  // namespace quorl
