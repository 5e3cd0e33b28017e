// PK_CompositeToBlack and PK_CompositeToBlackAndTestSourceAlpha: an image over opaque black.

#include <PixelKiln/Fills.h>
#include <PixelKiln/Matte.h>

#include "composite/BlackPlan.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "frame/Arguments.h"
#include "primitives/Dispatch.h"
#include "primitives/Thresholds.h"

namespace PK {
namespace {

std::optional<PK_Result> ResultOfStreams(PK_PixelFormat source, PK_PixelFormat destination) {
    if (IsStream(source)) return PK_ErrBadSrcFormat;
    if (IsStream(destination)) return PK_ErrBadDstFormat;
    return std::nullopt;
}

std::optional<PK_Result> ResultOutsideCatalogue(PK_PixelFormat source, PK_PixelFormat destination) {
    if (!IsRasterFormat(source)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(destination)) return PK_ErrBadDstFormat;
    return std::nullopt;
}

/// Each row by what `show(row, source, sink)` makes of it.
template <class Show>
PK_Result RunRows(const BlackPlan& plan, const SourceImage& from, const DestinationImage& to,
                  const Show& show) {
    RowMemory memory(to.width);
    memory.AddSource(plan.in);
    memory.AddSink(plan.out);
    return memory.With([&](TemporaryRows& rows) {
        const RowSource source(from, plan.in, rows);
        const RowSink sink(to, plan.out, rows);
        for (int32_t row = 0; row < to.height; ++row) show(row, source.Row(row), sink);
        return PK_Success;
    });
}

PK_Result ToBlack(const SourceImage& from, const DestinationImage& to, float opacity, int32_t quality) {
    if (const auto result = ResultOfStreams(from.format, to.format)) return *result;
    if (opacity < kNegligible)
        return PK_FillWithOpaqueBlack(to.pixels, static_cast<int32_t>(to.rowBytes), to.width, to.height,
                                      to.format);
    if (const auto result = ResultOutsideCatalogue(from.format, to.format)) return *result;
    if (const auto result =
            ResultWithoutWork(to.width, to.height, {from.pixels, to.pixels}, BelowZero::Refused))
        return *result;
    const bool isFull = kNegligible + opacity > 1;
    const float amount = isFull ? 1 : opacity;
    BlackPlan plan;
    if (!plan.Build(from.format, to.format, isFull, quality)) return PK_ErrFailed;
    return RunRows(plan, from, to, [&](int32_t row, const uint8_t* source, const RowSink& sink) {
        plan.overBlack(source, sink.Row(row), to.width, amount);
        sink.Finish(row);
    });
}

AlphaTestKernels::Test TestFor(PK_PixelFormat working) {
    const AlphaTestKernels& kernels = Best<AlphaTestKernels>();
    if (DepthOf(working) == kDepth32f)
        return IsOrderReversed(working) ? kernels.floatsAlphaFirst : kernels.floats;
    return IsOrderReversed(working) ? kernels.codesAlphaFirst : kernels.codes;
}

/// How many rows were opaque, and how many transparent.
struct RowCounts {
    int32_t opaque = 0, transparent = 0;

    AlphaTest OfAll(int32_t rows) const {
        if (opaque == rows) return AlphaTest::opaque;
        return transparent == rows ? AlphaTest::transparent : AlphaTest::mixed;
    }
};

/// Rows that are opaque, or transparent, take shortcuts; in place an opaque row is not written.
PK_Result ShowRows(const BlackPlan& plan, const SourceImage& from, const DestinationImage& to,
                   RowCounts& counts) {
    const AlphaTestKernels::Test test = TestFor(plan.working);
    const bool isInPlace =
        from.pixels == to.pixels && from.rowBytes == to.rowBytes && from.format == to.format;
    return RunRows(plan, from, to, [&](int32_t row, const uint8_t* source, const RowSink& sink) {
        switch (test(source, to.width)) {
        case AlphaTest::opaque:
            ++counts.opaque;
            if (!isInPlace) sink.Take(row, source);
            return;
        case AlphaTest::transparent:
            ++counts.transparent;
            if (PK_FillWithOpaqueBlack(to.Row(row), 0, to.width, 1, to.format) == PK_Success) return;
            [[fallthrough]]; // there is no fill of some formats
        case AlphaTest::mixed:
            plan.overBlack(source, sink.Row(row), to.width, 1);
            return sink.Finish(row);
        }
    });
}

PK_Result ToBlackAndTest(const SourceImage& from, const DestinationImage& to, uint32_t* told,
                         int32_t quality) {
    if (const auto result = ResultOfStreams(from.format, to.format)) return *result;
    if (const auto result = ResultOutsideCatalogue(from.format, to.format)) return *result;
    if (told == nullptr) return PK_ErrFailed;
    if (const auto result =
            ResultWithoutWork(to.width, to.height, {from.pixels, to.pixels}, BelowZero::Refused)) {
        if (*result == PK_Success) *told = static_cast<uint32_t>(AlphaTest::opaque);
        return *result;
    }
    BlackPlan plan;
    if (!plan.Build(from.format, to.format, true, quality)) return PK_ErrFailed;
    RowCounts counts;
    const PK_Result result = ShowRows(plan, from, to, counts);
    if (result == PK_Success) *told = static_cast<uint32_t>(counts.OfAll(to.height));
    return result;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_CompositeToBlack(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                              void* dest, int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                              int32_t height, float opacity, int32_t quality) noexcept {
    return ToBlack({static_cast<const uint8_t*>(source), sourceRowBytes, sourceFormat, width, height},
                   {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}, opacity, quality);
}

PK_Result PK_CompositeToBlackAndTestSourceAlpha(const void* source, int32_t sourceRowBytes,
                                                PK_PixelFormat sourceFormat, void* dest, int32_t destRowBytes,
                                                PK_PixelFormat destFormat, int32_t width, int32_t height,
                                                uint32_t* alphaTestResult, int32_t quality) noexcept {
    return ToBlackAndTest({static_cast<const uint8_t*>(source), sourceRowBytes, sourceFormat, width, height},
                          {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height},
                          alphaTestResult, quality);
}
