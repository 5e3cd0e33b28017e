// What planar 4:2:0 is decoded to.

#include "convert/Planar420.h"
#include "convert/PlanarSizes.h"

namespace PK {

namespace {

constexpr PK_PixelFormat VUYXOf(PK_PixelFormat format) {
    return IsMatrix601(format) ? PK_PixelFormat_VUYX_4444_8u : PK_PixelFormat_VUYX_4444_8u_709;
}

PK_PixelFormat ChooseFormat(PK_PixelFormat stream, PK_PixelFormat wanted) {
    if ((stream & kRangeMask) == kRangeFull) return PK_PixelFormat_BGRX_4444_8u;
    const bool is8BitYUV = IsYUV(wanted) && DepthOf(wanted) == kDepth8u;
    return VUYXOf(is8BitYUV ? wanted : stream);
}

/// Whether the decoder gives the wanted size.
bool IsOffered(const DecodeTarget& stream, const DecodeTarget& wanted) {
    const int32_t half = stream.height / 2;
    if (WideningOf(stream.width, wanted.width) != Widening::None &&
        (wanted.height == stream.height || wanted.height == half))
        return true;
    return wanted.height == half && wanted.width == stream.width;
}

} // namespace

DecodeTarget ChoosePlanarTarget(const DecodeTarget& stream, const DecodeTarget& wanted, int32_t quality) {
    const PK_PixelFormat format = ChooseFormat(stream.format, wanted.format);
    if (IsOffered(stream, wanted)) return {format, wanted.width, wanted.height};

    const int32_t halfWidth = stream.width / 2, halfHeight = stream.height / 2;
    if (wanted.height > halfHeight || stream.width % 2 != 0 || quality >= kExactSizeQuality)
        return {format, stream.width, stream.height};
    if (IsEvenRatio(stream.height, wanted.height) && StepOfColumns(stream.width, wanted.width) != 0)
        return {format, wanted.width, wanted.height};
    return {format, wanted.width <= halfWidth ? halfWidth : stream.width, halfHeight};
}

} // namespace PK
