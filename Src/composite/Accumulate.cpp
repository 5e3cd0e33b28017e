// PK_Accumulate: the weighted sum of any number of images.

#include <PixelKiln/Accumulate.h>

#include "composite/SumKernels.h"
#include "convert/RasterFormats.h"
#include "convert/WorkingRows.h"
#include "frame/Arguments.h"
#include "primitives/Dispatch.h"
#include "primitives/Thresholds.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <span>

namespace PK {
namespace {

constexpr int32_t kLinearQuality = 5; // from which on light is summed

/// The images as the caller tells them: there may be any number, so that nothing is kept for each.
struct Summands {
    const void* const* pixels;
    const int32_t* rowBytes;
    const PK_PixelFormat* formats;
    const double* weights;
    int32_t count;

    SourceImage Image(int32_t i, int32_t width, int32_t height) const {
        return {static_cast<const uint8_t*>(pixels[i]), rowBytes[i], formats[i], width, height};
    }
    float Weight(int32_t i) const { return static_cast<float>(weights[i]); }

    /// Those of the images whose formats are told.
    std::span<const PK_PixelFormat> Formats() const {
        return {formats, formats == nullptr ? 0 : static_cast<size_t>(std::max(count, 0))};
    }
    bool HaveNull() const {
        if (count == 0) return false;
        if (PK::HasNull({pixels, rowBytes, formats, weights})) return true;
        return std::ranges::find(pixels, pixels + count, nullptr) != pixels + count;
    }
};

/// Chains to one format, one for each format that comes up.
class ChainsTo {
public:
    bool Add(PK_PixelFormat from, PK_PixelFormat to, int32_t quality) {
        const auto added = All();
        if (std::ranges::find(added, from, &ConversionChain::source) != added.end()) return true;
        return fChains[fCount++].Build(from, to, quality);
    }

    const ConversionChain& From(PK_PixelFormat format) const {
        return *std::ranges::find(All(), format, &ConversionChain::source);
    }

    std::span<const ConversionChain> All() const { return {fChains.data(), fCount}; }

private:
    std::array<ConversionChain, std::size(kRasterFormats)> fChains;
    size_t fCount = 0;
};

/// The ways to the format that is summed in and from there, and the kernels that sum.
class SumPlan {
public:
    bool Build(std::span<const PK_PixelFormat> sources, PK_PixelFormat destination, int32_t quality) {
        fWorking =
            quality < kLinearQuality ? PK_PixelFormat_BGRP_4444_32f : PK_PixelFormat_BGRP_4444_32f_Linear;
        return std::ranges::all_of(
                   sources, [&](PK_PixelFormat source) { return fIn.Add(source, fWorking, quality); }) &&
               fOut.Build(fWorking, destination, quality);
    }

    PK_Result Run(const Summands& summands, const DestinationImage& destination) const {
        const int32_t slots = std::min(summands.count, kMostSummands);
        RowMemory memory(destination.width);
        for (const ConversionChain& chain : fIn.All()) memory.AddChain(chain);
        memory.AddChain(fOut);
        for (int32_t row = 0; row <= slots; ++row) memory.AddRow(fWorking);
        return memory.With([&](TemporaryRows& rows) {
            Work work = {summands, destination, rows.Scratch(), {}};
            const uint64_t bytes = BytesOfRow(fWorking, destination.width);
            for (int32_t i = 0; i < slots; ++i) work.own[i] = rows.Take(bytes);
            uint8_t* const sum = rows.Take(bytes);
            std::memset(sum, 0, bytes); // that of no images
            // The destination may be a source, which a second group of ten would find written.
            const bool isDirect = fOut.IsCopy() && 0 < slots && slots == summands.count;
            for (int32_t row = 0; row < destination.height; ++row) {
                Sum(work, row, isDirect ? destination.Row(row) : sum);
                if (!isDirect) fOut.ConvertRow(sum, destination.Row(row), destination.width, work.scratch);
            }
            return PK_Success;
        });
    }

private:
    /// The images of a run, and its rows for one group of them.
    struct Work {
        const Summands& summands;
        const DestinationImage& destination;
        ChainScratch scratch;
        uint8_t* own[kMostSummands];
    };

    void Sum(const Work& work, int32_t row, uint8_t* sum) const {
        for (int32_t first = 0; first != work.summands.count;) {
            const int32_t count = std::min(work.summands.count - first, kMostSummands);
            WeightedRow group[kMostSummands];
            for (int32_t i = 0; i < count; ++i) group[i] = Weighted(work, first + i, row, work.own[i]);
            const auto& members = first == 0 ? fSums.store : fSums.add;
            members[count - 1](group, sum, work.destination.width);
            first += count;
        }
    }

    /// A row of one image, where it lies or converted. One that is left out is zeros, and not its samples times 0: an
    /// infinite one would make that no number.
    WeightedRow Weighted(const Work& work, int32_t i, int32_t row, uint8_t* own) const {
        const float weight = work.summands.Weight(i);
        const int32_t width = work.destination.width;
        if (kNegligible > weight) {
            std::memset(own, 0, BytesOfRow(fWorking, width));
            return {own, 1};
        }
        // As in any conversion, only between a bottom-up and a top-down format do rows change their order in memory.
        const SourceImage image = work.summands.Image(i, width, work.destination.height);
        const bool isTurned = PK_IsOriginTopLeft(image.format) != PK_IsOriginTopLeft(work.destination.format);
        const SourceImage view = isTurned ? Reversed(image) : image;
        const ConversionChain& chain = fIn.From(image.format);
        const RowSource source(view, chain, work.scratch);
        if (chain.IsCopy()) return {source.Row(row), weight};
        source.ConvertRow(row, own);
        return {own, weight};
    }

    PK_PixelFormat fWorking = PK_PixelFormat_Invalid;
    ChainsTo fIn;
    ConversionChain fOut;
    const SumKernels& fSums = Best<SumKernels>();
};

PK_Result Accumulate(const Summands& summands, const DestinationImage& destination, int32_t quality) {
    if (!IsRasterFormat(destination.format)) return PK_ErrBadDstFormat;
    if (!std::ranges::all_of(summands.Formats(), IsRasterFormat)) return PK_ErrBadSrcFormat;
    if (summands.count < 0) return PK_ErrFailed;
    if (const auto result = ResultWithoutWork(destination.width, destination.height, {destination.pixels},
                                              BelowZero::Refused))
        return *result;
    if (summands.HaveNull()) return PK_ErrFailed;

    SumPlan plan;
    if (!plan.Build(summands.Formats(), destination.format, quality)) return PK_ErrFailed;
    return plan.Run(summands, destination);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_Accumulate(const void* const* sources, const int32_t* sourceRowBytes,
                        const PK_PixelFormat* sourceFormats, const double* weights, int32_t count, void* dest,
                        int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width, int32_t height,
                        int32_t quality) noexcept {
    return Accumulate({sources, sourceRowBytes, sourceFormats, weights, count},
                      {static_cast<uint8_t*>(dest), destRowBytes, destFormat, width, height}, quality);
}
