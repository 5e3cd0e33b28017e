// The rows of the kernels that are no row kernels of conversion, and their union with those.

#include "register/KernelRegister.h"

#include "colour/ColourKernels.h"
#include "composite/AlphaGainKernels.h"
#include "composite/BlackKernels.h"
#include "composite/BlendKernels.h"
#include "composite/DissolveKernels.h"
#include "composite/MaskKernels.h"
#include "composite/MatteKernels.h"
#include "composite/OverKernels.h"
#include "composite/SumKernels.h"
#include "convert/BridgeKernels.h"
#include "convert/ConvertNV12toYV12Kernels.h"
#include "convert/DVRowKernels.h"
#include "convert/KernelTable.h"
#include "convert/PlanarKernels.h"
#include "dv/DVBlockKernels.h"
#include "dv/DVSampleKernels.h"
#include "filters/BoxBlurKernels.h"
#include "filters/DeinterlaceKernels.h"
#include "filters/GaussianBlurKernels.h"
#include "frame/PixelFormat.h"
#include "geometry/MotionSampleKernels.h"
#include "geometry/WarpSpan.h"
#include "primitives/ALaw.h"
#include "primitives/BlockTransforms.h"
#include "primitives/Channels.h"
#include "primitives/Coefficients.h"
#include "primitives/ConvertFloat.h"
#include "primitives/DVMacroblocks.h"
#include "primitives/DVTransforms.h"
#include "primitives/FillPixels.h"
#include "primitives/MultiplyConstant.h"
#include "primitives/TransposeKernels.h"
#include "primitives/VectorMath.h"
#include "scale/HalveKernels.h"
#include "scale/QuarterScaleKernels.h"

