// The bridge from three-byte RGB.

#include "convert/Bridges.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/CodecBridges.h>

PK_Result PK_ConvertRGB_444_8uToBGRA_4444_8u(const void* source, int32_t sourceRowBytes, void* destination,
                                             int32_t destinationRowBytes, int32_t width,
                                             int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    ConvertRows(Best<RGB8Kernels>().toBGRA, {source, sourceRowBytes}, {destination, destinationRowBytes},
                width, height);
    return PK_Success;
}
