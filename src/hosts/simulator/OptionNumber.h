#pragma once

#include <cstdint>
#include <string>

// What an option's text must be to stand for a number. Each answers what is wrong with it in a few words, or nothing.
// The option parser's own checks let "nan" pass, and their limits can be 300 digits long.

namespace quorl::simulator {

/// A whole number in decimal digits, both limits included. Zeros before it, which elsewhere mean octal, are taken away.
std::string wholeNumberFault(std::string& text, std::uint64_t least, std::uint64_t most);

/// A finite number with a decimal point in every locale, both limits included.
std::string numberFault(const std::string& text, double least, double most);

}  // namespace quorl::simulator
