#include "convert/ConvertRasterRows.h"

#include "convert/ConversionChain.h"
#include "convert/RasterFormats.h"

namespace PK {

PK_Result ConvertRasterRows(const SourceImage& source, const DestinationImage& destination,
                            int32_t quality) noexcept {
    if (!IsRasterFormat(source.format)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(destination.format)) return PK_ErrBadDstFormat;

    ConversionChain chain;
    chain.Build(source.format, destination.format, quality);
    if (chain.count == 0) return PK_ErrFailed;

    if (source.height < 1 || source.width == 0) return PK_Success;
    if (source.width < 0 || source.width > kMaximumWidth) return PK_ErrFailed;
    if (source.pixels == nullptr || destination.pixels == nullptr) return PK_ErrFailed;

    return chain.WithScratch(source.width, [&](const ChainScratch& scratch) {
        for (int32_t row = 0; row < source.height; ++row) {
            chain.ConvertRow(source.Row(row), destination.Row(row), source.width, scratch);
        }
        return PK_Success;
    });
}

} // namespace PK
