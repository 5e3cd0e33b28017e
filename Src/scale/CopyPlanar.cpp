// The copy of the three planes of an 8-bit 4:2:0 image.

#include "primitives/CopyImage.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Planar.h>

namespace PK {
namespace {

struct PlaneCopy {
    const void* source;
    int32_t sourceRowBytes;
    void* destination;
    int32_t destinationRowBytes;
    int32_t width;
    int32_t height;

    bool IsEmpty() const { return width == 0 || height == 0; }
};

PK_Result CopyPlane(const PlaneCopy& plane) {
    if (plane.sourceRowBytes == plane.width && plane.destinationRowBytes == plane.width) {
        const uint64_t bytes = static_cast<uint64_t>(plane.width) * static_cast<uint64_t>(plane.height);
        return PK_CopyMemory(plane.destination, plane.source, bytes);
    }
    const int32_t status = CopyImage8u(static_cast<const uint8_t*>(plane.source), plane.sourceRowBytes,
                                       static_cast<uint8_t*>(plane.destination), plane.destinationRowBytes,
                                       plane.width, plane.height);
    return status == 0 ? PK_Success : PK_ErrFailed;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_CopyPlanar_8u(const void* const sourcePlanes[3], const int32_t sourceRowBytes[3],
                           void* const destinationPlanes[3], const int32_t destinationRowBytes[3],
                           int32_t width, int32_t height) noexcept {
    if (width < 0 || height < 0) return PK_ErrFailed;
    if (width == 0 || height == 0) return PK_Success;
    if (!sourcePlanes || !sourceRowBytes || !destinationPlanes || !destinationRowBytes) return PK_ErrFailed;

    PlaneCopy planes[3];
    for (int i = 0; i < 3; ++i) {
        const int32_t part = i == 0 ? 1 : 2;
        planes[i] = {sourcePlanes[i],        sourceRowBytes[i], destinationPlanes[i],
                     destinationRowBytes[i], width / part,      height / part};
        const bool isNull = sourcePlanes[i] == nullptr || destinationPlanes[i] == nullptr;
        if (isNull && !planes[i].IsEmpty()) return PK_ErrFailed;
    }
    for (const PlaneCopy& plane : planes) {
        if (plane.IsEmpty()) continue;
        const PK_Result result = CopyPlane(plane);
        if (result != PK_Success) return result;
    }
    return PK_Success;
}
