// Sizes, origins and names of formats, and the host's identifiers: arithmetic that touches no image.

#include "results/Formats.h"
#include "results/Lines.h"

#include <PixelKiln/Lifecycle.h>

#include <algorithm>
#include <limits>

namespace {

using namespace PKResults;

constexpr int32_t kLargest = std::numeric_limits<int32_t>::max();
constexpr int32_t kSides[] = {
    0,  1,  2,   3,    4,     5,         6,         7,        16, 17, 31, 45,   48,
    49, 64, 720, 1279, 16384, 134217727, 134217728, kLargest, -1, -2, -7, -720, -kLargest - 1};

void AddNumbers(Line& line, PK_PixelFormat format) {
    for (const int32_t width : kSides) {
        line.results.Add(PK_PixelFormatRowBytes(format, width));
        line.results.Add(PK_PixelFormatPackedRowBytes(format, width));
        for (const int32_t height : kSides) line.results.Add(PK_PixelFormatSize(format, width, height));
    }
    line.results.Add(PK_IsOriginTopLeft(format));
    line.results.Add(PK_IsOriginBottomLeft(format));
    line.results.AddText(PK_PixelFormatName(format));
}

void AddFormat(Lines& lines, PK_PixelFormat format) {
    lines.Add(NameOf(format), [format](Line& line) { AddNumbers(line, format); });
    lines.Add(NameOf(format) + "/top-left", [format](Line& line) {
        PK_SetDebugFlag(10, 1);
        line.results.Add(PK_IsOriginTopLeft(format));
        line.results.Add(PK_IsOriginBottomLeft(format));
        PK_SetDebugFlag(10, 0);
    });
}

void AddFormats(Lines& lines) {
    const auto add = [&](PK_PixelFormat format) { AddFormat(lines, format); };
    std::ranges::for_each(kRasters, add);
    std::ranges::for_each(kStreams, add);
    std::ranges::for_each(kStrangers, add);

    lines.Add("all-low-bits", [](Line& line) {
        for (PK_PixelFormat format = 0; format < 0x4000; ++format) {
            line.results.Add(PK_PixelFormatSize(format, 45, 31));
            line.results.Add(PK_PixelFormatRowBytes(format, 45));
            line.results.Add(PK_PixelFormatPackedRowBytes(format, 45));
            line.results.Add(PK_IsOriginTopLeft(format));
            line.results.AddText(PK_PixelFormatName(format));
        }
    });
    lines.Add("host-identifiers", [](Line& line) {
        for (uint32_t group = 0; group < 32; ++group)
            for (uint32_t place = 0; place < 64; ++place)
                line.results.Add(PK_ZEBPixelFormatToPKPixelFormat({{group, place}}));
    });
}

const Family sFormats("formats", AddFormats, Family::Choice::kProcessor);

} // namespace
