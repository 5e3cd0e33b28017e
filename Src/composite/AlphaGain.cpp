// PK_AlphaGain: an image scaled by a gain. PK_IsOpacityNOP: where an opacity has nothing to scale.

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/Fills.h>

#include "composite/AlphaGainKernels.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "frame/Arguments.h"
#include "primitives/Dispatch.h"
#include "primitives/Thresholds.h"

#include <cmath>

namespace PK {
namespace {

struct GainMethod {
    PK_PixelFormat working;
    AlphaGainKernels::Gain AlphaGainKernels::*kernel;
};

constexpr int32_t kFloatQuality = 3; // from which on YUV beyond 8 bits is scaled in float

/// Pixels of the destination that a kernel takes as they are.
GainMethod MethodOfPixels(PK_PixelFormat format) {
    const bool isStraight = AlphaOf(format) == kAlphaStraight;
    if (DepthOf(format) == kDepth32f)
        return {format, isStraight ? &AlphaGainKernels::straight32f : &AlphaGainKernels::premultiplied32f};
    if (isStraight) return {format, &AlphaGainKernels::straight8u};
    return {format,
            IsYUV(format) ? &AlphaGainKernels::premultipliedVUY8u : &AlphaGainKernels::premultipliedRGB8u};
}

/// Pixels that are converted. Deliberately crosswise: all channels of a straight format are scaled, and of a
/// premultiplied one only alpha. Callers compare against both.
GainMethod MethodOfConverted(PK_PixelFormat destination, int32_t quality) {
    const uint32_t depth = DepthOf(destination);
    if (!IsYUV(destination)) {
        if (depth == kDepth32f) return {PK_PixelFormat_BGRA_4444_32f, &AlphaGainKernels::premultiplied32f};
        return {PK_PixelFormat_BGRA_4444_8u, &AlphaGainKernels::straight8u};
    }
    if (depth != kDepth8u && quality >= kFloatQuality)
        return {PK_PixelFormat_VUYP_4444_32f, &AlphaGainKernels::straight32f};
    return {PK_PixelFormat_VUYP_4444_8u, &AlphaGainKernels::straight8u};
}

GainMethod MethodFor(PK_PixelFormat destination, int32_t quality) {
    const uint32_t depth = DepthOf(destination);
    const bool hasKernels = IsPacked4444(destination) && !IsOrderReversed(destination) &&
                            (depth == kDepth8u || depth == kDepth32f);
    return hasKernels ? MethodOfPixels(destination) : MethodOfConverted(destination, quality);
}

/// The ways to the format that the gain is applied in and from there, and the kernel that applies it.
class AlphaGainPlan {
public:
    bool Build(PK_PixelFormat source, PK_PixelFormat destination, float gain, int32_t quality) {
        const GainMethod method = MethodFor(destination, quality);
        fKernel = Best<AlphaGainKernels>().*method.kernel;
        fGain = gain;
        return fIn.Build(source, method.working, quality) && fOut.Build(method.working, destination, quality);
    }

    /// Rows from `firstRow` up to `endRow` of images in the formats of the plan.
    PK_Result Run(const SourceImage& from, const DestinationImage& to, int32_t firstRow,
                  int32_t endRow) const {
        RowMemory memory(to.width);
        memory.AddSource(fIn);
        memory.AddSink(fOut);
        return memory.With([&](TemporaryRows& rows) {
            const RowSource source(from, fIn, rows);
            const RowSink sink(to, fOut, rows);
            for (int32_t row = firstRow; row < endRow; ++row) {
                fKernel(source.Row(row), sink.Row(row), to.width, fGain);
                sink.Finish(row);
            }
            return PK_Success;
        });
    }

private:
    ConversionChain fIn, fOut;
    AlphaGainKernels::Gain fKernel = nullptr;
    float fGain = 1;
};

PK_Result ScaleByGain(const SourceImage& source, const DestinationImage& destination, float gain,
                      int32_t quality) {
    if (const auto result = ResultWithoutWork(destination.width, destination.height,
                                              {source.pixels, destination.pixels}, BelowZero::Refused))
        return *result;
    AlphaGainPlan plan;
    if (!plan.Build(source.format, destination.format, gain, quality)) return PK_ErrFailed;
    return plan.Run(source, destination, 0, destination.height);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_AlphaGain(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat, void* dest,
                       int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width, int32_t height,
                       float gain, int32_t quality) noexcept {
    if (!IsRasterFormat(sourceFormat)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(destFormat)) return PK_ErrBadDstFormat;
    if (kNegligible > gain) return PK_FillWithTransparentBlack(dest, destRowBytes, width, height, destFormat);
    return ScaleByGain({static_cast<const uint8_t*>(source), sourceRowBytes, sourceFormat, width, height},
                       {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}, gain, quality);
}

bool PK_IsOpacityNOP(PK_BlendMode blendMode, float opacity) noexcept {
    const bool isTopAtFull = blendMode == PK_BlendMode_Dissolve || blendMode == PK_BlendMode_Normal;
    return isTopAtFull && std::abs(opacity - 1.0f) < kNegligible;
}
