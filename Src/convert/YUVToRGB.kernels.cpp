// The matrices from YUV to RGB.

#include "convert/ColourMatrices.h"
#include "convert/ConversionKernels.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/Samples.h"

namespace PK::PK_TARGET {
namespace {

template <const YUVToRGBMatrix& kMatrix>
struct YUVToRGB8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, YUV8ToRGB8<kMatrix>(LoadByteChannels(source)));
    }
};

template <const YUVToRGBMatrix& kMatrix>
struct OpaqueYUVToRGB8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, YUV8ToRGB8<kMatrix>(LoadByteChannels(source)) | Ints(kOpaque));
    }

    static constexpr int32_t kOpaque = -0x01000000; // 0xff000000, alpha 255
};

template <const YUVToRGBMatrix& kMatrix>
struct YUV8ToRGBFloat : PixelGroup<4, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Channels bgra = YUVToRGB<kMatrix>(RemoveOffsets(ToFloat(LoadByteChannels(source))));
        bgra.c3 = bgra.c3 * Floats(kReciprocal255);
        StoreFloatChannels(destination, bgra);
    }
};

template <const YUVToRGBMatrix& kMatrix>
struct OpaqueYUV8ToRGBFloat : PixelGroup<4, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Channels bgra = YUVToRGB<kMatrix>(RemoveOffsets(ToFloat(LoadByteChannels(source))));
        bgra.c3 = Floats(1);
        StoreFloatChannels(destination, bgra);
    }
};

template <const YUVToRGBMatrix& kMatrix>
struct YUVToRGBFloat : PixelGroup<16, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreFloatChannels(destination, YUVToRGB<kMatrix>(LoadFloatChannels(source)));
    }
};

/// The direct kernels exist from SSE2 up: without it the router takes the way over VUYX8uToRGB8uRow.
constexpr RowKernel FromSSE2(RowKernel body) {
    return kTarget == Target::plain ? nullptr : body;
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::YUVToRGBKernels& PK::YUVToRGBKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr YUVToRGBKernels kernels = {
        .YUV601ToRGBRow = Row<YUVToRGB8<kYUV8ToRGB8_601>>,
        .YUV709ToRGBRow = Row<YUVToRGB8<kYUV8ToRGB8_709>>,
        .YUV601ToRGB32fRow = Row<YUV8ToRGBFloat<kYUV8ToRGB601>>,
        .YUV709ToRGB32fRow = Row<YUV8ToRGBFloat<kYUV8ToRGB709>>,
        .YUV601ToRGBFloat32Row = Row<YUVToRGBFloat<kYUVToRGB601>>,
        .YUV709ToRGBFloat32Row = Row<YUVToRGBFloat<kYUVToRGB709>>,
        .VUYX8uToRGB8uRow_601 = Row<OpaqueYUVToRGB8<kYUV8ToRGB8_601>>,
        .VUYX8uToRGB8uRow_709 = Row<OpaqueYUVToRGB8<kYUV8ToRGB8_709>>,
        .VUYX8uToRGB32fRow_601 = Row<OpaqueYUV8ToRGBFloat<kYUV8ToRGB601>>,
        .VUYX8uToRGB32fRow_709 = Row<OpaqueYUV8ToRGBFloat<kYUV8ToRGB709>>,
        .VUYX8uToBGR8uRow_601 = FromSSE2(Row<OpaqueYUVToRGB8<kYUV8ToRGB8_601>>),
        .VUYX8uToBGR8uRow_709 = FromSSE2(Row<OpaqueYUVToRGB8<kYUV8ToRGB8_709>>),
    };
    return kernels;
}
