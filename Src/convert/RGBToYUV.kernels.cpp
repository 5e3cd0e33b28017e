// The matrices from RGB to YUV.

#include "convert/ColourMatrices.h"
#include "convert/ConversionKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

template <const RGBToYUVMatrix& kMatrix>
struct RGBToYUV8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, RGB8ToYUV8<kMatrix>(LoadByteChannels(source)));
    }
};

template <const RGBToYUVMatrix& kMatrix>
struct RGBToYUVFloat : PixelGroup<16, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreFloatChannels(destination, RGBToYUV<kMatrix>(LoadFloatChannels(source)));
    }
};

template <const RGBToYUVMatrix& kMatrix>
struct RGBFloatToYUV8 : PixelGroup<16, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Channels codes = AddOffsets(RGBToYUV<kMatrix>(LoadFloatChannels(source)));
        codes.c3 = codes.c3 * Floats(255);
        Store(destination, PackAnyCodes(codes));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::RGBToYUVKernels& PK::RGBToYUVKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr RGBToYUVKernels kernels = {
        .RGBToYUV601Row = Row<RGBToYUV8<kRGB8ToYUV601>>,
        .RGBToYUV709Row = Row<RGBToYUV8<kRGB8ToYUV709>>,
        .RGBToYUV601Float32Row = Row<RGBToYUVFloat<kRGBToYUV601>>,
        .RGBToYUV709Float32Row = Row<RGBToYUVFloat<kRGBToYUV709>>,
        .RGB32fToYUV601_8uRow = Row<RGBFloatToYUV8<kRGBToYUV8_601>>,
        .RGB32fToYUV709_8uRow = Row<RGBFloatToYUV8<kRGBToYUV8_709>>,
    };
    return kernels;
}
