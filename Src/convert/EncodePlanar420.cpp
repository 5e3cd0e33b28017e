// Raster images to planar 4:2:0.

#include "convert/ChromaRows.h"
#include "convert/ConvertNV12toYV12Kernels.h"
#include "convert/Planar420.h"
#include "convert/WorkingRows.h"
#include "primitives/Dispatch.h"

namespace PK {

namespace {

/// The two rows of pixels that a row of chroma is made of.
struct PixelRows {
    int32_t first, second;
};

/// Of fields, the rows of one of them within a group of four. In a last group that has less, a row stands alone.
PixelRows RowsOfChroma(bool isFieldPicture, int32_t chromaRow, int32_t height) {
    if (!isFieldPicture) return {2 * chromaRow, 2 * chromaRow + 1};
    const int32_t group = chromaRow / 2 * 4;
    const int32_t first = group + chromaRow % 2;
    return {first, group + 4 <= height ? first + 2 : first};
}

/// Rows of fields from here on give luma alone.
int32_t FirstRowWithoutChroma(int32_t height) {
    return height / 4 * 4 + height % 4 / 2;
}

class RowEncoder {
public:
    RowEncoder(const RowSource (&sources)[2], const DestinationPlanes& planes, uint8_t* chroma)
        : fSources(sources), fPlanes(planes), fChroma(chroma) {}

    /// Gives the row of pixels, which stays until the next of the same source is encoded.
    const uint8_t* Luma(int32_t row, int32_t source) const {
        const uint8_t* const pixels = fSources[source].Row(row);
        fKernels.luma(pixels, fPlanes[0].Row(row), fPlanes[0].width);
        return pixels;
    }

    void Chroma(int32_t row, const PixelRows& rows) const {
        const uint8_t* const first = Luma(rows.first, 0);
        const uint8_t* const second = rows.second != rows.first ? Luma(rows.second, 1) : first;
        const int32_t pairs = fPlanes[1].width;
        fKernels.chroma(first, second, fChroma, 2 * pairs);
        fParting.partPairs(fChroma, fPlanes[1].Row(row), fPlanes[2].Row(row), pairs);
    }

private:
    const RowSource (&fSources)[2];
    const DestinationPlanes& fPlanes;
    uint8_t* fChroma;
    const PlanarEncodeKernels& fKernels = Best<PlanarEncodeKernels>();
    const NV12Kernels& fParting = Best<NV12Kernels>();
};

} // namespace

PK_Result EncodePlanar420(const SourceImage& source, PK_PixelFormat format,
                          const DestinationPlanes& destination, int32_t quality) {
    const PK_PixelFormat working =
        IsMatrix601(format) ? PK_PixelFormat_VUYP_4444_8u : PK_PixelFormat_VUYP_4444_8u_709;
    ConversionChain chain;
    if (!chain.Build(source.format, working, quality)) return PK_ErrBadSrcFormat;

    const bool isFieldPicture = HasFieldPictures(format);
    const auto bytesOfChroma = static_cast<uint64_t>(2 * destination[1].width);
    RowMemory memory(source.width);
    memory.AddSource(chain);
    memory.AddSource(chain);
    memory.AddBytes(bytesOfChroma);
    return memory.With([&](TemporaryRows& rows) {
        const RowSource sources[2] = {{source, chain, rows}, {source, chain, rows}};
        const RowEncoder encoder(sources, destination, rows.Take(bytesOfChroma));
        for (int32_t row = 0; row < destination[1].height; ++row)
            encoder.Chroma(row, RowsOfChroma(isFieldPicture, row, source.height));
        if (isFieldPicture)
            for (int32_t row = FirstRowWithoutChroma(source.height); row < source.height; ++row)
                encoder.Luma(row, 0);
        return PK_Success;
    });
}

} // namespace PK
