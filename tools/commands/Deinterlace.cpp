// pixelkiln deinterlace: one field of each frame rebuilt from the other.

#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "Operations.h"
#include "SharedWords.h"

namespace tool {
namespace {

void RequireFourChannelsOr422(PK_PixelFormat format) {
    if (format != PK_PixelFormat_RGB_444_10u) return;
    throw Failure(kExitFailed, "cannot deinterlace a frame of " + FormatName(format) +
                                   ": it has neither four channels nor 4:2:2; take it to another format with "
                                   "--from, such as --from BGRA_4444_15u");
}

struct Options : PipeOptions {
    int32_t field = 0;
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words
        .Take(
            "--field", options.field,
            "From quality 4 on, along edges: 1 rebuilds rows 0, 2, ... and 0 or 2 rows 1, 3, ...; below, as "
            "means: 0 rebuilds rows 1, 3, ... and 1 or 2 rows 0, 2, ...")
        .OneOf({0, 1, 2})
        .ShowDefault();
}

void Run(const Options& options) {
    PipeFramesInTheirFormat(
        options, OnCopy([&](Frame& frame) { Deinterlace(frame, options.field, options.quality); }));
}

const Command sDeinterlace(Group::Operations, "deinterlace", "Rebuild one field of frames from the other",
                           Declare, Run);

} // namespace

void Deinterlace(Frame& frame, int32_t field, int32_t quality) {
    RequireFourChannelsOr422(frame.Format());
    const PK_Result result = PK_Deinterlace(frame.Pixels(), frame.RowBytes(), frame.Format(), frame.Width(),
                                            frame.Height(), field, quality);
    Require(result, "deinterlace", frame);
}

} // namespace tool
