#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

namespace quorl::tool {

/// How many single characters have to be put in, taken out or replaced to turn `a` into `b`.
std::size_t editDistance(std::string_view a, std::string_view b);

/// The `count` names nearest to `name` by edit distance, nearest first, equally near ones in the order of `names`.
std::vector<std::string_view> nearestNames(std::string_view name, std::vector<std::string_view> names,
                                           std::size_t count);

}  // namespace quorl::tool
