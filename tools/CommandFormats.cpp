// pixelkiln formats: the catalogue of pixel formats.

#include "Commands.h"
#include "Formats.h"
#include "Terminal.h"

#include <cstdio>

namespace tool {
namespace {

// Bytes that a pixel takes: exact where groups of pixels share their bytes, as the average of a group.
std::string BytesAPixel(PK_PixelFormat format) {
    constexpr int32_t kWholeGroups = 6; // pixels: whole pairs and whole groups of V210
    if (IsPlanar(format)) return "1.5";
    if (!IsRaster(format)) return "-";
    char text[16];
    std::snprintf(text, sizeof(text), "%.3g",
                  PK_PixelFormatPackedRowBytes(format, kWholeGroups) / double{kWholeGroups});
    return text;
}

std::string Kind(PK_PixelFormat format) {
    return IsRaster(format) ? "raster" : IsPlanar(format) ? "planar" : "DV";
}

std::string FrameBytes(PK_PixelFormat format) {
    const bool fixed = !IsRaster(format) && !IsPlanar(format);
    return fixed ? std::to_string(PK_PixelFormatSize(format, 0, 0)) : "-";
}

} // namespace

void RunFormats(const ListOptions& options) {
    Table table({"number", "name", "kind", "bytes a pixel", "bytes a frame", "first row"});
    for (const PK_PixelFormat format : Catalogue()) {
        char number[16];
        std::snprintf(number, sizeof(number), "0x%x", format);
        table.Add({number, FormatName(format), Kind(format), BytesAPixel(format), FrameBytes(format),
                   PK_IsOriginTopLeft(format) ? "top" : "bottom"});
    }
    Print(options.csv ? table.CSV() : table.Aligned());
}

} // namespace tool
