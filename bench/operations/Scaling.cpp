// Images scaled and converted to half of each side: between pixels, filtered, in light, and by dropping rows and pixels.

#include "operations/Operation.h"

#include <PixelKiln/ScaleConvert.h>

namespace OperationBench {
namespace {

template <PK_PixelFormat kFrom, PK_PixelFormat kTo, int32_t kQuality>
Run Halve(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr int32_t kHalfWidth = kWidth / 2, kHalfHeight = kHeight / 2;
        PK_ScaleConvert(source, PK_PixelFormatPackedRowBytes(kFrom, kWidth), kWidth, kHeight, kFrom, 0,
                        destination, PK_PixelFormatPackedRowBytes(kTo, kHalfWidth), kHalfWidth, kHalfHeight,
                        kTo, 0, kQuality);
    };
}

constexpr PK_PixelFormat kBGRP = PK_PixelFormat_BGRP_4444_8u, kBGRA = PK_PixelFormat_BGRA_4444_8u,
                         kUYVY = PK_PixelFormat_UYVY_422_8u, kV210 = PK_PixelFormat_V210_422_10u;
constexpr size_t kBytes = 4 * static_cast<size_t>(kPixels), kHalfBytes = kBytes / 4,
                 kBytesOfUYVY = kBytes / 2, kBytesOfV210 = static_cast<size_t>(kWidth / 6 * 16) * kHeight;

// clang-format off: one row an operation
const AddOperations add = {
    {"Scaling of BGRP 8u to half the size, quality 2", kBytes, kHalfBytes, Samples::Bytes, Against::Nothing,
     0, Halve<kBGRP, kBGRP, 2>},
    {"Scaling of BGRA 8u to half the size, quality 2", kBytes, kHalfBytes, Samples::Bytes, Against::Nothing,
     0, Halve<kBGRA, kBGRA, 2>},
    {"Scaling of BGRA 8u to half the size, quality 3", kBytes, kHalfBytes, Samples::Bytes, Against::Nothing,
     0, Halve<kBGRA, kBGRA, 3>},
    {"Scaling of BGRA 8u to half the size, quality 5", kBytes, kHalfBytes, Samples::Bytes, Against::Nothing,
     0, Halve<kBGRA, kBGRA, 5>},
    {"Half size of UYVY 8u to VUYP 8u", kBytesOfUYVY, kHalfBytes, Samples::Bytes, Against::Memcpy, 1,
     Halve<kUYVY, PK_PixelFormat_VUYP_4444_8u, 2>},
    {"Half size of UYVY 8u to BGRA 8u", kBytesOfUYVY, kHalfBytes, Samples::Bytes, Against::Peer, 1,
     Halve<kUYVY, kBGRA, 2>},
    {"Half size of V210 to VUYP 8u", kBytesOfV210, kHalfBytes, Samples::Bytes, Against::Memcpy, 1,
     Halve<kV210, PK_PixelFormat_VUYP_4444_8u, 2>},
    {"Half size of V210 to BGRA 8u", kBytesOfV210, kHalfBytes, Samples::Bytes, Against::Nothing, 0,
     Halve<kV210, kBGRA, 2>},
};
// clang-format on

} // namespace
} // namespace OperationBench
