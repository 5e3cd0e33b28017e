// The bodies of the YCbCr matrices of Rec. 2020. Whole pixels stay together: a vector holds one or more, with lanes in
// memory order.

#include "colour/ColourKernels.h"
#include "primitives/simd/MultiplyAdd.h"

namespace PK {
namespace PK_TARGET {
namespace {

template <class Convert>
void ForPixelVectors(const float* source, float* destination, int32_t count, const Convert convert) {
    for (; count > 0; count -= kLanes / 4) {
        Store(destination, convert(LoadFloats(source)));
        source += kLanes;
        destination += kLanes;
    }
}

void ToRGB(const float* source, float* destination, int32_t count) {
    const F32 ofV = PixelFloats(0, -0.5713f, 1.4746f, 0), ofU = PixelFloats(1.8814f, -0.1645f, 0, 0);
    ForPixelVectors(source, destination, count, [=](F32 pixels) {
        const F32 V = ShufflePixel<0, 0, 0, 0>(pixels), U = ShufflePixel<1, 1, 1, 1>(pixels);
        return MultiplyAdd(V, ofV, MultiplyAdd(U, ofU, ShufflePixel<2, 2, 2, 3>(pixels)));
    });
}

// The fourth lane of the blue weights is 1 and that of the red ones 0: blue takes the place of alpha.
void FromRGB(const float* source, float* destination, int32_t count) {
    const F32 ofR = PixelFloats(0.5f, -0.1396f, 0.2627f, 0), ofG = PixelFloats(-0.4598f, -0.3604f, 0.678f, 0),
              ofB = PixelFloats(-0.0402f, 0.5f, 0.0593f, 1);
    ForPixelVectors(source, destination, count, [=](F32 pixels) {
        const F32 B = ShufflePixel<0, 0, 0, 0>(pixels), G = ShufflePixel<1, 1, 1, 1>(pixels);
        return MultiplyAdd(B, ofB, MultiplyAdd(G, ofG, ShufflePixel<2, 2, 2, 3>(pixels) * ofR));
    });
}

constexpr YUVKernels kKernels = {ToRGB, FromRGB};

} // namespace
} // namespace PK_TARGET

template <>
const YUVKernels& YUVKernels::For<FloatTarget::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
