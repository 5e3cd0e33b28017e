// PK_Transpose and PK_RotateImage: moves of whole pixels.

#include <PixelKiln/Rotate.h>

#include "frame/Arguments.h"
#include "frame/PixelFormat.h"
#include "primitives/Dispatch.h"
#include "primitives/TransposeKernels.h"

namespace PK {
namespace {

/// A step between rows in whole pixels; what is left over is dropped.
int64_t WholePixels(int32_t rowBytes, int32_t pixelBytes) {
    return int64_t{rowBytes} / pixelBytes * pixelBytes;
}

/// The area with its source rows, or its destination rows, in the other order.
TransposeArea FromLastSourceRow(TransposeArea area) {
    area.source += (area.rows - 1) * area.sourceStep;
    area.sourceStep = -area.sourceStep;
    return area;
}
TransposeArea FromLastDestinationRow(TransposeArea area) {
    area.destination += (area.columns - 1) * area.destinationStep;
    area.destinationStep = -area.destinationStep;
    return area;
}

void TurnHalf(const TransposeArea& area) {
    const TransposeKernels& kernels = Best<TransposeKernels>();
    for (int32_t row = 0; row < area.rows; ++row)
        kernels.reverseRow(area.source + row * area.sourceStep,
                           area.destination + (area.rows - 1 - row) * area.destinationStep, area.columns);
}

constexpr bool IsPacked8u(PK_PixelFormat format) {
    return IsPacked4444(format) && DepthOf(format) == kDepth8u;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_Transpose(const void* source, int32_t sourceRowBytes, void* dest, int32_t destRowBytes,
                       int32_t width, int32_t height, uint8_t pixelBytes) noexcept {
    const TransposeKernels::Run kernel = Best<TransposeKernels>().OfPixels(pixelBytes);
    if (!kernel) return PK_ErrBadSrcFormat;
    if (const auto result = ResultOfSize(width, height, BelowZero::Refused)) return *result;
    if (HasNull({source, dest})) return PK_ErrFailed;

    // Deliberate: only the vector bodies for pixels from 4 bytes on take steps that are no multiple of the pixel as
    // they are.
    const int32_t unit = BestTarget() != Target::plain && pixelBytes >= 4 ? 1 : pixelBytes;
    kernel({static_cast<const uint8_t*>(source), WholePixels(sourceRowBytes, unit),
            static_cast<uint8_t*>(dest), WholePixels(destRowBytes, unit), height, width});
    return PK_Success;
}

PK_Result PK_RotateImage(const void* source, int32_t sourceRowBytes, void* dest, int32_t destRowBytes,
                         int32_t width, int32_t height, PK_PixelFormat format, int32_t degrees) noexcept {
    if (!IsPacked8u(format)) return PK_ErrBadSrcFormat;
    if (degrees == 0 || degrees % 90 != 0 || degrees < -270 || degrees > 270) return PK_ErrFailed;
    if (const auto result = ResultOfSize(width, height, BelowZero::Empty)) return *result;
    if (HasNull({source, dest})) return PK_ErrFailed;

    const TransposeArea area = {static_cast<const uint8_t*>(source),
                                WholePixels(sourceRowBytes, 4),
                                static_cast<uint8_t*>(dest),
                                WholePixels(destRowBytes, 4),
                                height,
                                width};
    const TransposeKernels::Run transpose = Best<TransposeKernels>().pixels4;
    switch (degrees < 0 ? degrees + 360 : degrees) {
    case 90:
        transpose(FromLastSourceRow(area));
        break;
    case 180:
        TurnHalf(area);
        break;
    default: // 270
        transpose(FromLastDestinationRow(area));
        break;
    }
    return PK_Success;
}
