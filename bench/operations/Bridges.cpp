// The codec bridges.

#include "operations/Operation.h"

#include <PixelKiln/CodecBridges.h>
#include <PixelKiln/PixelFormat.h>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;
constexpr int32_t kV210RowBytes = kWidth / 6 * 16;
constexpr size_t kV210Bytes = size_t{kV210RowBytes} * kHeight;

using WholeFrame = PK_Result (*)(const void*, void*, int32_t, int32_t) noexcept;
template <WholeFrame function>
Run Whole(const uint8_t* source, uint8_t* destination) {
    return [=] { function(source, destination, kWidth, kHeight); };
}

Run ToXRGB15(const uint8_t* source, uint8_t* destination) {
    return [=] { PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, kWidth, kHeight); };
}

using ByRows = PK_Result (*)(const void*, int32_t, void*, int32_t, int32_t, int32_t) noexcept;
template <ByRows function, int32_t kSourceRowBytes, int32_t kDestinationRowBytes>
Run Rows(const uint8_t* source, uint8_t* destination) {
    return [=] { function(source, kSourceRowBytes, destination, kDestinationRowBytes, kWidth, kHeight); };
}

Run OffsetChroma(const uint8_t*, uint8_t* image) {
    return [=] { PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(image, 8 * kWidth, kWidth, kHeight); };
}

Run ToBGR(const uint8_t*, uint8_t* image) {
    return [=] { PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(image, 16 * kWidth, kWidth, kHeight); };
}

template <bool kByteSwap>
Run Scale16u(const uint8_t*, uint8_t* image) {
    return [=] { PK_Scale16uBufferTo15uSIMD(image, 8 * kWidth, kWidth, kHeight, kByteSwap); };
}

// Three planes of ten-bit samples that follow each other.
struct W210 {
    explicit W210(const uint8_t* source) : planes{source, source + 2 * kCount, source + 3 * kCount} {}
    const void* planes[3];
    int32_t rowBytes[3] = {2 * kWidth, kWidth, kWidth};
};

using FromW210 = PK_Result (*)(const void* const*, const int32_t*, int32_t, int32_t, void*, int32_t) noexcept;
template <FromW210 function, int32_t kDestinationRowBytes>
Run Planes(const uint8_t* source, uint8_t* destination) {
    return [=, from = W210(source)] {
        function(from.planes, from.rowBytes, kWidth, kHeight, destination, kDestinationRowBytes);
    };
}

Run QuarterVUYX(const uint8_t* source, uint8_t* destination) {
    return [=, from = W210(source)] {
        PK_ConvertW210toQuarterResVUYX_8u(from.planes, from.rowBytes, kWidth, kHeight, destination,
                                          2 * kWidth, 0);
    };
}

// clang-format off: one row an operation
const AddOperations add = {
    {"RGB 8u to BGRA 8u", 3 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Rows<PK_ConvertRGB_444_8uToBGRA_4444_8u, 3 * kWidth, 4 * kWidth>},
    {"DNxHD 16u to RGB 10u", 8 * kCount, 4 * kCount, Samples::Bytes, Against::Memcpy, 0.5,
     Whole<PK_Convert_DNxHD16u_To_RGB_444_10u>},
    {"RGB 10u to DNxHD 16u", 4 * kCount, 8 * kCount, Samples::Bytes, Against::Memcpy, 0.5,
     Whole<PK_Convert_RGB_444_10u_To_DNxHD16u>},
    {"UYVY 10u to V210", 4 * kCount, kV210Bytes, Samples::Words10, Against::Memcpy, 0.5,
     Rows<PK_ConvertUYVY_422_10uToV210_422_10u, 4 * kWidth, kV210RowBytes>},
    {"JPEG 2000 BGR 16u to RGB 10u", 6 * kCount, 4 * kCount, Samples::Bytes, Against::Memcpy, 0.5,
     Rows<PK_Convert_j2k_BGR16u_To_RGB_444_10u, 6 * kWidth, 4 * kWidth>},
    {"JPEG 2000 RGB 10u to BGR 16u", 4 * kCount, 6 * kCount, Samples::Bytes, Against::Memcpy, 0.5,
     Rows<PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u, 4 * kWidth, 6 * kWidth>},
    {"JPEG 2000 V210 to UYVY 16u", kV210Bytes, 4 * kCount, Samples::Bytes, Against::Memcpy, 0.5,
     Rows<PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u, kV210RowBytes, 4 * kWidth>},
    {"JPEG 2000 UYVY 32f offset, in place", 8 * kCount, 8 * kCount, Samples::Floats, Against::Memcpy, 0.5,
     OffsetChroma},
    {"JPEG 2000 ZYX 32f to BGR 32f, in place", 16 * kCount, 16 * kCount, Samples::Floats, Against::Nothing, 0,
     ToBGR},
    {"RGB 16u to XRGB 15u", 6 * kCount, 8 * kCount, Samples::Words10, Against::Nothing, 0, ToXRGB15},
    {"16u to 15u, in place", 8 * kCount, 8 * kCount, Samples::Bytes, Against::Nothing, 0, Scale16u<false>},
    {"big-endian 16u to 15u, in place", 8 * kCount, 8 * kCount, Samples::Bytes, Against::Nothing, 0,
     Scale16u<true>},
    {"W210 to V210", 4 * kCount, kV210Bytes, Samples::Words10, Against::Memcpy, 0.5,
     Planes<PK_ConvertW210toV210, kV210RowBytes>},
    {"W210 to V210 of twice the height", 4 * kCount, 2 * kV210Bytes, Samples::Words10, Against::Memcpy, 0.5,
     Planes<PK_TempConvertW210toV210ToReplacePanasonicLTDebayering, kV210RowBytes>},
    {"W210 to V210 of a quarter", 2 * kCount, kV210Bytes / 4, Samples::Words10, Against::Memcpy, 0.5,
     Planes<PK_QuarterScaleConvertW210toV210, kV210RowBytes / 2>},
    {"W210 to VUYX 8u of a quarter", 2 * kCount, kCount, Samples::Words10, Against::Memcpy, 0.5, QuarterVUYX},
};
// clang-format on

} // namespace
} // namespace OperationBench
