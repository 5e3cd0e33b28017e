#include "convert/FillImage.h"

#include "primitives/FillPixels.h"

#include <PixelKiln/Buffers.h>

#include <cstring>

namespace PK {

namespace {

/// A row of a plane is filled bytewise.
void FillPlane(void* plane, ptrdiff_t rowBytes, int32_t width, int32_t height, uint8_t code) {
    for (ptrdiff_t row = 0; row < height; ++row)
        std::memset(static_cast<uint8_t*>(plane) + row * rowBytes, code, static_cast<size_t>(width));
}

/// The planes of larger images have no offsets in 32 bits.
bool HavePlanesOffsets(int64_t width, int64_t height) {
    return ((width + 127) & ~int64_t{127}) * ((height + 31) & ~int64_t{31}) <= INT32_MAX;
}

template <class Sample, class Fill>
int32_t FillWith(Fill fill, const DestinationImage& image, const FillUnit& unit, int32_t units) {
    Sample samples[4];
    std::memcpy(samples, unit.bytes, sizeof samples);
    return fill(samples, image.pixels, image.rowBytes, units, image.height);
}

} // namespace

FillUnit EmptyFillUnit(PK_PixelFormat format) noexcept {
    const int32_t pixels = Is422(format) ? 2 : 1;
    const bool hasUnit = IsPacked4444(format) || Is422(format);
    switch (format & kDepthMask) {
    case kDepth8u:
        return {{}, hasUnit ? 4 : 0, pixels};
    case kDepth15u:
        return {{}, IsPacked4444(format) ? 8 : 0, pixels};
    case kDepth32f:
        return {{}, hasUnit ? 16 : 0, pixels};
    default:
        return {{}, 0, pixels};
    }
}

FillUnit V210FillUnit(YUVCodes codes) noexcept {
    const uint32_t v = 4u * codes.v, u = 4u * codes.u, y = 4u * codes.y;
    const auto word = [](uint32_t low, uint32_t middle, uint32_t high) {
        return low | middle << 10 | high << 20;
    };
    const uint32_t words[4] = {word(u, y, v), word(y, u, y), word(v, y, u), word(y, v, y)};
    FillUnit unit = {{}, sizeof words, 6};
    std::memcpy(unit.bytes, words, sizeof words);
    return unit;
}

PK_Result FillWithUnits(const DestinationImage& image, const FillUnit& unit, int32_t units) noexcept {
    if (image.width < 0 || image.height < 0) return PK_ErrFailed;
    if (image.width == 0 || image.height == 0) return PK_Success;
    if (image.width > kMaximumWidth) return PK_ErrFailed;
    int32_t status = 0;
    if (unit.size == 4)
        status = FillWith<uint8_t>(FillPixels4x8u, image, unit, units);
    else if (unit.size == 8)
        status = FillWith<uint16_t>(FillPixels4x16u, image, unit, units);
    else
        status = FillWith<float>(FillPixels4x32f, image, unit, units);
    return status == 0 ? PK_Success : PK_ErrFailed;
}

PK_Result FillPlanes(const DestinationImage& image, YUVCodes codes) noexcept {
    if (image.width < 0 || image.height < 0) return PK_ErrFailed;
    if (image.width == 0 || image.height == 0) return PK_Success;
    if (image.pixels == nullptr || !HavePlanesOffsets(image.width, image.height)) return PK_ErrFailed;
    void* planes[3];
    int32_t rowBytes[3];
    const PK_Result result =
        PK_GetPlanarBuffers(image.pixels, image.format, image.width, image.height, planes, rowBytes);
    if (result != PK_Success) return result;
    FillPlane(planes[0], rowBytes[0], image.width, image.height, codes.y);
    FillPlane(planes[1], rowBytes[1], image.width / 2, image.height / 2, codes.u);
    FillPlane(planes[2], rowBytes[2], image.width / 2, image.height / 2, codes.v);
    return PK_Success;
}

} // namespace PK
