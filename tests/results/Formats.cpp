#include "results/Formats.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <iterator>

namespace PKResults {

namespace {

bool IsStranger(PK_PixelFormat format) {
    return std::ranges::find(kStrangers, format) != std::end(kStrangers);
}

} // namespace

std::string NameOf(PK_PixelFormat format) {
    if (format == PK_PixelFormat_RGB_444_10u) return "RGB_444_10u"; // which the library does not name
    if (!IsStranger(format)) return PK_PixelFormatName(format);
    std::array<char, 11> text{};
    std::snprintf(text.data(), text.size(), "0x%08x", format);
    return text.data();
}

} // namespace PKResults
