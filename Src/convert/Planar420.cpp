#include "convert/Planar420.h"

namespace PK {

DecodeTarget ChoosePlanarTarget(const DecodeTarget& stream, const DecodeTarget&, int32_t) {
    return stream;
}

PK_Result DecodePlanar420(const SourcePlanes&, PK_PixelFormat, const DestinationImage&, int32_t, int32_t) {
    return PK_ErrNotSupported;
}

} // namespace PK
