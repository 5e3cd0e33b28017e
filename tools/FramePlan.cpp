#include "FramePlan.h"

#include "Failure.h"
#include "Png.h"
#include "Y4M.h"

#include <charconv>

namespace tool {
namespace {

constexpr const char* kStreamWord = "y4m"; // for pipes, whose names tell nothing

FileKind KindOf(const std::string& name, const std::string& format) {
    if (IsPngName(name)) return FileKind::Png;
    return IsY4MName(name) || format == kStreamWord ? FileKind::Y4M : FileKind::Raw;
}

/// \param text  of the option; raw frames need one.
FileFormat FormatOf(FileKind kind, const std::string& text, const std::string& option, bool packed) {
    const bool takenAsItIs =
        (kind != FileKind::Raw && text.empty()) || (kind == FileKind::Y4M && text == kStreamWord);
    if (takenAsItIs) return {};
    if (text.empty())
        throw Failure(kExitUsage, "raw frames do not tell their format: name it with " + option +
                                      ", such as " + option + " V210_422_10u");
    return FileFormat::Parse(text, packed ? RowPacking::Packed : RowPacking::Padded);
}

} // namespace

FramePlan PlanOutput(const PipeOptions& options) {
    FramePlan plan{};
    plan.out = KindOf(options.output, options.to);
    plan.pngFormat = options.pngDepth == 16 ? PK_PixelFormat_BGRA_4444_32f : PK_PixelFormat_BGRA_4444_8u;
    plan.quality = options.quality;
    plan.matrix = options.matrix;
    Is709(options.matrix, {});
    plan.to = FormatOf(plan.out, options.to, "--to", options.packed);
    return plan;
}

FramePlan PlanPipe(const PipeOptions& options) {
    const FileKind in = KindOf(options.input, options.from);
    const FileFormat from = FormatOf(in, options.from, "--from", options.packed);
    FramePlan plan = PlanOutput(options);
    plan.in = in;
    plan.from = from;
    if (in == FileKind::Raw && options.size.empty())
        throw Failure(kExitUsage,
                      "raw frames do not tell their size: give it with --size, such as 1920x1080");
    if (in != FileKind::Raw && !options.size.empty())
        throw Failure(kExitUsage, std::string(in == FileKind::Png ? "a PNG" : "a Y4M stream") +
                                      " tells its own size: leave --size away");
    if (in == FileKind::Raw) plan.size = ParseSize(options.size);
    return plan;
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

} // namespace tool
