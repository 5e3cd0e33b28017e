// pixelkiln scale: frames of any size, format and field order to any other.

#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "Operations.h"
#include "Png.h"
#include "SharedWords.h"

namespace tool {
namespace {

constexpr const char* kNotes =
    R"(Below quality 3, rows, pixels and fields may be dropped, as half sizes of 4:2:2 do. From 3 on what gets smaller is
filtered, and at 5 light is scaled by a cubic. 'pixelkiln explain --scale' tells the way.

Examples:
  pixelkiln scale cat.png small.png --to-size 225x150
  pixelkiln scale clip.raw half.raw --from UYVY_422_8u --size 1920x1080 --to-size 960x540 --quality 2
  pixelkiln scale clip.raw field.png --from V210_422_10u --size 720x486 --src-field 1 --to-size 720x243
)";

struct Options : PipeOptions {
    std::string toSize;
    Scaling scaling;
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words.Take("--to-size", options.toSize, "Width x height of the output, such as 1280x720").Required();
    words.Take("--src-field", options.scaling.sourceField, "Earlier field of the input; 0: progressive")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words.Take("--dst-field", options.scaling.destinationField, "The same of the output")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words
        .Take("--render-field", options.scaling.renderField,
              "Draw one field of an interlaced output alone; 0: all rows")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words.Notes(kNotes);
}

void Run(const Options& told) {
    Options options = told;
    if (options.to.empty() && !IsPngName(options.output)) options.to = options.from;
    Scaling scaling = options.scaling;
    const Size size = ParseSize(options.toSize);
    scaling.width = size.width;
    scaling.height = size.height;
    scaling.quality = options.quality;
    if (scaling.renderField != 0 && scaling.destinationField == 0)
        throw Failure(kExitUsage, "--render-field is for an interlaced output: tell --dst-field");
    PipeFramesTo(options, size, [&](const Frame& frame, PK_PixelFormat to) {
        scaling.format = to;
        return Scaled(frame, scaling);
    });
}

const Command sScale(Group::Operations, "scale", "Change size, format and field order of frames", Declare,
                     Run);

} // namespace

Frame Scaled(const Frame& frame, const Scaling& scaling) {
    Frame scaled(scaling.format, scaling.width, scaling.height);
    const PK_Result result = PK_ScaleConvertOneField(
        frame.Pixels(), frame.RowBytes(), frame.Width(), frame.Height(), frame.Format(), scaling.sourceField,
        scaled.Pixels(), scaled.RowBytes(), scaled.Width(), scaled.Height(), scaled.Format(),
        scaling.destinationField, scaling.quality, scaling.renderField);
    Require(result, "scale", frame);
    return scaled;
}

} // namespace tool
