// Gaussian blurs of rows and columns, whose cost does not depend on sigma.

#include "operations/Operation.h"

#include <PixelKiln/GaussianBlur.h>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;

template <PK_PixelFormat kFormat, int32_t kRowBytes, int32_t kSigma, int32_t kDirection = 3>
Run Blur(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_GaussianBlur(source, kRowBytes, kWidth, kHeight, kFormat, destination, kRowBytes, kWidth, kHeight,
                        kFormat, kSigma, kSigma, true, false, kDirection, 4);
    };
}

constexpr PK_PixelFormat kBytes = PK_PixelFormat_BGRP_4444_8u, kFloats = PK_PixelFormat_BGRP_4444_32f;

// clang-format off: one row an operation
const AddOperations add = {
    {"Gaussian blur of BGRP 8u, sigma 1", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Blur<kBytes, kBGRARowBytes, 1>},
    {"Gaussian blur of BGRP 8u, sigma 10", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1,
     Blur<kBytes, kBGRARowBytes, 10>},
    {"Gaussian blur of BGRP 8u, sigma 40", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1,
     Blur<kBytes, kBGRARowBytes, 40>},
    {"Gaussian blur of BGRP 8u, sigma 100", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Blur<kBytes, kBGRARowBytes, 100>},
    {"Gaussian blur of BGRA 8u, sigma 10", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Blur<PK_PixelFormat_BGRA_4444_8u, kBGRARowBytes, 10>},
    {"Gaussian blur of rows of BGRP 8u, sigma 10", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing,
     0, Blur<kBytes, kBGRARowBytes, 10, 1>},
    {"Gaussian blur of columns of BGRP 8u, sigma 10", 4 * kCount, 4 * kCount, Samples::Bytes,
     Against::Nothing, 0, Blur<kBytes, kBGRARowBytes, 10, 2>},
    {"Gaussian blur of BGRP 32f, sigma 1", 16 * kCount, 16 * kCount, Samples::Floats, Against::Nothing, 0,
     Blur<kFloats, 4 * kBGRARowBytes, 1>},
    {"Gaussian blur of BGRP 32f, sigma 10", 16 * kCount, 16 * kCount, Samples::Floats, Against::Peer, 1,
     Blur<kFloats, 4 * kBGRARowBytes, 10>},
    {"Gaussian blur of BGRP 32f, sigma 40", 16 * kCount, 16 * kCount, Samples::Floats, Against::Peer, 1,
     Blur<kFloats, 4 * kBGRARowBytes, 40>},
    {"Gaussian blur of BGRP 32f, sigma 100", 16 * kCount, 16 * kCount, Samples::Floats, Against::Nothing, 0,
     Blur<kFloats, 4 * kBGRARowBytes, 100>},
};
// clang-format on

} // namespace
} // namespace OperationBench
