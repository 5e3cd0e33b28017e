// pixelkiln explain: the chain of kernels between two formats, or the steps of scaling.

#include "Chains.h"
#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "SharedWords.h"
#include "Terminal.h"
#include "explain/ScaleSteps.h"

namespace tool {
namespace {

constexpr const char* kNotes =
    R"(With --scale, formats may be streams too, and each size, format and field order that an image has on the way is
shown.

Examples:
  pixelkiln explain BGRA_4444_8u V210_422_10u
  pixelkiln explain UYVY_422_8u BGRA_4444_8u --scale --src-size 720x486 --src-field 1 --dst-size 360x243 --quality 2
)";

struct Options {
    std::string source;
    std::string destination;
    int32_t quality = kDefaultQuality;
    bool scale = false;
    std::string sourceSize, destinationSize;
    int32_t sourceField = 0, destinationField = 0, renderField = 0;
};

void Declare(Words& words, Options& options) {
    words.Take("SRC", options.source, "Format to start from").Required();
    words.Take("DST", options.destination, "Format to end in").Required();
    AddQuality(words, options.quality);
    words.Flag("--scale", options.scale,
               "Show how PK_ScaleConvert goes instead; the options below are for it");
    words.Take("--src-size", options.sourceSize, "Width x height, such as 1920x1080");
    words.Take("--dst-size", options.destinationSize, "The same of the destination");
    words.Take("--src-field", options.sourceField, "Earlier field of the source; 0: progressive")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words.Take("--dst-field", options.destinationField, "The same of the destination")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words.Take("--render-field", options.renderField, "The field that is rendered alone; 0: all rows")
        .OneOf({0, 1, 2})
        .ShowDefault();
    words.Notes(kNotes);
}

std::string TextOf(const PK::ScaleImage& image) {
    return SizeText(image.width, image.height) + " " + FormatName(image.format) + ", field " +
           std::to_string(image.field);
}

void ExplainScaling(const Options& options, PK_PixelFormat source, PK_PixelFormat destination) {
    if (options.sourceSize.empty() || options.destinationSize.empty())
        throw Failure(kExitUsage, "--scale wants both sizes: --src-size and --dst-size");
    const Size from = ParseSize(options.sourceSize), to = ParseSize(options.destinationSize);
    const PK::ScaleCall call = {{source, from.width, from.height, options.sourceField},
                                {destination, to.width, to.height, options.destinationField},
                                options.renderField,
                                options.quality};
    Table table({"route", "step", "leaves"});
    for (const ScaleStep& step : DescribeScale(call)) table.Add({step.route, step.what, TextOf(step.leaves)});
    Print(TextOf(call.source) + ", to " + TextOf(call.destination) + ", at quality " +
          std::to_string(options.quality) + "\n" + table.Aligned());
}

void Run(const Options& options) {
    const PK_PixelFormat source = ParseFormat(options.source);
    const PK_PixelFormat destination = ParseFormat(options.destination);
    if (options.scale) return ExplainScaling(options, source, destination);
    if (!options.sourceSize.empty() || !options.destinationSize.empty())
        throw Failure(kExitUsage, "sizes are for --scale");
    for (const PK_PixelFormat format : {source, destination})
        if (!IsRaster(format))
            throw Failure(kExitFailed, FormatName(format) +
                                           " is a stream: it is decoded or encoded as a whole "
                                           "and no chain of row kernels leads through it");
    const std::vector<ChainStep> steps = DescribeChain(source, destination, options.quality);
    if (steps.empty())
        throw Failure(kExitFailed, "no chain of kernels leads from " + FormatName(source) + " to " +
                                       FormatName(destination));

    Table table({"step", "kernel", "body", "leaves", "pass"});
    int step = 0;
    for (const ChainStep& each : steps)
        table.Add({std::to_string(++step), each.kernel, each.body, FormatName(each.leaves),
                   std::to_string(each.pass)});
    const int passes = steps.back().pass;
    Print(FormatName(source) + " to " + FormatName(destination) + " at quality " +
          std::to_string(options.quality) + ": " + std::to_string(steps.size()) +
          (steps.size() == 1 ? " step" : " steps") + " in " + std::to_string(passes) +
          (passes == 1 ? " pass" : " passes") + " over the row\n" + table.Aligned());
}

const Command sExplain(Group::Listings, "explain",
                       "Show the kernels between two formats, or how images are scaled", Declare, Run);

} // namespace
} // namespace tool
