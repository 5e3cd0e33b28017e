// The copy of the three planes of an 8-bit 4:2:0 image.

#include "frame/Arguments.h"
#include "frame/Planes.h"
#include "primitives/CopyImage.h"

#include <PixelKiln/Planar.h>

namespace PK {
namespace {

PK_Result CopyPlane(const Plane<const uint8_t>& source, const Plane<uint8_t>& destination) {
    if (source.IsEmpty()) return PK_Success;
    if (source.rowBytes == source.width && destination.rowBytes == source.width) {
        const uint64_t bytes = static_cast<uint64_t>(source.width) * static_cast<uint64_t>(source.height);
        return PK_CopyMemory(destination.pixels, source.pixels, bytes);
    }
    const int32_t status = CopyImage8u(source.pixels, source.rowBytes, destination.pixels,
                                       destination.rowBytes, source.width, source.height);
    return status == 0 ? PK_Success : PK_ErrFailed;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_CopyPlanar_8u(const void* const sourcePlanes[3], const int32_t sourceRowBytes[3],
                           void* const destinationPlanes[3], const int32_t destinationRowBytes[3],
                           int32_t width, int32_t height) noexcept {
    if (const auto result = ResultOfSize(width, height, BelowZero::Refused)) return *result;
    if (HasNull({sourcePlanes, sourceRowBytes, destinationPlanes, destinationRowBytes})) return PK_ErrFailed;

    const SourcePlanes source =
        PlanesOf<const uint8_t>(sourcePlanes, sourceRowBytes, width, height, Chroma::k420);
    const DestinationPlanes destination =
        PlanesOf<uint8_t>(destinationPlanes, destinationRowBytes, width, height, Chroma::k420);
    for (size_t i = 0; i < source.size(); ++i)
        if (!source[i].IsEmpty() && HasNull({source[i].pixels, destination[i].pixels})) return PK_ErrFailed;
    for (size_t i = 0; i < source.size(); ++i)
        if (const PK_Result result = CopyPlane(source[i], destination[i]); result != PK_Success)
            return result;
    return PK_Success;
}
