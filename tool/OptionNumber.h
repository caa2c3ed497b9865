#pragma once

#include <cstdint>
#include <string>

// What an option's text must be to stand for a number. Each answers what is wrong with it in a few words, or nothing.

namespace quorl::tool {

/// A whole number in decimal digits, both limits included. Zeros before it, which elsewhere mean octal, are taken away.
std::string wholeNumberFault(std::string& text, std::uint64_t least, std::uint64_t most);

/// A finite number with a decimal point in every locale, both limits included.
std::string numberFault(const std::string& text, double least, double most);

}  // namespace quorl::tool
