// The rows of the kernels that are no row kernels of conversion, and their union with those.

#include "register/KernelRegister.h"

#include "colour/ColourKernels.h"
#include "composite/DissolveKernels.h"
#include "composite/MaskKernels.h"
#include "convert/BridgeKernels.h"
#include "convert/KernelTable.h"
#include "filters/BoxBlurKernels.h"
#include "filters/DeinterlaceKernels.h"
#include "geometry/WarpSpan.h"
#include "primitives/ALaw.h"
#include "primitives/BlockTransforms.h"
#include "primitives/Channels.h"
#include "primitives/Coefficients.h"
#include "primitives/ConvertFloat.h"
#include "primitives/FillPixels.h"
#include "primitives/MultiplyConstant.h"
#include "primitives/TransposeKernels.h"
#include "primitives/VectorMath.h"
#include "scale/QuarterScaleKernels.h"

namespace PK {

// Rows of planes, whatever their number.
template <>
inline constexpr Shape kShapeOf<PlanesRow> = Shape::SeveralRows;
template <>
inline constexpr Shape kShapeOf<QuarterScaleKernels::Interleave> = Shape::SeveralRows;

namespace {

constexpr Operand Bytes(int32_t count, int32_t unit = 1) {
    return {Samples::Bytes, count, unit};
}
constexpr Operand Words(int32_t count, int32_t unit = 1) {
    return {Samples::Words, 2 * count, unit};
}
constexpr Operand SignedWords(int32_t count) {
    return {Samples::SignedWords, 2 * count};
}
constexpr Operand Integers(int32_t count) {
    return {Samples::Integers, 4 * count};
}
constexpr Operand Floats(int32_t count, int32_t unit = 1) {
    return {Samples::Floats, 4 * count, unit};
}
constexpr Operand kBGRA8 = {Samples::Bytes, 4, 1, PK_PixelFormat_BGRA_4444_8u};
constexpr Operand kRGB10 = {Samples::Bits, 4, 1, PK_PixelFormat_RGB_444_10u};
constexpr Operand kV210 = {Samples::Bits, 16, 6, PK_PixelFormat_V210_422_10u};
constexpr Operand kUYVY32f = {Samples::Floats, 8, 1, PK_PixelFormat_UYVY_422_32f};
constexpr Operand kBGRA32f = {Samples::Floats, 16, 1, PK_PixelFormat_BGRA_4444_32f};

// The fused bodies round products and sums once.
constexpr Agreement kUnlessFused = DeclaredFrom(Target::avx2fma);
constexpr PlaceRule kEights = {.group = 8};

constexpr KernelRow kPrimitives[] = {
    Entry<&ALawKernels::toLinear16>("ALawToLinear16Row", {Bytes(1), SignedWords(1)}),
    Entry<&ChannelKernels::replace>("ReplaceChannelRow", {Bytes(1), Bytes(1)}),
    Entry<&ChannelKernels::invertInteger>("InvertChannelRow_Integer", {Bytes(1), Bytes(1)}),
    Entry<&ChannelKernels::invertFloat>("InvertChannelRow_Float", {Floats(1), Floats(1)}),
    Entry<&CoefficientKernels::countZeros8x8>("CountZeros8x8", {SignedWords(64), Integers(1)}),
    Entry<&CoefficientKernels::multiplyScaled16s>("MultiplyScaledRow", {SignedWords(1), SignedWords(1)}),
    Entry<&ConvertFloatKernels::nearestToInt32>("ConvertFloatRow_NearestInt32", {Floats(1), Integers(1)}),
    Entry<&ConvertFloatKernels::truncatedToInt32>("ConvertFloatRow_TruncatedInt32", {Floats(1), Integers(1)}),
    Entry<&ConvertFloatKernels::nearestToInt16>("ConvertFloatRow_NearestInt16", {Floats(1), SignedWords(1)}),
    Entry<&ConvertFloatKernels::truncatedToInt16>("ConvertFloatRow_TruncatedInt16",
                                                  {Floats(1), SignedWords(1)}),
    Entry<&MultiplyConstantKernels::unscaled>("MultiplyConstantRow_Unscaled", {kBGRA8, kBGRA8}),
    Entry<&MultiplyConstantKernels::scaled>("MultiplyConstantRow_Scaled", {kBGRA8, kBGRA8}),
    Entry<&FillKernels::run>("FillRun", {{}, Bytes(1)}),
    Entry<&TransposeKernels::pixels1>("TransposeArea_1", {Bytes(1), Bytes(1)}),
    Entry<&TransposeKernels::pixels2>("TransposeArea_2", {Bytes(2), Bytes(2)}),
    Entry<&TransposeKernels::pixels4>("TransposeArea_4", {Bytes(4), Bytes(4)}),
    Entry<&TransposeKernels::pixels8>("TransposeArea_8", {Bytes(8), Bytes(8)}),
    Entry<&TransposeKernels::pixels16>("TransposeArea_16", {Bytes(16), Bytes(16)}),
    Entry<&TransposeKernels::reverseRow>("ReverseRow", {Bytes(4), Bytes(4)}),
    Entry<&VectorMathKernels::pow>("VectorPowRow", {Floats(1), Floats(1), Floats(1)}),
    Entry<&VectorMathKernels::exp>("VectorExpRow", {Integers(1), Floats(1)}),
    Entry<&VectorMathKernels::divide>("VectorDivideRow", {Integers(1), Integers(1), Integers(1)}),
    Entry<&BlockTransformKernels::forward8x8>("ForwardDCT8x8", {SignedWords(64), SignedWords(64)}),
    Entry<&BlockTransformKernels::inverse8x8>("InverseDCT8x8", {SignedWords(64), SignedWords(64)}),
    Entry<&BlockTransformKernels::forward248>("ForwardDCT248", {SignedWords(64), SignedWords(64)}),
    Entry<&BlockTransformKernels::inverse248>("InverseDCT248", {SignedWords(64), SignedWords(64)}),
};

constexpr KernelRow kBridges[] = {
    Entry<&RGB8Kernels::toBGRA>("RGB8ToBGRARow", {Bytes(3), kBGRA8}),
    Entry<&DNxHDKernels::toRGB10>("DNxHD16uToRGB10Row", {Words(4), kRGB10}),
    Entry<&DNxHDKernels::fromRGB10>("RGB10ToDNxHD16uRow", {kRGB10, Words(4)}),
    Entry<&UYVY10Kernels::toV210>("UYVY10uToV210Row", {Words(12, 6), kV210}, {}, {.group = 6}),
    Entry<&UYVY10Kernels::fromV210>("V210ToUYVY10uRow", {kV210, Words(2)}),
    Entry<&J2KKernels::bgr16ToRGB10>("BGR16uToRGB10Row", {Words(3), kRGB10}),
    Entry<&J2KKernels::rgb10ToBGR16>("RGB10ToBGR16uRow", {kRGB10, Words(3)}),
    Entry<&J2KKernels::offsetUYVY32f>("OffsetUYVY32fRow", {kUYVY32f, kUYVY32f}),
    Entry<&J2KKernels::zyxToBGR32f>("ZYXToBGR32fRow", {kBGRA32f, kBGRA32f}),
    Entry<&Words15uKernels::rgb10WordsToXRGB>("RGB16uToXRGB15uRow", {Words(3), Words(4)},
                                              DeclaredFrom(Target::sse41)),
    Entry<&Words15uKernels::halve>("HalveWordsRow", {Words(4), Words(4)}),
    Entry<&Words15uKernels::swapAndHalve>("SwapAndHalveWordsRow", {Words(4), Words(4)}),
    Entry<&W210Kernels::toV210>("W210ToV210Row", {Words(1), Words(1, 2), kV210}),
    Entry<&W210Kernels::averageToV210>("AverageW210ToV210Row", {Words(1), Words(1, 2), kV210}),
    Entry<&W210Kernels::quarterToV210>("QuarterW210ToV210Row", {Words(2), Words(1), kV210}),
    Entry<&W210Kernels::quarterToVUYX>("QuarterW210ToVUYXRow", {Words(2), Words(1), Bytes(4)}),
};

constexpr KernelRow kOperations[] = {
    Entry<&QuarterScaleKernels::evenBytes>("EvenBytesRow", {Bytes(2), Bytes(1)}),
    Entry<&QuarterScaleKernels::lumaFirst>("InterleavePlanesRow_YUYV", {Bytes(2), Bytes(1), Bytes(4)}),
    Entry<&QuarterScaleKernels::chromaFirst>("InterleavePlanesRow_UYVY", {Bytes(2), Bytes(1), Bytes(4)}),
    Entry<&MaskKernels::pixels4>("SelectByMaskRow_4", {Bytes(4), Bytes(4), Bytes(4)}),
    Entry<&MaskKernels::pixels8>("SelectByMaskRow_8", {Bytes(8), Bytes(8), Bytes(8)}),
    Entry<&MaskKernels::pixels16>("SelectByMaskRow_16", {Bytes(16), Bytes(16), Bytes(16)}),
    Entry<&BoxBlurKernels::bundle>("BoxBlurBundle", {Bytes(kBundleStep), Bytes(kBundleStep)}),
    Entry<&BoxBlurKernels::line>("BoxBlurLine", {Bytes(4), Bytes(4)}),
    Entry<&WarpNearestKernels::featherOver>("WarpSpan_FeatherOver", {Bytes(4), Bytes(4)}),
    Entry<&WarpNearestKernels::copy>("WarpSpan_Copy", {Bytes(4), Bytes(4)}),
    Entry<&WarpNearestKernels::blendBGRA>("WarpSpan_BlendBGRA", {Bytes(4), Bytes(4)}),
    Entry<&WarpNearestKernels::blendVUYA>("WarpSpan_BlendVUYA", {Bytes(4), Bytes(4)}),
    Entry<&WarpNearestKernels::blendOther>("WarpSpan_BlendOther", {Bytes(4), Bytes(4)}),
    Entry<&WarpBilinearKernels::featherOver>("WarpSpan_FeatherOver", {Bytes(4), Bytes(4)}),
    Entry<&WarpBilinearKernels::copy>("WarpSpan_Copy", {Bytes(4), Bytes(4)}),
    Entry<&WarpBilinearKernels::blendBGRA>("WarpSpan_BlendBGRA", {Bytes(4), Bytes(4)}),
    Entry<&WarpBilinearKernels::blendVUYA>("WarpSpan_BlendVUYA", {Bytes(4), Bytes(4)}),
    Entry<&WarpBilinearKernels::blendOther>("WarpSpan_BlendOther", {Bytes(4), Bytes(4)}),
};

constexpr Operands Mixed(Operand samples) {
    return {samples, samples, samples};
}

constexpr KernelRow kDissolves[] = {
    Entry<&DissolveKernels::opaque8u>("DissolveOpaqueRow_BGRX_8u", Mixed(Bytes(4))),
    Entry<&DissolveKernels::opaque15u>("DissolveOpaqueRow_BGRX_15u", Mixed(Words(4))),
    Entry<&DissolveKernels::opaque32f>("DissolveOpaqueRow_BGRX_32f", Mixed(Floats(4))),
    Entry<&DissolveKernels::opaqueAlphaFirst8u>("DissolveOpaqueRow_XRGB_8u", Mixed(Bytes(4))),
    Entry<&DissolveKernels::opaqueAlphaFirst15u>("DissolveOpaqueRow_XRGB_15u", Mixed(Words(4))),
    Entry<&DissolveKernels::opaqueAlphaFirst32f>("DissolveOpaqueRow_XRGB_32f", Mixed(Floats(4))),
    Entry<&DissolveKernels::straight8u>("DissolveStraightRow_8u", Mixed(Bytes(4))),
    Entry<&DissolveKernels::straight15u>("DissolveStraightRow_15u", Mixed(Words(4))),
    Entry<&DissolveKernels::straight32f>("DissolveStraightRow_32f", Mixed(Floats(4))),
    Entry<&DissolveKernels::premultiplied8u>("DissolvePremultipliedRow_8u", Mixed(Bytes(4))),
    Entry<&DissolveKernels::premultiplied15u>("DissolvePremultipliedRow_15u", Mixed(Words(4))),
    Entry<&DissolveKernels::premultiplied32f>("DissolvePremultipliedRow_32f", Mixed(Floats(4))),
    Entry<&DissolveKernels::v210>("DissolveRow_V210", Mixed(kV210)),
};

constexpr KernelRow kDeinterlacing[] = {
    Entry<&DeinterlaceKernels::alphaLast8u>("InterpolateFieldRow_BGRP_8u", Mixed(Bytes(4))),
    Entry<&DeinterlaceKernels::alphaLast15u>("InterpolateFieldRow_BGRP_15u", Mixed(Words(4))),
    Entry<&DeinterlaceKernels::alphaLast32f>("InterpolateFieldRow_BGRP_32f", Mixed(Floats(4))),
    Entry<&DeinterlaceKernels::alphaFirst8u>("InterpolateFieldRow_PRGB_8u", Mixed(Bytes(4))),
    Entry<&DeinterlaceKernels::alphaFirst15u>("InterpolateFieldRow_PRGB_15u", Mixed(Words(4))),
    Entry<&DeinterlaceKernels::alphaFirst32f>("InterpolateFieldRow_PRGB_32f", Mixed(Floats(4))),
};

constexpr KernelRow kColour[] = {
    Entry<&GammaKernels::convert>("ConvertGammaKernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&PQKernels::toRec709>("PQToRec709Kernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&PQKernels::fromRec709>("Rec709ToPQKernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&HLGKernels::toRec709>("HLGToRec709Kernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&HLGKernels::fromRec709>("Rec709ToHLGKernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&YUVKernels::toRGB>("YUVToRGBKernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&YUVKernels::fromRGB>("RGBToYUVKernel", {kBGRA32f, kBGRA32f}, kUnlessFused, kEights),
    Entry<&ClampKernels::clamp>("ClampFloats", {Floats(1), Floats(1)}, {}, {.group = 32}),
};

} // namespace

std::vector<KernelRow> KernelRegister() {
    std::vector<KernelRow> all;
    all.reserve(kKernelCount);
    for (int i = 0; i < kKernelCount; ++i) all.push_back(Info(static_cast<Kernel>(i)));
    const auto add = [&all](std::span<const KernelRow> rows) {
        all.insert(all.end(), rows.begin(), rows.end());
    };
    add(kBridges);
    add(kPrimitives);
    add(kOperations);
    add(kDissolves);
    add(kDeinterlacing);
    add(kColour);
    return all;
}

} // namespace PK
