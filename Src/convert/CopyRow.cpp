#include "convert/CopyRow.h"

#include <PixelKiln/Buffers.h>

namespace PK {
namespace {

/// Copies the units that `width` pixels take up: a pair for 4:2:2, a group of six for V210, else a pixel.
template <int32_t kUnitPixels, int32_t kUnitBytes>
void CopyRow(const void* source, void* destination, int32_t width) {
    const int64_t units = (int64_t{width} + kUnitPixels - 1) / kUnitPixels;
    PK_CopyMemory(destination, source, static_cast<uint64_t>(units * kUnitBytes));
}

} // namespace

constinit const CopyKernels CopyKernels::kBodies = {
    .CopyRow_4444_8u = CopyRow<1, 4>,
    .CopyRow_4444_15u = CopyRow<1, 8>,
    .CopyRow_4444_32f = CopyRow<1, 16>,
    .CopyRow_422_8u = CopyRow<2, 4>,
    .CopyRow_422_32f = CopyRow<2, 16>,
    .CopyRow_V210 = CopyRow<6, 16>,
};
constinit const CopyKernels CopyKernels::kNone = {};

} // namespace PK
