#include "FramePipe.h"

#include "Formats.h"
#include "FrameFiles.h"
#include "Png.h"
#include "Terminal.h"

namespace tool {
namespace {

/// The format that operations are given where a frame is planar 4:2:0, which they do not take. Bytes of the full range
/// have no 4:4:4 format but RGB.
PK_PixelFormat WorkingFormat(PK_PixelFormat format) {
    const std::optional<Video420> video = Video420Of(format);
    if (!video) return format;
    if (video->isFullRange) return PK_PixelFormat_BGRA_4444_8u;
    return video->is709 ? PK_PixelFormat_VUYX_4444_8u_709 : PK_PixelFormat_VUYX_4444_8u;
}

Frame Stepped(const Frame& frame, const Step& step, int32_t quality) {
    const PK_PixelFormat format = WorkingFormat(frame.Format());
    if (format == frame.Format()) return step(frame);
    return step(Converted(frame, format, quality));
}

std::string CountAndSize(int64_t count, const Frame& frame) {
    return std::to_string(count) + (count == 1 ? " frame " : " frames ") + SizeText(frame) + ", " +
           FormatName(frame.Format());
}

/// \param use  takes each frame and the output.
template <class Use>
void Pipe(const PipeOptions& options, const Use& use) {
    const FramePlan plan = PlanPipe(options);
    FrameInput input(plan, options.input);
    FrameOutput output(plan, options.output, input.Head());
    if (input.FrameCount() > 1) output.RequireRoomForSeveral();
    Progress progress("frames", input.FrameCount());
    while (const Frame* const frame = input.Next()) {
        use(*frame, output);
        progress.Advance();
    }
    const int64_t count = output.Finish();
    if (IsSilent(options)) return;
    Print(options.input + " -> " + options.output + ": " + CountAndSize(count, input.Last()) + " to " +
          output.Summary(input.Last()) + "\n");
}

} // namespace

bool IsSilent(const PipeOptions& options) {
    return options.quiet || options.output == "-";
}

Step OnCopy(std::function<void(Frame&)> change) {
    return [change = std::move(change)](const Frame& frame) {
        Frame changed = Copied(frame);
        change(changed);
        return changed;
    };
}

void PipeFrames(const PipeOptions& options, const Step& step) {
    Pipe(options, [&](const Frame& frame, FrameOutput& output) {
        if (step)
            output.Write(Stepped(frame, step, options.quality));
        else
            output.Write(frame);
    });
}

void PipeFramesTo(const PipeOptions& options, Size size, const StepTo& step) {
    Pipe(options, [&](const Frame& frame, FrameOutput& output) {
        output.Write(step(frame, output.FormatFor(size, frame.Format())));
    });
}

void PipeFramesInTheirFormat(PipeOptions options, const Step& step) {
    if (options.to.empty() && !IsPngName(options.output)) options.to = options.from;
    PipeFrames(options, step);
}

void WriteMadeFrame(const PipeOptions& options, const Make& make) {
    const FramePlan plan = PlanOutput(options);
    const Size size = ParseSize(options.size);
    FrameOutput output(plan, options.output);
    const PK_PixelFormat format = output.FormatFor(size, PK_PixelFormat_BGRA_4444_8u);
    Frame frame(WorkingFormat(format), size.width, size.height);
    make(frame);
    output.Write(frame);
    const int64_t count = output.Finish();
    if (!IsSilent(options)) Print(options.output + ": " + CountAndSize(count, frame) + "\n");
}

} // namespace tool
