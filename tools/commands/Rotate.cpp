// pixelkiln rotate: quarter turns.

#include "Command.h"
#include "Operations.h"
#include "SharedWords.h"

namespace tool {
namespace {

struct Options : PipeOptions {
    int32_t degrees = 0;
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words.Take("--degrees", options.degrees, "Clockwise: 90, 180, 270, or less than 0")
        .Required()
        .OneOf({90, 180, 270, -90, -180, -270});
}

void Run(const Options& options) {
    PipeFramesInTheirFormat(options, [&](const Frame& frame) { return Rotated(frame, options.degrees); });
}

const Command sRotate(Group::Operations, "rotate", "Turn frames by quarters", Declare, Run);

} // namespace

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

} // namespace tool
