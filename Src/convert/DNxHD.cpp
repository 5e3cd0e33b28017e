// The bridges between four-word pixels and ten-bit RGB. Rows follow each other without a gap at both ends.

#include "convert/Bridges.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/CodecBridges.h>

PK_Result PK_Convert_DNxHD16u_To_RGB_444_10u(const void* source, void* destination, int32_t width,
                                             int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    ConvertRows(Best<DNxHDKernels>().toRGB10, {source, ptrdiff_t{8} * width},
                {destination, ptrdiff_t{4} * width}, width, height);
    return PK_Success;
}

PK_Result PK_Convert_RGB_444_10u_To_DNxHD16u(const void* source, void* destination, int32_t width,
                                             int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    ConvertRows(Best<DNxHDKernels>().fromRGB10, {source, ptrdiff_t{4} * width},
                {destination, ptrdiff_t{8} * width}, width, height);
    return PK_Success;
}
