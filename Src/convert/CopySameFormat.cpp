#include "convert/CopySameFormat.h"

#include "convert/RasterFormats.h"
#include "frame/Arguments.h"
#include "primitives/CopyImage.h"

#include <PixelKiln/Buffers.h>

#include <cstdlib>

namespace PK {

namespace {

/// The block of an image whose rows follow each other without a gap starts at the row lowest in memory.
template <class Byte>
Byte* LowestRow(const Image<Byte>& image) {
    return image.rowBytes < 0 ? image.Row(image.height - 1) : image.pixels;
}

PK_Result CopyRaster(const SourceImage& source, const DestinationImage& destination) {
    if (!IsRasterFormat(source.format)) return PK_ErrBadSrcFormat;
    if (const auto result =
            ResultWithoutWork(source.width, source.height, {source.pixels, destination.pixels}))
        return *result;

    const int32_t rowLength = PK_PixelFormatPackedRowBytes(source.format, source.width);
    if (source.rowBytes == destination.rowBytes && std::abs(source.rowBytes) == rowLength) {
        const uint64_t bytes = static_cast<uint64_t>(rowLength) * static_cast<uint64_t>(source.height);
        return PK_CopyMemory(LowestRow(destination), LowestRow(source), bytes);
    }
    const int32_t status = CopyImage8u(source.pixels, source.rowBytes, destination.pixels,
                                       destination.rowBytes, rowLength, source.height);
    return status == 0 ? PK_Success : PK_ErrFailed;
}

PK_Result CopyBlock(const SourceImage& source, const DestinationImage& destination, int64_t bytes) {
    if (bytes < 0) return PK_ErrFailed;
    return PK_CopyMemory(destination.pixels, source.pixels, static_cast<uint64_t>(bytes));
}

} // namespace

PK_Result CopySameFormat(const SourceImage& source, const DestinationImage& destination) noexcept {
    if (!IsStream(source.format)) return CopyRaster(source, destination);

    const bool isDV = StreamKind(source.format) <= kStreamLastDV;
    if (isDV || Is420Planar(source.format)) {
        if (!isDV && source.width < 0) return PK_ErrFailed;
        return CopyBlock(source, destination, PK_PixelFormatSize(source.format, source.width, source.height));
    }
    if (source.rowBytes != destination.rowBytes) return PK_ErrSizeMismatch;
    return CopyBlock(source, destination, source.rowBytes);
}

} // namespace PK
