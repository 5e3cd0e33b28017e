// The bridges between V210 and its samples unpacked.

#include "convert/Bridges.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/CodecBridges.h>

#include <cstdlib>
#include <cstring>

namespace PK {
namespace {

constexpr int32_t kGroupPixels = kV210Unit.pixels, kGroupBytes = kV210Unit.bytes;
constexpr size_t kPixelBytes = 4; // two words

/// A last group that is not full, completed by black.
void ConvertPartialGroup(RowKernel convert, const uint8_t* source, uint8_t* destination, int32_t pixels) {
    uint16_t samples[] = {512, 64, 512, 64, 512, 64, 512, 64, 512, 64, 512, 64};
    std::memcpy(samples, source, static_cast<size_t>(pixels) * kPixelBytes);
    convert(samples, destination, kGroupPixels);
}

} // namespace
} // namespace PK

PK_Result PK_ConvertUYVY_422_10uToV210_422_10u(const void* source, int32_t sourceRowBytes, void* destination,
                                               int32_t destinationRowBytes, int32_t width,
                                               int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    const RowKernel convert = Best<UYVY10Kernels>().toV210;
    const SourceRows sourceRows(source, sourceRowBytes);
    const DestinationRows destinationRows(destination, destinationRowBytes);

    const int32_t groups = width / kGroupPixels, rest = width % kGroupPixels;
    const bool hasRoomForRest = std::abs(ptrdiff_t{destinationRowBytes}) >= (groups + 1) * kGroupBytes;
    for (int32_t row = 0; row < height; ++row) {
        convert(sourceRows[row], destinationRows[row], groups * kGroupPixels);
        if (rest > 0 && hasRoomForRest)
            ConvertPartialGroup(convert, sourceRows[row] + groups * kGroupPixels * kPixelBytes,
                                destinationRows[row] + groups * kGroupBytes, rest);
    }
    return PK_Success;
}

PK_Result PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u(const void* source, int32_t sourceRowBytes,
                                                        void* destination, int32_t destinationRowBytes,
                                                        int32_t width, int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    ConvertRows(Best<UYVY10Kernels>().fromV210, {source, sourceRowBytes}, {destination, destinationRowBytes},
                width, height);
    return PK_Success;
}
