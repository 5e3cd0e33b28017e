#pragma once

// Numbers from words and in words.

#include <cstddef>
#include <string>
#include <vector>

namespace tool {

/// Reads a decimal number, such as -0.5 or 1e3, and moves \p text behind it; not-a-number where there is none. Libraries
/// that know no std::from_chars for floating point are still in use.
double ParseNumber(const char*& text);

/// Reads exactly `count` finite numbers with commas between, such as 0.5,12,-3. Throws a usage Failure.
/// \param what  what the numbers are, such as "a place".
std::vector<double> ParseNumbers(const std::string& text, size_t count, const std::string& what);

/// As std::printf writes it.
[[gnu::format(printf, 1, 2)]] std::string Formatted(const char* format, ...);

} // namespace tool
