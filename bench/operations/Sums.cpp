// Gains, and sums of five images.

#include "operations/Operation.h"

#include <PixelKiln/Accumulate.h>

#include <array>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;
constexpr int32_t kImages = 5;

template <PK_PixelFormat kFormat, int32_t kPixelBytes>
Run Gain(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_AlphaGain(source, kPixelBytes * kWidth, kFormat, destination, kPixelBytes * kWidth, kFormat,
                     kWidth, kHeight, 0.7F, 4);
    };
}

/// The mean of images that lie one behind the other.
template <PK_PixelFormat kFormat, int32_t kPixelBytes>
Run Mean(const uint8_t* source, uint8_t* destination) {
    std::array<const void*, kImages> images;
    std::array<int32_t, kImages> rowBytes;
    std::array<PK_PixelFormat, kImages> formats;
    std::array<double, kImages> weights;
    for (size_t i = 0; i < kImages; ++i) {
        images[i] = source + i * kPixelBytes * kCount;
        rowBytes[i] = kPixelBytes * kWidth;
        formats[i] = kFormat;
        weights[i] = 1.0 / kImages;
    }
    return [=] {
        PK_Accumulate(images.data(), rowBytes.data(), formats.data(), weights.data(), kImages, destination,
                      kPixelBytes * kWidth, kFormat, kWidth, kHeight, 4);
    };
}

// clang-format off: one row an operation
const AddOperations add = {
    {"Gain of BGRA 8u", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Memcpy, 0.7,
     Gain<PK_PixelFormat_BGRA_4444_8u, 4>},
    {"Gain of BGRP 8u", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1,
     Gain<PK_PixelFormat_BGRP_4444_8u, 4>},
    {"Gain of VUYP 8u", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Memcpy, 0.5,
     Gain<PK_PixelFormat_VUYP_4444_8u, 4>},
    {"Gain of BGRA 32f", 16 * kCount, 16 * kCount, Samples::Floats, Against::Memcpy, 0.8,
     Gain<PK_PixelFormat_BGRA_4444_32f, 16>},
    {"Gain of BGRP 32f", 16 * kCount, 16 * kCount, Samples::Floats, Against::Peer, 0.95,
     Gain<PK_PixelFormat_BGRP_4444_32f, 16>},
    {"Mean of five BGRP 8u", 20 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1,
     Mean<PK_PixelFormat_BGRP_4444_8u, 4>},
    {"Mean of five BGRA 8u", 20 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Mean<PK_PixelFormat_BGRA_4444_8u, 4>},
    {"Mean of five BGRP 32f", 80 * kCount, 16 * kCount, Samples::Floats, Against::Peer, 1,
     Mean<PK_PixelFormat_BGRP_4444_32f, 16>},
};
// clang-format on

} // namespace
} // namespace OperationBench
