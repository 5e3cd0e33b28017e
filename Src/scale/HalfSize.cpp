#include "scale/HalfSize.h"

#include "convert/WorkingRows.h"
#include "primitives/Dispatch.h"

#include <algorithm>

namespace PK {
namespace {

struct Rule {
    bool (*applies)(PK_PixelFormat source);
    Halving halving; ///< with the format of matrix 601
};

// YUYV of floats is taken for UYVY. Deliberate: it is a step of conversion that hosts have no identifier for, and whoever
// hands it over knows the places of the samples from here.
constexpr Rule kRules[] = {
    {[](PK_PixelFormat format) { return IsV210(format); },
     {&HalveKernels::HalveRowV210, "HalveRowV210", PK_PixelFormat_VUYP_4444_8u}},
    {[](PK_PixelFormat format) { return DepthOf(format) == kDepth32f; },
     {&HalveKernels::HalveRowUYVY32f, "HalveRowUYVY32f", PK_PixelFormat_VUYP_4444_32f}},
    {[](PK_PixelFormat format) { return !IsOrderReversed(format); },
     {&HalveKernels::HalveRowUYVY8u, "HalveRowUYVY8u", PK_PixelFormat_VUYP_4444_8u}},
    {[](PK_PixelFormat) { return true; },
     {&HalveKernels::HalveRowYUYV8u, "HalveRowYUYV8u", PK_PixelFormat_VUYP_4444_8u}},
};

} // namespace

Halving HalvingOf(PK_PixelFormat source) {
    Halving halving =
        std::ranges::find_if(kRules, [source](const Rule& rule) { return rule.applies(source); })->halving;
    const bool is601 = IsYUV(source) && IsMatrix601(source);
    halving.format = With(halving.format, kCodingMask, is601 ? kCodingYUV601 : kCodingYUV709);
    return halving;
}

PK_Result HalveImage(const SourceImage& source, int32_t field, const DestinationImage& destination,
                     int32_t quality) {
    const Halving halving = HalvingOf(source.format);
    ConversionChain chain;
    if (!chain.Build(halving.format, destination.format, quality)) return PK_ErrFailed;
    const RowKernel halve = Best<HalveKernels>().*halving.kernel;
    // The source's last row is the destination's first, whatever counts as the origin of formats.
    const SourceImage rows = Field(Reversed(source), field == 1 ? 2 : 1);

    RowMemory memory(destination.width);
    memory.AddSink(chain);
    return memory.With([&](TemporaryRows& temporary) {
        const RowsAhead ahead(rows);
        const RowSink sink(destination, chain, temporary);
        for (int32_t row = 0; row < destination.height; ++row) {
            ahead.Fetch(row + 1);
            halve(rows.Row(row), sink.Row(row), destination.width);
            sink.Finish(row);
        }
        return PK_Success;
    });
}

} // namespace PK
