// pixelkiln rotate: quarter turns.

#include "Commands.h"
#include "Operations.h"

namespace tool {

Frame Rotated(const Frame& frame, int32_t degrees) {
    const bool isHalfTurn = degrees % 180 == 0;
    Frame turned(frame.Format(), isHalfTurn ? frame.Width() : frame.Height(),
                 isHalfTurn ? frame.Height() : frame.Width());
    // The library counts rows in memory, and upside down a picture turns the other way.
    const int32_t degreesInMemory = PK_IsOriginTopLeft(frame.Format()) ? degrees : -degrees;
    const PK_Result result =
        PK_RotateImage(frame.Pixels(), frame.RowBytes(), turned.Pixels(), turned.RowBytes(), frame.Width(),
                       frame.Height(), frame.Format(), degreesInMemory);
    Require(result, "rotate", frame);
    return turned;
}

void RunRotate(const RotateOptions& options) {
    PipeFramesInTheirFormat(options, [&](const Frame& frame) { return Rotated(frame, options.degrees); });
}

} // namespace tool
