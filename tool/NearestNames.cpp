#include "NearestNames.h"

#include <algorithm>
#include <numeric>
#include <utility>

namespace quorl::tool {

std::size_t editDistance(std::string_view a, std::string_view b) {
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 1; i <= a.size(); ++i) {
    std::size_t diagonal = std::exchange(row[0], i);
    for (std::size_t j = 1; j <= b.size(); ++j) {
      const std::size_t replaced = diagonal + (a[i - 1] == b[j - 1] ? 0 : 1);
      diagonal = row[j];
      row[j] = std::min({row[j] + 1, row[j - 1] + 1, replaced});
    }
  }
  return row[b.size()];
}

std::vector<std::string_view> nearestNames(std::string_view name, std::vector<std::string_view> names,
                                           std::size_t count) {
  // Anything longer is as far from every name as its first characters are.
  constexpr std::size_t kEnough = 256;
  const std::string_view wanted = name.substr(0, kEnough);
  std::vector<std::pair<std::size_t, std::string_view>> ranked;
  ranked.reserve(names.size());
  for (const std::string_view candidate : names) ranked.emplace_back(editDistance(wanted, candidate), candidate);
  std::stable_sort(ranked.begin(), ranked.end(), [](const auto& a, const auto& b) { return a.first < b.first; });
  ranked.resize(std::min(count, ranked.size()));
  names.clear();
  for (const auto& [distance, candidate] : ranked) names.push_back(candidate);
  return names;
}

}  // namespace quorl::tool
