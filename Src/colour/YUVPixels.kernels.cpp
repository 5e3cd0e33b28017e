// The bodies of the YCbCr matrices of Rec. 2020. Whole pixels stay together: a vector holds one or more, with lanes in
// memory order.

#include "colour/ColourKernels.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/simd/MultiplyAdd.h"

namespace PK {
namespace PK_TARGET {
namespace {

/// The pixels of one vector.
using PixelVector = Groups<kLanes / 4, Each<16>, Each<16>>;

struct YUVToRGB : PixelVector {
    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 pixels = LoadFloats(source);
        const F32 V = ShufflePixel<0, 0, 0, 0>(pixels), U = ShufflePixel<1, 1, 1, 1>(pixels);
        Store(destination, MultiplyAdd(V, fOfV, MultiplyAdd(U, fOfU, ShufflePixel<2, 2, 2, 3>(pixels))));
    }

    F32 fOfV = PixelFloats(0, -0.5713f, 1.4746f, 0), fOfU = PixelFloats(1.8814f, -0.1645f, 0, 0);
};

/// The fourth lane of the blue weights is 1 and that of the red ones 0: blue takes the place of alpha.
struct RGBToYUV : PixelVector {
    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 pixels = LoadFloats(source);
        const F32 B = ShufflePixel<0, 0, 0, 0>(pixels), G = ShufflePixel<1, 1, 1, 1>(pixels);
        Store(destination,
              MultiplyAdd(B, fOfB, MultiplyAdd(G, fOfG, ShufflePixel<2, 2, 2, 3>(pixels) * fOfR)));
    }

    F32 fOfR = PixelFloats(0.5f, -0.1396f, 0.2627f, 0), fOfG = PixelFloats(-0.4598f, -0.3604f, 0.678f, 0),
        fOfB = PixelFloats(-0.0402f, 0.5f, 0.0593f, 1);
};

constexpr YUVKernels kKernels = {Row<YUVToRGB>, Row<RGBToYUV>};

} // namespace
} // namespace PK_TARGET

template <>
const YUVKernels& YUVKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
