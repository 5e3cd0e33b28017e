#include "scale/CopyPlanarField.h"

#include "convert/Image.h"
#include "frame/Planes.h"
#include "primitives/CopyImage.h"

namespace PK {

PK_Result CopyPlanarField(const uint8_t* source, uint8_t* destination, PK_PixelFormat format, int32_t width,
                          int32_t height, int32_t field) {
    if (!HavePlanesOffsets(width, height)) return PK_ErrFailed;
    const SourcePlanes from = PlanesInBlock(source, format, width, height);
    const DestinationPlanes to = PlanesInBlock(destination, format, width, height / 2);
    for (size_t i = 0; i < from.size(); ++i) {
        if (to[i].IsEmpty()) continue;
        const bool isSecondField = i == 0 && field == 2;
        const auto lines = Field(from[i], isSecondField ? 2 : 1);
        if (CopyImage8u(lines.pixels, lines.rowBytes, to[i].pixels, to[i].rowBytes, to[i].width,
                        to[i].height) != 0)
            return PK_ErrFailed;
    }
    return PK_Success;
}

} // namespace PK
