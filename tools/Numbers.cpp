#include "Numbers.h"

#include "Failure.h"

#include <cmath>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>

namespace tool {

double ParseNumber(const char*& text) {
    constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
    // What std::strtod takes besides: spaces and a plus in front, hexadecimal digits, words.
    const std::string number(text, std::strspn(text, "0123456789.eE+-"));
    if (number.starts_with('+')) return kNone;
    char* end = nullptr;
    const double value = std::strtod(number.c_str(), &end);
    text += end - number.c_str();
    return end != number.c_str() ? value : kNone;
}

std::vector<double> ParseNumbers(const std::string& text, size_t count, const std::string& what) {
    std::vector<double> numbers;
    const char* next = text.c_str();
    while (numbers.size() < count) {
        const double number = ParseNumber(next);
        if (!std::isfinite(number)) break;
        numbers.push_back(number);
        if (*next != ',' || numbers.size() == count) break;
        ++next;
    }
    if (numbers.size() == count && *next == '\0') return numbers;
    throw Failure(kExitUsage, "'" + text + "' is not " + what + ": that takes " + std::to_string(count) +
                                  " numbers with commas between");
}

std::string Formatted(const char* format, ...) {
    char text[160];
    va_list values;
    va_start(values, format);
    std::vsnprintf(text, sizeof(text), format, values);
    va_end(values);
    return text;
}

} // namespace tool
