// Fills with black and white, opaque and transparent.

#include "convert/FillImage.h"
#include "dv/BlackDVFrame.h"

#include <PixelKiln/Fills.h>

#include <algorithm>
#include <cstring>

namespace PK {
namespace {

enum class Shade { Black, White };

struct Colour {
    Shade shade;
    bool isOpaque;
};

constexpr YUVCodes CodesOf(Shade shade) {
    return {128, 128, shade == Shade::White ? uint8_t{235} : uint8_t{16}};
}

/// The values of a depth that stand for nothing and for full, and for the codes of black and white in YUV.
template <class Sample>
struct Levels {
    Sample zero, full;
    Sample chroma, black, white;
};

constexpr Levels<uint8_t> kLevels8 = {0, 255, 128, 16, 235};
constexpr Levels<uint16_t> kLevels15 = {0, 32768, 0, 0, 32768}; // there is no YUV of this depth
constexpr Levels<float> kLevels32f = {0, 1, 0, 0, 1};

/// One unit of four samples: a pixel in memory order, or a pair of pixels.
template <class Sample>
void SetSamples(FillUnit& unit, PK_PixelFormat format, Colour colour, const Levels<Sample>& levels) {
    const bool isWhite = colour.shade == Shade::White;
    const Sample luma = isWhite ? levels.white : levels.black;
    const Sample light = isWhite ? levels.full : levels.zero;
    const Sample alpha = colour.isOpaque ? levels.full : levels.zero;
    Sample pair[4] = {levels.chroma, luma, levels.chroma, luma};
    Sample yuv[4] = {levels.chroma, levels.chroma, luma, alpha};
    Sample rgb[4] = {light, light, light, alpha};
    Sample* samples = Is422(format) ? pair : IsYUV(format) ? yuv : rgb;
    if (IsOrderReversed(format)) std::reverse(samples, samples + 4);
    std::memcpy(unit.bytes, samples, 4 * sizeof(Sample));
}

PK_Result FillRaster(const DestinationImage& image, Colour colour) {
    if (IsV210(image.format))
        return FillWithUnits(image, V210FillUnit(CodesOf(colour.shade)), GroupsOfV210(image.width));
    FillUnit unit = EmptyFillUnit(image.format);
    switch (unit.size) {
    case 4:
        SetSamples(unit, image.format, colour, kLevels8);
        break;
    case 8:
        SetSamples(unit, image.format, colour, kLevels15);
        break;
    case 16:
        SetSamples(unit, image.format, colour, kLevels32f);
        break;
    default:
        return PK_ErrNotSupported;
    }
    return FillWithUnits(image, unit, image.width / unit.pixels);
}

/// Black, whatever the colour, and the whole frame, whatever the size: a frame has its own.
PK_Result FillDV25(const DestinationImage& image) {
    if (image.pixels == nullptr) return PK_ErrFailed;
    std::ranges::copy(BlackDVFrame(image.format), image.pixels);
    return PK_Success;
}

PK_Result FillStream(const DestinationImage& image, Colour colour) {
    if (image.format == PK_PixelFormat_NTSCDV25 || image.format == PK_PixelFormat_PALDV25)
        return FillDV25(image);
    if (StreamKind(image.format) <= kStreamLastDV) return PK_Success; // deliberately left as it is
    if (Is420Planar(image.format)) return FillPlanes(image, CodesOf(colour.shade));
    return PK_ErrBadSrcFormat;
}

PK_Result Fill(const DestinationImage& image, Colour colour) {
    if (!colour.isOpaque) {
        if (HasNoAlphaMeaning(image.format)) return PK_ErrBadDstFormat;
        const bool isPremultiplied = AlphaOf(image.format) == kAlphaPremultiplied;
        if (isPremultiplied) colour.shade = Shade::Black; // what is transparent has no colour then
    }
    return IsStream(image.format) ? FillStream(image, colour) : FillRaster(image, colour);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_FillWithOpaqueBlack(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                 PK_PixelFormat format) noexcept {
    return Fill({static_cast<uint8_t*>(buffer), rowBytes, format, width, height}, {Shade::Black, true});
}

PK_Result PK_FillWithOpaqueWhite(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                 PK_PixelFormat format) noexcept {
    return Fill({static_cast<uint8_t*>(buffer), rowBytes, format, width, height}, {Shade::White, true});
}

PK_Result PK_FillWithTransparentBlack(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                      PK_PixelFormat format) noexcept {
    return Fill({static_cast<uint8_t*>(buffer), rowBytes, format, width, height}, {Shade::Black, false});
}

PK_Result PK_FillWithTransparentWhite(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                      PK_PixelFormat format) noexcept {
    return Fill({static_cast<uint8_t*>(buffer), rowBytes, format, width, height}, {Shade::White, false});
}
