// pixelkiln formats: the catalogue of pixel formats.

#include "Formats.h"

#include "Command.h"
#include "Numbers.h"
#include "SharedWords.h"
#include "Terminal.h"

namespace tool {
namespace {

// Bytes that a pixel takes: exact where groups of pixels share their bytes, as the average of a group.
std::string BytesAPixel(PK_PixelFormat format) {
    constexpr int32_t kWholeGroups = 6; // pixels: whole pairs and whole groups of V210
    if (IsPlanar(format)) return "1.5";
    if (!IsRaster(format)) return "-";
    return Formatted("%.3g", PK_PixelFormatPackedRowBytes(format, kWholeGroups) / double{kWholeGroups});
}

std::string Kind(PK_PixelFormat format) {
    return IsRaster(format) ? "raster" : IsPlanar(format) ? "planar" : "DV";
}

std::string FrameBytes(PK_PixelFormat format) {
    const bool fixed = !IsRaster(format) && !IsPlanar(format);
    return fixed ? std::to_string(PK_PixelFormatSize(format, 0, 0)) : "-";
}

void Run(const ListOptions& options) {
    Table table({"number", "name", "kind", "bytes a pixel", "bytes a frame", "first row"});
    for (const PK_PixelFormat format : Catalogue()) {
        table.Add({Formatted("0x%x", format), FormatName(format), Kind(format), BytesAPixel(format),
                   FrameBytes(format), PK_IsOriginTopLeft(format) ? "top" : "bottom"});
    }
    Print(options.csv ? table.CSV() : table.Aligned());
}

const Command sFormats(Group::Listings, "formats", "List the pixel formats", AddListing, Run);

} // namespace
} // namespace tool
