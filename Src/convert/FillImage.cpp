#include "convert/FillImage.h"

#include "frame/Arguments.h"
#include "frame/Planes.h"
#include "primitives/FillPixels.h"

#include <cstring>

namespace PK {

namespace {

/// A row of a plane is filled bytewise.
void FillPlane(const Plane<uint8_t>& plane, uint8_t code) {
    for (int32_t row = 0; row < plane.height; ++row)
        std::memset(plane.Row(row), code, static_cast<size_t>(plane.width));
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
    switch (DepthOf(format)) {
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
    if (const auto result = ResultWithoutWork(image.width, image.height, {image.pixels}, BelowZero::Refused))
        return *result;
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
    if (const auto result = ResultOfSize(image.width, image.height, BelowZero::Refused)) return *result;
    if (image.pixels == nullptr || !HavePlanesOffsets(image.width, image.height)) return PK_ErrFailed;
    const auto [y, u, v] = PlanesInBlock(image.pixels, image.format, image.width, image.height);
    FillPlane(y, codes.y);
    FillPlane(u, codes.u);
    FillPlane(v, codes.v);
    return PK_Success;
}

} // namespace PK