namespace PK {

// Rows of planes, and rows that are summed, whatever their number.
template <>
inline constexpr Shape kShapeOf<PlanesRow> = Shape::SeveralRows;
template <>
inline constexpr Shape kShapeOf<QuarterScaleKernels::Interleave> = Shape::SeveralRows;
template <>
inline constexpr Shape kShapeOf<PlanarEncodeKernels::EncodeRow> = Shape::SeveralRows;
template <>
inline constexpr Shape kShapeOf<SumKernels::Sum> = Shape::SeveralRows;
template <>
inline constexpr Shape kShapeOf<NV12Kernels::PartPairs> = Shape::SeveralRows;

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
    Entry<&DVTransformKernels::inverse88>("LevelsToSamples_88", {SignedWords(64), SignedWords(64)}),
    Entry<&DVTransformKernels::inverse248>("LevelsToSamples_248", {SignedWords(64), SignedWords(64)}),
    Entry<&DVFourBlocksKernels::inverse88>("LevelsOfFourToSamples_88", {SignedWords(64), SignedWords(64)}),
    Entry<&DVFourBlocksKernels::inverse248>("LevelsOfFourToSamples_248", {SignedWords(64), SignedWords(64)}),
    Entry<&DVTransformKernels::half>("LevelsToSamples_Half", {SignedWords(64), SignedWords(16)}),
    Entry<&DVTransformKernels::quarter88>("LevelsToSamples_Quarter88", {SignedWords(64), SignedWords(4)}),
    Entry<&DVTransformKernels::quarter248>("LevelsToSamples_Quarter248", {SignedWords(64), SignedWords(4)}),
    Entry<&DVMacroblockKernels::toBytes>("SamplesToBytes", {SignedWords(64), Bytes(64)}),
    Entry<&DVMacroblockKernels::toYUYV>("SamplesToYUYV", {SignedWords(64), Bytes(32)}),
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

constexpr Operand kUYVY8 = {Samples::Bytes, 4, 2, PK_PixelFormat_UYVY_422_8u};
constexpr Operand kVUYA8 = {Samples::Bytes, 4, 1, PK_PixelFormat_VUYA_4444_8u};

constexpr KernelRow kPlanar[] = {
    Entry<&PlanarDecodeKernels::blendChroma>("BlendChromaRow", {Bytes(1), Bytes(1), Bytes(1)}),
    Entry<&PlanarDecodeKernels::toUYVY>("PlanesToUYVYRow", {Bytes(1), Bytes(1, 2), kUYVY8}),
    Entry<&PlanarDecodeKernels::toVUYXFromEven>("PlanesToVUYXRow_FromEven", {Bytes(1), Bytes(1, 2), kVUYA8}),
    Entry<&PlanarDecodeKernels::toVUYXFromBetween>("PlanesToVUYXRow_FromBetween",
                                                   {Bytes(1), Bytes(1, 2), kVUYA8}),
    Entry<&PlanarDecodeKernels::every1>("PlanesToVUYARow_Every1", {Bytes(1), Bytes(1, 2), kVUYA8}),
    Entry<&PlanarDecodeKernels::every2>("PlanesToVUYARow_Every2", {Bytes(2), Bytes(1), kVUYA8}),
    Entry<&PlanarDecodeKernels::every4>("PlanesToVUYARow_Every4", {Bytes(4), Bytes(2), kVUYA8}),
    Entry<&PlanarDecodeKernels::every8>("PlanesToVUYARow_Every8", {Bytes(8), Bytes(4), kVUYA8}),
    Entry<&DVRowKernels::spread>("ChromaSpreadRow_ToPixels", {Bytes(1, 4), Bytes(1)}),
    Entry<&DVRowKernels::spread2>("ChromaSpreadRow_ToPairs", {Bytes(1, 2), Bytes(1)}),
    Entry<&DVRowKernels::repeat>("ChromaRepeatRow", {Bytes(1, 2), Bytes(1)}),
    Entry<&DVRowKernels::toVUYX>("FullPlanesToVUYXRow", {Bytes(1), Bytes(1), kVUYA8}),
    Entry<&DVRowKernels::toBGRX>("VUYXToBGRXRow_DV", {kVUYA8, kBGRA8}),
    Entry<&PlanarWidenKernels::by3To2>("WidenRow_3To2", {Bytes(2, 3), Floats(3, 3)}),
    Entry<&PlanarWidenKernels::by4To3>("WidenRow_4To3", {Bytes(3, 4), Floats(4, 4)}),
    Entry<&PlanarWidenKernels::lumaTo709>("FloatPlanesToLumaRow_601To709",
                                          {Floats(1), Floats(1, 2), Floats(1)}),
    Entry<&PlanarWidenKernels::uTo709>("FloatChromaRow_601To709_U", {Floats(1), Floats(1), Floats(1)}),
    Entry<&PlanarWidenKernels::vTo709>("FloatChromaRow_601To709_V", {Floats(1), Floats(1), Floats(1)}),
    Entry<&PlanarWidenKernels::toWords>("FloatsToWordsRow", {Floats(1), Words(1)}),
    Entry<&PlanarWidenKernels::toUYVY>("FloatPlanesToUYVYRow", {Floats(1), Floats(1, 2), kUYVY8}),
    Entry<&PlanarWidenKernels::toVUYX>("FloatPlanesToVUYXRow", {Floats(1), Floats(1, 2), kVUYA8}),
    Entry<&PlanarWidenKernels::toBGRX601>("FloatPlanesToBGRXRow_601", {Floats(1), Floats(1, 2), kBGRA8}),
    Entry<&PlanarWidenKernels::toBGRX709>("FloatPlanesToBGRXRow_709", {Floats(1), Floats(1, 2), kBGRA8}),
    Entry<&PlanarEncodeKernels::fromVUYP>("PixelsToPlanesRow_VUYP", {kVUYA8, Bytes(1)}),
    Entry<&PlanarEncodeKernels::fromBGRX601>("PixelsToPlanesRow_BGRX601", {kBGRA8, Bytes(1)}),
    Entry<&PlanarEncodeKernels::fromBGRX709>("PixelsToPlanesRow_BGRX709", {kBGRA8, Bytes(1)}),
    Entry<&PlanarEncodeKernels::fromBGRA601>("PixelsToPlanesRow_BGRA601", {kBGRA8, Bytes(1)}),
    Entry<&PlanarEncodeKernels::fromBGRA709>("PixelsToPlanesRow_BGRA709", {kBGRA8, Bytes(1)}),
    Entry<&PlanarEncodeKernels::u>("ChromaOfSumsRow_U", {Bytes(4), Bytes(4), Bytes(1)}),
    Entry<&PlanarEncodeKernels::v>("ChromaOfSumsRow_V", {Bytes(4), Bytes(4), Bytes(1)}),
};

constexpr KernelRow kNV12[] = {
    Entry<&NV12Kernels::copySurface>("CopySurfaceRow", {Bytes(1), Bytes(1)}),
    Entry<&NV12Kernels::partPairs>("PartPairsRow", {Bytes(2), Bytes(2)}),
};

constexpr KernelRow kOperations[] = {
    Entry<&QuarterScaleKernels::evenBytes>("EvenBytesRow", {Bytes(2), Bytes(1)}),
    Entry<&QuarterScaleKernels::lumaFirst>("InterleavePlanesRow_YUYV", {Bytes(2), Bytes(1), Bytes(4)}),
    Entry<&QuarterScaleKernels::chromaFirst>("InterleavePlanesRow_UYVY", {Bytes(2), Bytes(1), Bytes(4)}),
    Entry<&HalveKernels::HalveRowV210>("HalveRowV210", {{Samples::Bits, 16, 3}, Bytes(4)}),
    Entry<&HalveKernels::HalveRowUYVY32f>("HalveRowUYVY32f", {Floats(4), Floats(4)}),
    Entry<&HalveKernels::HalveRowUYVY8u>("HalveRowUYVY8u", {Bytes(4), Bytes(4)}),
    Entry<&HalveKernels::HalveRowYUYV8u>("HalveRowYUYV8u", {Bytes(4), Bytes(4)}),
    Entry<&MaskKernels::pixels4>("SelectByMaskRow_4", {Bytes(4), Bytes(4), Bytes(4)}),
    Entry<&MaskKernels::pixels8>("SelectByMaskRow_8", {Bytes(8), Bytes(8), Bytes(8)}),
    Entry<&MaskKernels::pixels16>("SelectByMaskRow_16", {Bytes(16), Bytes(16), Bytes(16)}),
    Entry<&BoxBlurKernels::bundle>("BoxBlurBundle", {Bytes(kBundleStep), Bytes(kBundleStep)}),
    Entry<&BoxBlurKernels::line>("BoxBlurLine", {Bytes(4), Bytes(4)}),
    Entry<&GaussianBlurKernels::filterLines>("GaussianBlurLines", {Floats(4), Floats(4)}),
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

// The order of top, back and destination.
constexpr Operands ThreeOf(Operand pixel) {
    return {pixel, pixel, pixel};
}
// By fours from SSE2 on.
constexpr Agreement kByFours = DeclaredFrom(Target::sse2);
constexpr PlaceRule kFromBoundary = {.headAlignment = 16};

constexpr KernelRow kComposites[] = {
    Entry<&OverKernels::straight8u_AA>("StraightOverRow_8u_AA", ThreeOf(kBGRA8), kByFours, kFromBoundary),
    Entry<&OverKernels::straight8u_AX>("StraightOverRow_8u_AX", ThreeOf(kBGRA8), kByFours, kFromBoundary),
    Entry<&OverKernels::straight8u_XA>("StraightOverRow_8u_XA", ThreeOf(kBGRA8), kByFours, kFromBoundary),
    Entry<&OverKernels::straight8u_XX>("StraightOverRow_8u_XX", ThreeOf(kBGRA8), kByFours, kFromBoundary),
    Entry<&OverKernels::premultiplied8u_AA>("PremultipliedOverRow_8u_AA", ThreeOf(kBGRA8), kByFours,
                                            kFromBoundary),
    Entry<&OverKernels::premultiplied8u_AX>("PremultipliedOverRow_8u_AX", ThreeOf(kBGRA8), kByFours,
                                            kFromBoundary),
    Entry<&OverKernels::premultiplied8u_XA>("PremultipliedOverRow_8u_XA", ThreeOf(kBGRA8), kByFours,
                                            kFromBoundary),
    Entry<&OverKernels::premultiplied8u_XX>("PremultipliedOverRow_8u_XX", ThreeOf(kBGRA8), kByFours,
                                            kFromBoundary),
    Entry<&OverKernels::premultipliedYUV8u_AA>("PremultipliedYUVOverRow_8u_AA", ThreeOf(kVUYA8), kByFours,
                                               kFromBoundary),
    Entry<&OverKernels::premultipliedYUV8u_AX>("PremultipliedYUVOverRow_8u_AX", ThreeOf(kVUYA8), kByFours,
                                               kFromBoundary),
    Entry<&OverKernels::premultipliedYUV8u_XA>("PremultipliedYUVOverRow_8u_XA", ThreeOf(kVUYA8), kByFours,
                                               kFromBoundary),
    Entry<&OverKernels::premultipliedYUV8u_XX>("PremultipliedYUVOverRow_8u_XX", ThreeOf(kVUYA8), kByFours,
                                               kFromBoundary),
    Entry<&OverKernels::straight32f_AA>("StraightOverRow_32f_AA", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::straight32f_AX>("StraightOverRow_32f_AX", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::straight32f_XA>("StraightOverRow_32f_XA", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::straight32f_XX>("StraightOverRow_32f_XX", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::premultiplied32f_AA>("PremultipliedOverRow_32f_AA", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::premultiplied32f_AX>("PremultipliedOverRow_32f_AX", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::premultiplied32f_XA>("PremultipliedOverRow_32f_XA", ThreeOf(kBGRA32f)),
    Entry<&OverKernels::premultiplied32f_XX>("PremultipliedOverRow_32f_XX", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::color>("BlendRow_Color", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::colorBurn>("BlendRow_ColorBurn", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::colorDodge>("BlendRow_ColorDodge", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::darken>("BlendRow_Darken", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::darkerColor>("BlendRow_DarkerColor", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::difference>("BlendRow_Difference", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::exclusion>("BlendRow_Exclusion", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::hardLight>("BlendRow_HardLight", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::hardMix>("BlendRow_HardMix", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::hue>("BlendRow_Hue", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::lighten>("BlendRow_Lighten", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::lighterColor>("BlendRow_LighterColor", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::linearBurn>("BlendRow_LinearBurn", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::linearDodge>("BlendRow_LinearDodge", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::linearLight>("BlendRow_LinearLight", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::luminosity>("BlendRow_Luminosity", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::multiply>("BlendRow_Multiply", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::normal>("BlendRow_Normal", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::overlay>("BlendRow_Overlay", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::pinLight>("BlendRow_PinLight", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::saturation>("BlendRow_Saturation", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::screen>("BlendRow_Screen", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::softLight>("BlendRow_SoftLight", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::vividLight>("BlendRow_VividLight", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::subtract>("BlendRow_Subtract", ThreeOf(kBGRA32f)),
    Entry<&BlendKernels::divide>("BlendRow_Divide", ThreeOf(kBGRA32f)),
};

constexpr Operands TwoOf(Operand pixel) {
    return {pixel, pixel};
}
constexpr Operand kBGRA15 = {Samples::Words, 8, 1, PK_PixelFormat_BGRA_4444_15u};

constexpr KernelRow kMattes[] = {
    Entry<&BlackKernels::rgb8u>("OverBlackRow_RGB8u", TwoOf(kBGRA8)),
    Entry<&BlackKernels::rgb8uAlphaFirst>("OverBlackRow_RGB8u_AlphaFirst", TwoOf(kBGRA8)),
    Entry<&BlackKernels::yuv8u>("OverBlackRow_YUV8u", TwoOf(kVUYA8), kByFours, kFromBoundary),
    Entry<&BlackKernels::floats>("OverBlackRow_32f", TwoOf(kBGRA32f)),
    Entry<&BlackKernels::floatsAlphaFirst>("OverBlackRow_32f_AlphaFirst", TwoOf(kBGRA32f)),
    Entry<&AlphaTestKernels::codes>("TestAlphaRow_8u", {kBGRA8, Integers(1)}),
    Entry<&AlphaTestKernels::codesAlphaFirst>("TestAlphaRow_8u_AlphaFirst", {kBGRA8, Integers(1)}),
    Entry<&AlphaTestKernels::floats>("TestAlphaRow_32f", {kBGRA32f, Integers(1)}),
    Entry<&AlphaTestKernels::floatsAlphaFirst>("TestAlphaRow_32f_AlphaFirst", {kBGRA32f, Integers(1)}),
    Entry<&MatteKernels::complement8u>("MatteComplementRow_8u", TwoOf(kBGRA8)),
    Entry<&MatteKernels::complement8uAlphaFirst>("MatteComplementRow_8u_AlphaFirst", TwoOf(kBGRA8)),
    Entry<&MatteKernels::complement15u>("MatteComplementRow_15u", TwoOf(kBGRA15)),
    Entry<&MatteKernels::complement15uAlphaFirst>("MatteComplementRow_15u_AlphaFirst", TwoOf(kBGRA15)),
    Entry<&MatteKernels::complement32f>("MatteComplementRow_32f", TwoOf(kBGRA32f)),
    Entry<&MatteKernels::complement32fAlphaFirst>("MatteComplementRow_32f_AlphaFirst", TwoOf(kBGRA32f)),
    Entry<&MatteKernels::remove8u>("RemoveMatteRow_8u", ThreeOf(kBGRA8)),
    Entry<&MatteKernels::remove8uAlphaFirst>("RemoveMatteRow_8u_AlphaFirst", ThreeOf(kBGRA8)),
    Entry<&MatteKernels::remove15u>("RemoveMatteRow_15u", ThreeOf(kBGRA15)),
    Entry<&MatteKernels::remove15uAlphaFirst>("RemoveMatteRow_15u_AlphaFirst", ThreeOf(kBGRA15)),
    Entry<&MatteKernels::remove32f>("RemoveMatteRow_32f", ThreeOf(kBGRA32f)),
    Entry<&MatteKernels::remove32fAlphaFirst>("RemoveMatteRow_32f_AlphaFirst", ThreeOf(kBGRA32f)),
};

constexpr KernelRow kGainsAndSums[] = {
    Entry<&AlphaGainKernels::straight8u>("AlphaGainRow_Straight8u", {Bytes(4), Bytes(4)}),
    Entry<&AlphaGainKernels::straight32f>("AlphaGainRow_Straight32f", {Floats(4), Floats(4)}),
    Entry<&AlphaGainKernels::premultipliedRGB8u>("AlphaGainRow_PremultipliedRGB8u", {Bytes(4), Bytes(4)}),
    Entry<&AlphaGainKernels::premultipliedVUY8u>("AlphaGainRow_PremultipliedVUY8u", {Bytes(4), Bytes(4)}),
    Entry<&AlphaGainKernels::premultiplied32f>("AlphaGainRow_Premultiplied32f", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 0>("StoreSumOfRows_1", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 1>("StoreSumOfRows_2", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 2>("StoreSumOfRows_3", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 3>("StoreSumOfRows_4", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 4>("StoreSumOfRows_5", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 5>("StoreSumOfRows_6", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 6>("StoreSumOfRows_7", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 7>("StoreSumOfRows_8", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 8>("StoreSumOfRows_9", {Floats(4), Floats(4)}),
    Entry<&SumKernels::store, 9>("StoreSumOfRows_10", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 0>("AddSumOfRows_1", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 1>("AddSumOfRows_2", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 2>("AddSumOfRows_3", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 3>("AddSumOfRows_4", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 4>("AddSumOfRows_5", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 5>("AddSumOfRows_6", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 6>("AddSumOfRows_7", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 7>("AddSumOfRows_8", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 8>("AddSumOfRows_9", {Floats(4), Floats(4)}),
    Entry<&SumKernels::add, 9>("AddSumOfRows_10", {Floats(4), Floats(4)}),
};

constexpr KernelRow kDissolves[] = {
    Entry<&DissolveKernels::opaque8u>("DissolveOpaqueRow_BGRX_8u", ThreeOf(Bytes(4))),
    Entry<&DissolveKernels::opaque15u>("DissolveOpaqueRow_BGRX_15u", ThreeOf(Words(4))),
    Entry<&DissolveKernels::opaque32f>("DissolveOpaqueRow_BGRX_32f", ThreeOf(Floats(4))),
    Entry<&DissolveKernels::opaqueAlphaFirst8u>("DissolveOpaqueRow_XRGB_8u", ThreeOf(Bytes(4))),
    Entry<&DissolveKernels::opaqueAlphaFirst15u>("DissolveOpaqueRow_XRGB_15u", ThreeOf(Words(4))),
    Entry<&DissolveKernels::opaqueAlphaFirst32f>("DissolveOpaqueRow_XRGB_32f", ThreeOf(Floats(4))),
    Entry<&DissolveKernels::straight8u>("DissolveStraightRow_8u", ThreeOf(Bytes(4))),
    Entry<&DissolveKernels::straight15u>("DissolveStraightRow_15u", ThreeOf(Words(4))),
    Entry<&DissolveKernels::straight32f>("DissolveStraightRow_32f", ThreeOf(Floats(4))),
    Entry<&DissolveKernels::premultiplied8u>("DissolvePremultipliedRow_8u", ThreeOf(Bytes(4))),
    Entry<&DissolveKernels::premultiplied15u>("DissolvePremultipliedRow_15u", ThreeOf(Words(4))),
    Entry<&DissolveKernels::premultiplied32f>("DissolvePremultipliedRow_32f", ThreeOf(Floats(4))),
    Entry<&DissolveKernels::v210>("DissolveRow_V210", ThreeOf(kV210)),
};

constexpr KernelRow kDeinterlacing[] = {
    Entry<&DeinterlaceKernels::alphaLast8u>("InterpolateFieldRow_BGRP_8u", ThreeOf(Bytes(4))),
    Entry<&DeinterlaceKernels::alphaLast15u>("InterpolateFieldRow_BGRP_15u", ThreeOf(Words(4))),
    Entry<&DeinterlaceKernels::alphaLast32f>("InterpolateFieldRow_BGRP_32f", ThreeOf(Floats(4))),
    Entry<&DeinterlaceKernels::alphaFirst8u>("InterpolateFieldRow_PRGB_8u", ThreeOf(Bytes(4))),
    Entry<&DeinterlaceKernels::alphaFirst15u>("InterpolateFieldRow_PRGB_15u", ThreeOf(Words(4))),
    Entry<&DeinterlaceKernels::alphaFirst32f>("InterpolateFieldRow_PRGB_32f", ThreeOf(Floats(4))),
};

// A picture of packed pixels in, a line of floats out.
template <auto kMember, size_t... kPlace>
constexpr KernelRow Sampler(const char* name, PK_PixelFormat format) {
    const uint32_t depth = DepthOf(format);
    const Operand pixel = depth == kDepth8u ? Bytes(4) : depth == kDepth15u ? Words(4) : Floats(4);
    return Entry<kMember, kPlace...>(name, {{pixel.samples, pixel.bytes, 1, format}, Floats(4)});
}

constexpr KernelRow kMotion[] = {
    Sampler<&MotionSampleKernels::straight, kMotionRGB8>("SampleMotionRow", PK_PixelFormat_BGRA_4444_8u),
    Sampler<&MotionSampleKernels::straight, kMotionRGB8AlphaFirst>("SampleMotionRow",
                                                                   PK_PixelFormat_ARGB_4444_8u),
    Sampler<&MotionSampleKernels::straight, kMotionYUV8>("SampleMotionRow", PK_PixelFormat_VUYA_4444_8u),
    Sampler<&MotionSampleKernels::straight, kMotion15>("SampleMotionRow", PK_PixelFormat_BGRA_4444_15u),
    Sampler<&MotionSampleKernels::straight, kMotion15AlphaFirst>("SampleMotionRow",
                                                                 PK_PixelFormat_ARGB_4444_15u),
    Sampler<&MotionSampleKernels::straight, kMotionFloats>("SampleMotionRow", PK_PixelFormat_BGRA_4444_32f),
    Sampler<&MotionSampleKernels::straight, kMotionFloatsAlphaFirst>("SampleMotionRow",
                                                                     PK_PixelFormat_ARGB_4444_32f),
    Sampler<&MotionSampleKernels::premultiplied, kMotionRGB8>("SampleMotionRow", PK_PixelFormat_BGRP_4444_8u),
    Sampler<&MotionSampleKernels::premultiplied, kMotionRGB8AlphaFirst>("SampleMotionRow",
                                                                        PK_PixelFormat_PRGB_4444_8u),
    Sampler<&MotionSampleKernels::premultiplied, kMotionYUV8>("SampleMotionRow", PK_PixelFormat_VUYP_4444_8u),
    Sampler<&MotionSampleKernels::premultiplied, kMotion15>("SampleMotionRow", PK_PixelFormat_BGRP_4444_15u),
    Sampler<&MotionSampleKernels::premultiplied, kMotion15AlphaFirst>("SampleMotionRow",
                                                                      PK_PixelFormat_PRGB_4444_15u),
    Sampler<&MotionSampleKernels::premultiplied, kMotionFloats>("SampleMotionRow",
                                                                PK_PixelFormat_BGRP_4444_32f),
    Sampler<&MotionSampleKernels::premultiplied, kMotionFloatsAlphaFirst>("SampleMotionRow",
                                                                          PK_PixelFormat_PRGB_4444_32f),
    Entry<&MotionSampleKernels::scaleLine>("ScaleMotionLineRow", {Floats(4), Floats(4)}),
    Sampler<&MotionResampleKernels::alphaLast>("ResampleMotionRow", PK_PixelFormat_BGRP_4444_32f_Linear),
    Sampler<&MotionResampleKernels::alphaFirst>("ResampleMotionRow", PK_PixelFormat_PRGB_4444_32f_Linear),
};

constexpr KernelRow kDV[] = {
    Entry<&DVSampleKernels::loadYUYV>("LoadDVBlocks_YUYV", {Bytes(256), SignedWords(256)}),
    Entry<&DVSampleKernels::loadUYVY>("LoadDVBlocks_UYVY", {Bytes(256), SignedWords(256)}),
    Entry<&DVBlockKernels::lineDifferences>("DVLineDifferences", {SignedWords(64), Integers(2)}),
    Entry<&DVBlockKernels::greatest>("GreatestOfDVBlock", {SignedWords(64), Integers(1)}),
    Entry<&DVBlockKernels::scale>("ScaleDVBlock", {SignedWords(64), SignedWords(64)}),
    Entry<&DVBlockKernels::sumOfLogarithms>("SumOfDVLogarithms", {SignedWords(64), Integers(1)}),
    Entry<&DVBlockKernels::quantise>("QuantiseDVBlock", {SignedWords(64), Bytes(73)}),
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
    add(kPlanar);
    add(kNV12);
    add(kPrimitives);
    add(kOperations);
    add(kComposites);
    add(kMattes);
    add(kGainsAndSums);
    add(kDissolves);
    add(kDeinterlacing);
    add(kMotion);
    add(kDV);
    add(kColour);
    return all;
}

} // namespace PK
