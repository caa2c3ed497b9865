#pragma once

#include <string>

// What the option parser's own checks of numbers let pass is "nan", and their limits can be 300 digits long.

namespace quorl::desktop {

/// Each answers what is wrong with the text of an option, empty if it is good.
std::string faultOfNumber(const std::string& text, double least, double most);
std::string faultOfTime(const std::string& text);
std::string faultOfSeed(const std::string& text);

}  // namespace quorl::desktop
