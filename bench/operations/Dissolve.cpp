// Mixes of two images.

#include "operations/OpaqueImages.h"
#include "operations/Operation.h"

#include <PixelKiln/CrossDissolve.h>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;

void Mix(const uint8_t* first, const uint8_t* second, uint8_t* destination, int32_t rowBytes,
         PK_PixelFormat format) {
    PK_CrossDissolve(first, rowBytes, format, second, rowBytes, format, destination, rowBytes, format, kWidth,
                     kHeight, kDissolveRatio, 4);
}

Run DissolveOpaque(const uint8_t* source, uint8_t* destination) {
    return [images = MakeOpaqueImages(source), destination] {
        Mix(images->First(), images->Second(), destination, kBGRARowBytes, PK_PixelFormat_BGRA_4444_8u);
    };
}

/// Of two images, one behind the other.
template <PK_PixelFormat kFormat, int32_t kRowBytes>
Run Dissolve(const uint8_t* source, uint8_t* destination) {
    return [=] { Mix(source, source + ptrdiff_t{kRowBytes} * kHeight, destination, kRowBytes, kFormat); };
}

// clang-format off: one row an operation
const AddOperations add = {
    {"Dissolve of opaque BGRA 8u", 8 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1, DissolveOpaque},
    {"Dissolve of BGRA 8u of any alpha", 8 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Dissolve<PK_PixelFormat_BGRA_4444_8u, kBGRARowBytes>},
    {"Dissolve of BGRP 8u", 8 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Dissolve<PK_PixelFormat_BGRP_4444_8u, kBGRARowBytes>},
    {"Dissolve of UYVY 8u", 4 * kCount, 2 * kCount, Samples::Bytes, Against::Nothing, 0,
     Dissolve<PK_PixelFormat_UYVY_422_8u, 2 * kWidth>},
    {"Dissolve of V210", 16 * kCount / 3, 8 * kCount / 3, Samples::Bytes, Against::Nothing, 0,
     Dissolve<PK_PixelFormat_V210_422_10u, 8 * kWidth / 3>},
    {"Dissolve of BGRP 32f", 32 * kCount, 16 * kCount, Samples::Floats, Against::Memcpy, 0.7,
     Dissolve<PK_PixelFormat_BGRP_4444_32f, 4 * kBGRARowBytes>},
};
// clang-format on

} // namespace
} // namespace OperationBench
