// pixelkiln boxblur: box filters along rows and columns.

#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "Operations.h"
#include "SharedWords.h"

#include <algorithm>
#include <vector>

namespace tool {
namespace {

constexpr int32_t kSmallestSide = 4; // below that the library leaves a picture alone

void RequireBlurrable(const Frame& frame) {
    if (!IsFourBytesAPixel(frame.Format()))
        throw Failure(kExitFailed, "cannot blur a frame of " + FormatName(frame.Format()) +
                                       ": only 8-bit formats of four channels are blurred; take it to one "
                                       "with --from, such as --from BGRA_4444_8u");
    if (std::min(frame.Width(), frame.Height()) < kSmallestSide)
        throw Failure(kExitFailed,
                      "cannot blur a frame of " + SizeText(frame) + ": no side may be shorter than 4 pixels");
}

struct Options : PipeOptions {
    BoxBlur blur = {.rows = false, .columns = false};
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words.Take("--radius", options.blur.radius, "In pixels; fractions count").Required().Between(0.0, 1e6);
    words.Take("--passes", options.blur.passes, "Boxes one after the other; three are near a Gaussian")
        .Between(1, 100)
        .ShowDefault();
    words.Flag("--rows", options.blur.rows, "Along rows only");
    words.Flag("--columns", options.blur.columns, "Along columns only");
    words.Flag("--renormalise", options.blur.renormalise,
               "Keep the borders as bright as the rest; without it they fade to black");
}

void Run(const Options& options) {
    BoxBlur blur = options.blur;
    if (!blur.rows && !blur.columns) blur.rows = blur.columns = true;
    PipeFramesInTheirFormat(options, OnCopy([&](Frame& frame) { Blur(frame, blur); }));
}

const Command sBoxBlur(Group::Operations, "boxblur", "Blur frames by boxes", Declare, Run);

} // namespace

void Blur(Frame& frame, const BoxBlur& blur) {
    RequireBlurrable(frame);
    constexpr int32_t kAllBytes = PK_BoxBlur_Byte0 | PK_BoxBlur_Byte1 | PK_BoxBlur_Byte2 | PK_BoxBlur_Byte3;
    const int32_t flags = kAllBytes | (blur.renormalise ? PK_BoxBlur_Renormalise : 0);
    const int32_t width = frame.Width();
    const int32_t height = frame.Height();
    std::vector<uint32_t> scratch(static_cast<size_t>(int64_t{width} + height + std::max(width, height)));
    std::vector<double> radii(static_cast<size_t>(blur.passes), blur.radius);
    const auto run = [&](int32_t direction) {
        PK_BoxBlur(blur.passes, radii.data(), flags | direction, scratch.data(), frame.Pixels(),
                   frame.RowBytes(), width, height);
    };
    if (blur.rows) run(0);
    if (blur.columns) run(PK_BoxBlur_Columns);
}

} // namespace tool
