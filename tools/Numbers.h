#pragma once

// Lists of numbers on the command line, such as 0.5,12,-3.

#include <cstddef>
#include <string>
#include <vector>

namespace tool {

/// Reads exactly `count` finite numbers with commas between. Throws a usage Failure.
/// \param what  what the numbers are, such as "a place".
std::vector<double> ParseNumbers(const std::string& text, size_t count, const std::string& what);

} // namespace tool
