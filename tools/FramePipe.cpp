#include "FramePipe.h"

#include "Failure.h"
#include "Formats.h"
#include "NumberedName.h"
#include "Png.h"
#include "RawFrames.h"
#include "Terminal.h"

#include <charconv>
#include <optional>

namespace tool {
namespace {

// The options with all words understood, so that what is wrong with them is said before any work.
struct Plan {
    bool pngIn;
    bool pngOut;
    PK_PixelFormat from; // Invalid for a PNG that is taken as it is
    PK_PixelFormat to;
    PK_PixelFormat pngFormat; // what an output PNG is written from
    Size size;                // of raw frames
    RowPacking packing;
    int32_t quality;
};

PK_PixelFormat RawFormat(const std::string& text, const std::string& option) {
    if (text.empty())
        throw Failure(kExitUsage, "raw frames do not tell their format: name it with " + option +
                                      ", such as " + option + " V210_422_10u");
    return ParseFormat(text);
}

Plan PlanOutput(const PipeOptions& options) {
    Plan plan{};
    plan.pngOut = IsPngName(options.output);
    plan.pngFormat = options.pngDepth == 16 ? PK_PixelFormat_BGRA_4444_32f : PK_PixelFormat_BGRA_4444_8u;
    plan.packing = options.packed ? RowPacking::Packed : RowPacking::Padded;
    plan.quality = options.quality;
    const bool writtenAsItIs = plan.pngOut && options.to.empty();
    plan.to = writtenAsItIs ? plan.pngFormat : RawFormat(options.to, "--to");
    return plan;
}

Plan PlanPipe(const PipeOptions& options) {
    const bool pngIn = IsPngName(options.input);
    const bool takenAsItIs = pngIn && options.from.empty();
    const PK_PixelFormat from = takenAsItIs ? PK_PixelFormat_Invalid : RawFormat(options.from, "--from");
    Plan plan = PlanOutput(options);
    plan.pngIn = pngIn;
    plan.from = from;
    if (plan.pngIn && !options.size.empty())
        throw Failure(kExitUsage, "a PNG tells its own size: leave --size away");
    if (!plan.pngIn && options.size.empty())
        throw Failure(kExitUsage,
                      "raw frames do not tell their size: give it with --size, such as 1920x1080");
    if (!plan.pngIn) plan.size = ParseSize(options.size);
    return plan;
}

// Where converted frames go: all into one raw file, or each into a PNG.
class Output {
public:
    Output(const Plan& plan, const std::string& name) : fPlan(plan), fName(name) {}

    void Write(const Frame& frame) {
        if (fFrameCount > 0) RequireRoomForSeveral();
        if (!fConverted) fConverted.emplace(fPlan.to, frame.Width(), frame.Height());
        Convert(frame, *fConverted, fPlan.quality);
        if (fPlan.pngOut)
            WriteAsPng();
        else
            WriteAsRaw();
        ++fFrameCount;
    }

    /// Throws if the frames of an input that has several would write over each other.
    void RequireRoomForSeveral() const {
        if (fPlan.pngOut && !fName.IsNumbered())
            throw Failure(kExitUsage,
                          "the input holds several frames and a PNG holds one: number the output, "
                          "such as frame-%04d.png");
    }

    /// Of the frames that were written.
    std::string SizeIfNot(const Frame& frame) const {
        if (fConverted->Width() == frame.Width() && fConverted->Height() == frame.Height()) return "";
        return " at " + SizeText(*fConverted);
    }

    int64_t Finish() {
        if (fRawFile) fRawFile->Commit();
        return fFrameCount;
    }

private:
    void WriteAsPng() {
        const std::string name = fName.At(fFrameCount);
        if (fPlan.to == fPlan.pngFormat)
            WritePng(*fConverted, name);
        else
            WritePng(Converted(*fConverted, fPlan.pngFormat, fPlan.quality), name);
    }

    void WriteAsRaw() {
        if (!fRawFile) fRawFile.emplace(fName.At(0));
        WriteRaw(*fConverted, fPlan.packing, *fRawFile);
    }

    const Plan& fPlan;
    NumberedName fName;
    std::optional<Frame> fConverted;
    std::optional<OutputFile> fRawFile;
    int64_t fFrameCount = 0;
};

Frame ReadPicture(const Plan& plan, const std::string& name) {
    Frame picture = ReadPng(name);
    if (plan.from == PK_PixelFormat_Invalid) return picture;
    return Converted(picture, plan.from, plan.quality);
}

void WriteStepped(const Frame& frame, const Step& step, Output& output) {
    if (step)
        output.Write(step(frame));
    else
        output.Write(frame);
}

void PipeRawFrames(const Plan& plan, const std::string& name, const Step& step, Frame& frame,
                   Output& output) {
    RawReader reader(name, frame, plan.packing);
    if (reader.FrameCount() > 1) output.RequireRoomForSeveral();
    Progress progress("frames", reader.FrameCount());
    while (reader.Read(frame)) {
        WriteStepped(frame, step, output);
        progress.Advance();
    }
}

std::string CountAndSize(int64_t count, const Frame& frame) {
    return std::to_string(count) + (count == 1 ? " frame " : " frames ") + SizeText(frame) + ", " +
           FormatName(frame.Format());
}

} // namespace

bool IsSilent(const PipeOptions& options) {
    return options.quiet || options.output == "-";
}

PK_PixelFormat OutputFormat(const PipeOptions& options) {
    return PlanOutput(options).to;
}

Size ParseSize(const std::string& text) {
    Size size;
    const char* end = text.data() + text.size();
    const auto width = std::from_chars(text.data(), end, size.width);
    if (width.ec == std::errc() && width.ptr != end && (*width.ptr == 'x' || *width.ptr == 'X')) {
        const auto height = std::from_chars(width.ptr + 1, end, size.height);
        if (height.ec == std::errc() && height.ptr == end && size.width > 0 && size.height > 0) return size;
    }
    throw Failure(kExitUsage,
                  "'" + text + "' is no size; write it as width x height in pixels, such as 1920x1080");
}

Step OnCopy(std::function<void(Frame&)> change) {
    return [change = std::move(change)](const Frame& frame) {
        Frame changed = Copied(frame);
        change(changed);
        return changed;
    };
}

void PipeFrames(const PipeOptions& options, const Step& step) {
    const Plan plan = PlanPipe(options);
    Output output(plan, options.output);
    Frame frame =
        plan.pngIn ? ReadPicture(plan, options.input) : Frame(plan.from, plan.size.width, plan.size.height);
    if (plan.pngIn)
        WriteStepped(frame, step, output);
    else
        PipeRawFrames(plan, options.input, step, frame, output);

    const int64_t count = output.Finish();
    if (IsSilent(options)) return;
    Print(options.input + " -> " + options.output + ": " + CountAndSize(count, frame) + " to " +
          FormatName(plan.to) + output.SizeIfNot(frame) + "\n");
}

void PipeFramesInTheirFormat(PipeOptions options, const Step& step) {
    if (options.to.empty() && !IsPngName(options.output)) options.to = options.from;
    PipeFrames(options, step);
}

void WriteMadeFrame(const PipeOptions& options, const Make& make) {
    const Plan plan = PlanOutput(options);
    const Size size = ParseSize(options.size);
    Output output(plan, options.output);
    Frame frame(plan.to, size.width, size.height);
    make(frame);
    output.Write(frame);
    const int64_t count = output.Finish();
    if (!IsSilent(options)) Print(options.output + ": " + CountAndSize(count, frame) + "\n");
}

} // namespace tool
