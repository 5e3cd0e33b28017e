// PK_Deinterlace and PK_DeinterlaceCopy: one field rebuilt from the other, as the mean of its rows or along edges.

#include <PixelKiln/Deinterlace.h>

#include "composite/DissolveChoice.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "filters/DeinterlaceKernels.h"
#include "frame/Arguments.h"
#include "frame/FloatMode.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

constexpr int32_t kAlongEdgesQuality = 4; // and above
constexpr int32_t kConversionQuality = 4;
constexpr float kHalf = 0.5f;

/// Rebuilt row `offset` + i lies between the kept rows i and i + 1, for `between` of them. One more has a kept row on one
/// side: `alone` stands beside the kept row of the same number.
struct Fields {
    SourceImage kept;
    DestinationImage rebuilt;
    int32_t between, offset, alone;
};

/// The images are walked from the top and have two rows at least.
Fields FieldsOf(const SourceImage& source, const DestinationImage& destination, bool rebuildsTop) {
    constexpr int32_t kEven = 1, kOdd = 2;
    const int32_t between = source.height / 2 - 1;
    if (rebuildsTop) return {Field(source, kOdd), Field(destination, kEven), between, 1, 0};
    return {Field(source, kEven), Field(destination, kOdd), between, 0, between};
}

/// The ways of rows to the format in which they are interpolated, from there, and past it.
class FieldPlan {
public:
    bool Build(PK_PixelFormat source, PK_PixelFormat working, PK_PixelFormat destination) {
        return fIn.Build(source, working, kConversionQuality) &&
               fOut.Build(working, destination, kConversionQuality) &&
               fAlone.Build(source, destination, kConversionQuality);
    }

    /// \param interpolate  makes a row of the one above, the one below and the width.
    template <class Interpolate>
    PK_Result Run(const Fields& fields, Interpolate interpolate) const {
        const int32_t width = fields.kept.width;
        RowMemory memory(width);
        memory.AddSource(fIn);
        memory.AddSource(fIn);
        memory.AddSink(fOut);
        memory.AddChain(fAlone);
        return memory.With([&](TemporaryRows& rows) {
            // Two by turns, so that the row below is converted once and serves as the row above next.
            const RowSource kept[] = {{fields.kept, fIn, rows}, {fields.kept, fIn, rows}};
            const RowSink sink(fields.rebuilt, fOut, rows);
            const uint8_t* above = fields.between > 0 ? kept[0].Row(0) : nullptr;
            for (int32_t row = 0; row < fields.between; ++row) {
                const uint8_t* const below = kept[(row + 1) % 2].Row(row + 1);
                interpolate(above, below, sink.Row(fields.offset + row), width);
                sink.Finish(fields.offset + row);
                above = below;
            }
            const FloatMode mode; // that of conversions
            const RowSource alone(fields.kept, fAlone, rows.Scratch());
            alone.ConvertRow(fields.alone, fields.rebuilt.Row(fields.alone));
            return PK_Success;
        });
    }

private:
    ConversionChain fIn, fOut, fAlone;
};

PK_Result RebuildByMeans(const SourceImage& source, const DestinationImage& destination, int32_t field) {
    const DissolveChoice choice =
        ChooseDissolve({source.format, source.format, destination.format}, kConversionQuality);
    FieldPlan plan;
    if (!plan.Build(source.format, choice.working, destination.format)) return PK_ErrFailed;
    const auto mean = [mix = choice.kernel](const uint8_t* above, const uint8_t* below, uint8_t* row,
                                            int32_t width) { mix(above, below, row, width, kHalf); };
    return plan.Run(FieldsOf(source, destination, field != 0), mean);
}

/// 10 bits would fit into 15, where there is a format of 15 bits for them.
uint32_t WorkingDepth(PK_PixelFormat source, PK_PixelFormat destination) {
    const uint32_t depth = DepthOf(destination);
    if (DepthOf(source) != depth) return kDepth32f;
    return depth == kDepth10u ? kDepth15u : depth;
}

TwoRowKernel KernelAlongEdges(PK_PixelFormat working) {
    const DeinterlaceKernels& kernels = Best<DeinterlaceKernels>();
    const bool isFirst = IsOrderReversed(working);
    switch (DepthOf(working)) {
    case kDepth8u:
        return isFirst ? kernels.alphaFirst8u : kernels.alphaLast8u;
    case kDepth15u:
        return isFirst ? kernels.alphaFirst15u : kernels.alphaLast15u;
    default:
        return isFirst ? kernels.alphaFirst32f : kernels.alphaLast32f;
    }
}

PK_Result RebuildAlongEdges(const SourceImage& source, const DestinationImage& destination, int32_t field) {
    const FloatMode mode;
    const PK_PixelFormat working =
        Packed4444(destination.format, kAlphaPremultiplied, WorkingDepth(source.format, destination.format));
    FieldPlan plan;
    if (!plan.Build(source.format, working, destination.format)) return PK_ErrFailed;
    return plan.Run(FieldsOf(source, destination, field == 1), KernelAlongEdges(working));
}

bool CanBeDeinterlaced(PK_PixelFormat format) {
    return IsRasterFormat(format) && (Is422(format) || IsPacked4444(format));
}

PK_Result Rebuild(const SourceImage& source, const DestinationImage& destination, int32_t field,
                  int32_t quality) {
    if (!CanBeDeinterlaced(source.format)) return PK_ErrBadSrcFormat;
    if (!CanBeDeinterlaced(destination.format)) return PK_ErrBadDstFormat;
    if (const auto result = ResultWithoutWork(source.width, source.height,
                                              {source.pixels, destination.pixels}, BelowZero::Refused))
        return *result;
    if (source.height < 2) return PK_Success;

    const auto rebuild = quality < kAlongEdgesQuality ? RebuildByMeans : RebuildAlongEdges;
    return rebuild(FromTop(source), FromTop(destination), field);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_Deinterlace(void* buffer, int32_t rowBytes, PK_PixelFormat format, int32_t width, int32_t height,
                         int32_t field, int32_t quality) noexcept {
    return PK_DeinterlaceCopy(buffer, rowBytes, format, buffer, rowBytes, format, width, height, field,
                              quality);
}

PK_Result PK_DeinterlaceCopy(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                             void* dest, int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                             int32_t height, int32_t field, int32_t quality) noexcept {
    return Rebuild({static_cast<const uint8_t*>(source), sourceRowBytes, sourceFormat, width, height},
                   {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}, field, quality);
}
