// The bridges to and from a JPEG 2000 codec, but for that of V210.

#include "convert/Bridges.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/CodecBridges.h>

PK_Result PK_Convert_j2k_BGR16u_To_RGB_444_10u(const void* source, int32_t sourceRowBytes, void* destination,
                                               int32_t destinationRowBytes, int32_t width,
                                               int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    ConvertRows(Best<J2KKernels>().bgr16ToRGB10, {source, sourceRowBytes}, {destination, destinationRowBytes},
                width, height);
    return PK_Success;
}

PK_Result PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u(const void* source, int32_t sourceRowBytes,
                                                              void* destination, int32_t destinationRowBytes,
                                                              int32_t width, int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {source, destination})) return *result;
    ConvertRows(Best<J2KKernels>().rgb10ToBGR16, {source, sourceRowBytes}, {destination, destinationRowBytes},
                width, height);
    return PK_Success;
}

PK_Result PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(void* buffer, int32_t rowBytes, int32_t width,
                                                      int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {buffer})) return *result;
    ConvertRows(Best<J2KKernels>().offsetUYVY32f, {buffer, rowBytes}, {buffer, rowBytes}, width, height);
    return PK_Success;
}

PK_Result PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(void* buffer, int32_t rowBytes, int32_t width,
                                                       int32_t height) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutWork(width, height, {buffer})) return *result;
    ConvertRows(Best<J2KKernels>().zyxToBGR32f, {buffer, rowBytes}, {buffer, rowBytes}, width, height);
    return PK_Success;
}
