#include "Numbers.h"

#include "Failure.h"

#include <charconv>
#include <cmath>
#include <cstdarg>
#include <cstdio>

namespace tool {

std::vector<double> ParseNumbers(const std::string& text, size_t count, const std::string& what) {
    std::vector<double> numbers;
    const char* next = text.data();
    const char* const end = next + text.size();
    while (numbers.size() < count) {
        double number = 0;
        const auto [stop, error] = std::from_chars(next, end, number);
        if (error != std::errc() || !std::isfinite(number)) break;
        numbers.push_back(number);
        next = stop;
        if (next == end || *next != ',' || numbers.size() == count) break;
        ++next;
    }
    if (numbers.size() == count && next == end) return numbers;
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
