// pixelkiln dv encode: a stream, raw frames or a picture to a raw file of DV.

#include "Command.h"
#include "DVFormats.h"
#include "Failure.h"
#include "Formats.h"
#include "FrameFiles.h"
#include "FramesInOrder.h"
#include "SharedWords.h"
#include "Terminal.h"

#include <algorithm>

namespace tool {
namespace {

struct Options : PipeOptions {
    int32_t threads = 1;
    bool dvcpro = false;
};

constexpr const char* kNotes =
    R"(--to is NTSCDV25, PALDV25, NTSCDV50, PALDV50, NTSC_DV100_720p, PAL_DV100_720p, NTSC_DV100_1080i or
PAL_DV100_1080i, and the frames must have its size: 720x480, 720x576, 960x720, 1280x1080 or 1440x1080.
'pixelkiln scale' takes others there. Frames are taken as they are, so that fields should be in the order
of the format: the lower first in 480 and 576 lines, the upper in 1080. Of 720 lines every second frame is
coded as the second of a pair. There is no audio. FFmpeg and other players read the file by its name, *.dv.

Examples:
  pixelkiln dv encode clip.y4m clip.dv --to PALDV25
  pixelkiln dv encode photo.png photo.dv --to NTSC_DV100_1080i
  ffmpeg -i clip.mp4 -vf scale=720:576 -pix_fmt yuv422p -f yuv4mpegpipe - |
      pixelkiln dv encode - clip.dv --from y4m --to PALDV50
)";

void Declare(Words& words, Options& options) {
    words.Take("IN", options.input, "PNG file, Y4M stream, raw frames, or -").Required();
    words.Take("OUT", options.output, "Raw file of DV, or -").Required();
    words.Take("--to", options.to, "Format of the DV, such as PALDV25").Required();
    words.Flag("--dvcpro", options.dvcpro, "PALDV25 with chroma of 4:1:1 rather than 4:2:0");
    words.Take("--from", options.from, "Format to start from; needed for raw frames");
    AddRawFrames(words, options);
    AddQuality(words, options.quality);
    AddThreads(words, options.threads);
    words.Flag("--quiet", options.quiet, "No summary");
    words.Notes(kNotes);
}

struct Numbered {
    Frame frame;
    int64_t number;
};

using Bytes = std::vector<uint8_t>;

Bytes Encoded(const DVKind& kind, const Options& options, const Numbered& input) {
    const Frame& frame = input.frame;
    Bytes bytes(static_cast<size_t>(kind.Bytes()));
    PK_Result result = PK_Success;
    const bool isSecondOfPair = kind.IsProgressive() && input.number % 2 == 1;
    constexpr int32_t kSecondChannels = 2;
    if (options.dvcpro)
        result =
            PK_CompressDVCPROPAL25(frame.Pixels(), frame.RowBytes(), frame.Format(), kind.width, kind.height,
                                   bytes.data(), kind.Bytes(), kind.format, options.quality);
    else if (isSecondOfPair)
        result = PK_CompressDV100720pWithChannelOffset(frame.Pixels(), frame.RowBytes(), frame.Format(),
                                                       kind.width, kind.height, bytes.data(), kind.Bytes(),
                                                       kSecondChannels, kind.format, options.quality);
    else
        result = PK_Convert(frame.Pixels(), frame.RowBytes(), frame.Format(), bytes.data(), kind.Bytes(),
                            kind.format, kind.width, kind.height, options.quality);
    Require(result, "encode to " + FormatName(kind.format), frame);
    return bytes;
}

void RequireSize(const DVKind& kind, const Frame& frame) {
    if (frame.Width() == kind.width && frame.Height() == kind.height) return;
    throw Failure(kExitFailed, "the frames are " + SizeText(frame) + " and those of " +
                                   FormatName(kind.format) + " " + SizeText(kind.width, kind.height) +
                                   "; 'pixelkiln scale' takes them there");
}

void Run(const Options& options) {
    const DVKind& kind = ParseDVKind(options.to);
    if (options.dvcpro && kind.format != PK_PixelFormat_PALDV25)
        throw Failure(kExitUsage,
                      "--dvcpro is for PALDV25 alone: " + FormatName(kind.format) + " has one chroma");
    const FramePlan plan = PlanPipe(options);
    if (plan.out != FileKind::Raw)
        throw Failure(kExitUsage, "'" + options.output +
                                      "' would be no raw file of DV; name it otherwise, such as clip.dv");
    FrameInput input(plan, options.input);
    OutputFile output(options.output);
    Progress progress("frames", input.FrameCount());
    int64_t read = 0, written = 0;
    RunInOrder(
        options.threads,
        [&]() -> std::optional<Numbered> {
            const Frame* const frame = input.Next();
            if (frame == nullptr) return std::nullopt;
            RequireSize(kind, *frame);
            return Numbered{Copied(*frame), read++};
        },
        [&](const Numbered& numbered) { return Encoded(kind, options, numbered); },
        [&](const Bytes& bytes) {
            output.Write(bytes.data(), bytes.size());
            ++written;
            progress.Advance();
        });
    output.Commit();
    if (IsSilent(options)) return;
    Print(options.input + " -> " + options.output + ": " + std::to_string(written) +
          (written == 1 ? " frame of " : " frames of ") + DVKindText(kind) + ", from " +
          FormatName(input.Last().Format()) + "\n");
}

const Command sDVEncode(Group::Frames, "dv encode",
                        "Encode a stream, raw frames or a PNG file to a raw file of DV", Declare, Run);

} // namespace
} // namespace tool
