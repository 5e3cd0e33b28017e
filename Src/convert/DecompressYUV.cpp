// The export that decodes planes of 4:2:0.

#include "convert/Planar420.h"
#include "convert/RasterFormats.h"
#include "frame/Arguments.h"

#include <PixelKiln/Planar.h>

#include <algorithm>
#include <cstdlib>

using namespace PK;

namespace {

bool HasRowsThatOverlap(const DestinationImage& image) {
    const auto bytes = static_cast<ptrdiff_t>(BytesOfRow(image.format, image.width));
    return image.height > 1 && std::abs(image.rowBytes) < bytes;
}

} // namespace

PK_Result PK::DecompressYUV_420_8u(const void* const planes[3], const int32_t planeRowBytes[3],
                                   int32_t sourceWidth, int32_t sourceHeight, PK_PixelFormat sourceFormat,
                                   void* destination, int32_t destinationRowBytes, int32_t destinationWidth,
                                   int32_t destinationHeight, PK_PixelFormat destinationFormat, int32_t field,
                                   int32_t quality) noexcept {
    if (!Is420Planar(sourceFormat)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(destinationFormat)) return PK_ErrBadDstFormat;
    for (const int32_t size : {sourceWidth, sourceHeight, destinationWidth, destinationHeight})
        if (size < 0) return PK_ErrFailed;
    if (destinationWidth == 0 || destinationHeight == 0) return PK_Success;
    if (sourceWidth > kMaximumWidth || destinationWidth > kMaximumWidth) return PK_ErrFailed;
    if (HasNull({planes, planeRowBytes, destination})) return PK_ErrFailed;

    const DestinationImage image = {static_cast<uint8_t*>(destination), destinationRowBytes,
                                    destinationFormat, destinationWidth, destinationHeight};
    const SourcePlanes source =
        PlanesOf<const uint8_t>(planes, planeRowBytes, sourceWidth, sourceHeight, Chroma::k420);
    if (HasRowsThatOverlap(image) || std::ranges::any_of(source, HasUnreadableSamples<const uint8_t>))
        return PK_ErrFailed;
    return DecodePlanar420(source, sourceFormat, image, field, quality);
}
