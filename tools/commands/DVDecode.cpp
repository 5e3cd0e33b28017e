// pixelkiln dv decode: a raw file of DV to a stream, raw frames or pictures.

#include "Command.h"
#include "DVFile.h"
#include "DVInspection.h"
#include "Failure.h"
#include "Formats.h"
#include "FrameFiles.h"
#include "FramesInOrder.h"
#include "SamplePlanes.h"
#include "SharedWords.h"
#include "Terminal.h"

namespace tool {
namespace {

struct Options : PipeOptions {
    int32_t threads = 1;
};

constexpr const char* kNotes =
    R"(The output is a Y4M stream of 4:2:2, in the field order and with the shape of pixels of the DV, unless
--to tells another format. Raw frames need --to; a PNG, as frame-%04d.png, is made of each frame.

Examples:
  pixelkiln dv decode tape.dv tape.y4m
  pixelkiln dv decode tape.dv tape.yuv --to yuv420p:fields
  pixelkiln dv decode tape.dv - --to y4m | ffmpeg -i - tape.mkv
)";

void Declare(Words& words, Options& options) {
    words.Take("IN", options.input, "Raw file of DV, or -").Required();
    AddOutput(words, options);
    words.Take("--from", options.from,
               "Format of the DV, such as PALDV25, where the first frame does not tell");
    words.Take("--to", options.to, "Format to end in; needed for raw frames");
    words.Flag("--packed", options.packed, "Rows of raw frames have no padding");
    AddQuality(words, options.quality);
    AddThreads(words, options.threads);
    words.Notes(kNotes);
}

/// What goes on into a stream. Planes of 4:2:0 get chroma as the fields of the DV have it.
Y4MHead HeadOf(const DVKind& kind, const uint8_t* frame, bool isToldFormat) {
    const Video420 video = {.areFields = !kind.IsProgressive(), .is709 = kind.Is709()};
    return {kind.width, kind.height,
            kind.rate,  IsWide(kind, frame) ? kind.wideAspect : kind.aspect,
            kind.field, isToldFormat ? video.Format() : PK_PixelFormat_Invalid};
}

Frame Decoded(const DVKind& kind, const std::vector<uint8_t>& bytes, PK_PixelFormat format, int32_t quality) {
    Frame frame(format, kind.width, kind.height);
    const PK_Result result = PK_Convert(bytes.data(), kind.Bytes(), kind.format, frame.Pixels(),
                                        frame.RowBytes(), format, kind.width, kind.height, quality);
    Require(result, "decode " + FormatName(kind.format) + " to", frame);
    return frame;
}

void Run(const Options& options) {
    const FramePlan plan = PlanOutput(options);
    DVFile file(options.input, options.from);
    const DVKind& kind = file.Kind();
    std::optional<std::vector<uint8_t>> first = file.Next();
    if (!first) throw Failure(kExitFile, "'" + file.Name() + "' holds no frame");
    const bool isToldFormat = plan.to.At({kind.width, kind.height}, "") != PK_PixelFormat_Invalid;
    FrameOutput output(plan, options.output, HeadOf(kind, first->data(), isToldFormat));
    if (file.FrameCount() > 1) output.RequireRoomForSeveral();
    const PK_PixelFormat format = output.FormatFor({kind.width, kind.height}, UYVYOf(kind.Is709()));
    Progress progress("frames", file.FrameCount());
    std::optional<Frame> last;
    RunInOrder(
        options.threads, [&] { return first ? std::exchange(first, std::nullopt) : file.Next(); },
        [&](const std::vector<uint8_t>& bytes) { return Decoded(kind, bytes, format, options.quality); },
        [&](Frame frame) {
            output.Write(frame);
            last.emplace(std::move(frame));
            progress.Advance();
        });
    const int64_t count = output.Finish();
    if (IsSilent(options)) return;
    Print(options.input + " -> " + options.output + ": " + std::to_string(count) +
          (count == 1 ? " frame of " : " frames of ") + DVKindText(kind) + ", to " + output.Summary(*last) +
          "\n");
}

const Command sDVDecode(Group::Frames, "dv decode",
                        "Decode a raw file of DV to a stream, raw frames or PNG files", Declare, Run);

} // namespace
} // namespace tool
