// Fills with the colour of a pixel of any format.

#include "convert/FillImage.h"
#include "convert/RasterFormats.h"
#include "frame/Arguments.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Fills.h>

#include <cstring>

namespace PK {
namespace {

constexpr int32_t kQuality = 4;
constexpr int32_t kLargestPixel = 16;

/// The colour twice over, as a row of two pixels. Even one pixel of a 4:2:2 format is then a whole pair.
struct ColourPair {
    uint8_t bytes[2 * kLargestPixel] = {};
    PK_PixelFormat format;

    ColourPair(const void* pixel, PK_PixelFormat pixelFormat) : format(pixelFormat) {
        const auto size = static_cast<size_t>(BytesPerPixel(format));
        std::memcpy(bytes, pixel, size);
        std::memcpy(bytes + size, pixel, size);
    }

    PK_Result ConvertTo(PK_PixelFormat to, int32_t pixels, void* destination) const {
        return PK_Convert(bytes, 0, format, destination, 0, to, pixels, 1, kQuality);
    }
};

/// The codes of the colour in a format of 8-bit pixels in the order of VUYA.
PK_Result CodesOf(const ColourPair& colour, PK_PixelFormat format, YUVCodes& codes) {
    uint8_t pixel[4];
    const PK_Result result = colour.ConvertTo(format, 1, pixel);
    if (result == PK_Success) codes = {pixel[0], pixel[1], pixel[2]};
    return result;
}

PK_Result FillUnits(const DestinationImage& image, const ColourPair& colour) {
    FillUnit unit = EmptyFillUnit(image.format);
    const PK_Result result = colour.ConvertTo(image.format, unit.pixels, unit.bytes);
    if (result != PK_Success) return result;
    return FillWithUnits(image, unit, image.width / unit.pixels);
}

PK_Result FillPlanar(const DestinationImage& image, const ColourPair& colour) {
    const PK_PixelFormat pixelFormat =
        IsMatrix601(image.format) ? PK_PixelFormat_VUYP_4444_8u : PK_PixelFormat_VUYP_4444_8u_709;
    YUVCodes codes;
    const PK_Result result = CodesOf(colour, pixelFormat, codes);
    return result == PK_Success ? FillPlanes(image, codes) : result;
}

/// The first row goes to the end of its last group, the rows below it only as far as groups are whole; and a
/// complete fill is told as a refused destination. Both are deliberate: callers rely on them.
PK_Result FillV210(const DestinationImage& image, const ColourPair& colour) {
    YUVCodes codes;
    const PK_Result converted = CodesOf(colour, PK_PixelFormat_VUYA_4444_8u, codes);
    if (converted != PK_Success) return converted;
    const FillUnit unit = V210FillUnit(codes);
    DestinationImage rows = image;
    rows.height = 1;
    PK_Result result = FillWithUnits(rows, unit, GroupsOfV210(image.width));
    if (result == PK_Success && image.height > 1) {
        rows.pixels = image.Row(1);
        rows.height = image.height - 1;
        result = FillWithUnits(rows, unit, image.width / unit.pixels);
    }
    return result == PK_Success ? PK_ErrBadDstFormat : result;
}

bool CanBeFilled(PK_PixelFormat format) {
    if (IsStream(format)) return Is420Planar(format);
    return IsRasterFormat(format) && (IsV210(format) || EmptyFillUnit(format).size != 0);
}

bool HasPixel(PK_PixelFormat format) {
    return IsRasterFormat(format) && BytesPerPixel(format) != 0;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_FillWithColor(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                           PK_PixelFormat format, const void* pixel, PK_PixelFormat pixelFormat) noexcept {
    if (!CanBeFilled(format)) return PK_ErrBadDstFormat;
    if (!HasPixel(pixelFormat)) return PK_ErrBadSrcFormat;
    if (const auto result = ResultOfSize(width, height, BelowZero::Refused))
        return *result == PK_Success && IsV210(format) ? PK_ErrBadDstFormat : *result;
    if (HasNull({buffer, pixel})) return PK_ErrFailed;

    const DestinationImage image = {static_cast<uint8_t*>(buffer), rowBytes, format, width, height};
    const ColourPair colour(pixel, pixelFormat);
    if (IsStream(format)) return FillPlanar(image, colour);
    return IsV210(format) ? FillV210(image, colour) : FillUnits(image, colour);
}
