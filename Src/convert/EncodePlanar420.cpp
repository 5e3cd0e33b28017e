// Raster images to planar 4:2:0.

#include "convert/ChromaRows.h"
#include "convert/Planar420.h"
#include "convert/PlanarKernels.h"
#include "convert/WorkingRows.h"
#include "primitives/Dispatch.h"

namespace PK {

namespace {

/// The two rows of pixels that a row of chroma is made of.
struct PixelRows {
    int32_t first, second;
};

/// Of fields, the rows of one of them within a group of four. In a last group that has less, its first row stands alone.
PixelRows RowsOfChroma(bool isFieldPicture, int32_t chromaRow, int32_t height) {
    if (!isFieldPicture) return {2 * chromaRow, 2 * chromaRow + 1};
    const int32_t group = chromaRow / 2 * 4;
    const int32_t first = group + chromaRow % 2;
    return {first, group + 4 <= height ? first + 2 : first};
}

/// A last group of fields that has less than four rows makes one row of chroma, of a lone row too: in a block there is room
/// for it.
int32_t ChromaRowsOf(bool isFieldPicture, int32_t height) {
    return isFieldPicture ? height / 4 * 2 + (height % 4 != 0 ? 1 : 0) : height / 2;
}

/// Rows of fields from here on give luma alone.
int32_t FirstRowWithoutChroma(int32_t height) {
    return height / 4 * 4 + (height % 4 != 0 ? 1 : 0);
}

/// A format that rows are encoded from.
struct EncodedFrom {
    PK_PixelFormat format;
    PlanarEncodeKernels::EncodeRow kernel;
};

/// The image's own where there is a kernel for it.
EncodedFrom ChooseWorking(PK_PixelFormat source, PK_PixelFormat stream) {
    const auto& kernels = Best<PlanarEncodeKernels>();
    const bool is601 = IsMatrix601(stream);
    switch (source) {
    case PK_PixelFormat_BGRA_4444_8u:
        return {source, is601 ? kernels.fromBGRA601 : kernels.fromBGRA709};
    case PK_PixelFormat_BGRP_4444_8u:
    case PK_PixelFormat_BGRX_4444_8u:
        return {source, is601 ? kernels.fromBGRX601 : kernels.fromBGRX709};
    default:
        return {is601 ? PK_PixelFormat_VUYP_4444_8u : PK_PixelFormat_VUYP_4444_8u_709, kernels.fromVUYP};
    }
}

class RowEncoder {
public:
    RowEncoder(const RowSource& source, PlanarEncodeKernels::EncodeRow kernel,
               const DestinationPlanes& planes, uint8_t* firstSums, uint8_t* secondSums)
        : fSource(source), fKernel(kernel), fPlanes(planes), fSums{firstSums, secondSums} {}

    static uint64_t BytesOfSums(int32_t width) {
        constexpr int64_t kGroup = PlanarEncodeKernels::kGroup, kBytesOfPixel = 2;
        return static_cast<uint64_t>((width + kGroup - 1) / kGroup * kGroup * kBytesOfPixel);
    }

    /// Gives the sums of the row's chroma.
    const uint8_t* Luma(int32_t row, int32_t sums) const {
        fKernel(fSource.Row(row), fPlanes[0].Row(row), fSums[sums], fPlanes[0].width);
        return fSums[sums];
    }

    void Chroma(int32_t row, const PixelRows& rows) const {
        const uint8_t* const first = Luma(rows.first, 0);
        const uint8_t* const second = rows.second != rows.first ? Luma(rows.second, 1) : first;
        fKernels.u(first, second, fPlanes[1].Row(row), fPlanes[1].width);
        fKernels.v(first, second, fPlanes[2].Row(row), fPlanes[2].width);
    }

private:
    const RowSource& fSource;
    PlanarEncodeKernels::EncodeRow fKernel;
    const DestinationPlanes& fPlanes;
    uint8_t* fSums[2];
    const PlanarEncodeKernels& fKernels = Best<PlanarEncodeKernels>();
};

} // namespace

PK_Result EncodePlanar420(const SourceImage& source, PK_PixelFormat format,
                          const DestinationPlanes& destination, int32_t quality) {
    const EncodedFrom working = ChooseWorking(source.format, format);
    ConversionChain chain;
    if (!chain.Build(source.format, working.format, quality)) return PK_ErrBadSrcFormat;

    const bool isFieldPicture = HasFieldPictures(format);
    const uint64_t bytesOfSums = RowEncoder::BytesOfSums(source.width);
    RowMemory memory(source.width);
    memory.AddSource(chain);
    memory.AddBytes(bytesOfSums);
    memory.AddBytes(bytesOfSums);
    return memory.With([&](TemporaryRows& rows) {
        const RowSource pixels(source, chain, rows);
        const RowEncoder encoder(pixels, working.kernel, destination, rows.Take(bytesOfSums),
                                 rows.Take(bytesOfSums));
        for (int32_t row = 0; row < ChromaRowsOf(isFieldPicture, source.height); ++row)
            encoder.Chroma(row, RowsOfChroma(isFieldPicture, row, source.height));
        if (isFieldPicture)
            for (int32_t row = FirstRowWithoutChroma(source.height); row < source.height; ++row)
                encoder.Luma(row, 0);
        return PK_Success;
    });
}

} // namespace PK
