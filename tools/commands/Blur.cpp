// pixelkiln blur: the Gaussian blur along rows and columns.

#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "Numbers.h"
#include "Operations.h"
#include "SharedWords.h"

#include <algorithm>

namespace tool {
namespace {

constexpr const char* kNotes =
    R"(Pixels are blurred with their alpha. Without --repeat-edge the picture fades to transparent at its edges, for
which --grow makes room.

Examples:
  pixelkiln blur cat.png soft.png --sigma 4 --repeat-edge
  pixelkiln blur cat.png panned.png --sigma 25,0 --repeat-edge --linear
  pixelkiln blur logo.png glow.png --sigma 12 --grow 40
)";

struct Options : PipeOptions {
    std::string sigma;
    GaussianBlur blur;
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words.Take("--sigma", options.sigma, "In pixels, or X,Y for rows and columns; 0 leaves a direction out")
        .Required();
    words.Flag("--repeat-edge", options.blur.repeatEdge, "Let the pixels at the edges go on for ever");
    words.Flag("--linear", options.blur.linear, "Blur light instead of the codes of samples");
    words
        .Take("--grow", options.blur.grow,
              "Pixels more on each side, for the blur to spread; in the directions that are blurred")
        .Between(0, 10000)
        .ShowDefault();
    words.Notes(kNotes);
}

void ParseSigma(const std::string& text, GaussianBlur& blur) {
    const size_t count = text.find(',') == std::string::npos ? 1 : 2;
    const std::vector<double> sigmas =
        ParseNumbers(text, count, "a sigma, or one for rows and one for columns");
    if (*std::ranges::min_element(sigmas) < 0) throw Failure(kExitUsage, "a sigma is not below 0");
    blur.sigmaX = sigmas.front();
    blur.sigmaY = sigmas.back();
}

void Run(const Options& options) {
    GaussianBlur blur = options.blur;
    blur.quality = options.quality;
    ParseSigma(options.sigma, blur);
    PipeFramesInTheirFormat(options, [&](const Frame& frame) { return Blurred(frame, blur); });
}

const Command sBlur(Group::Operations, "blur", "Blur frames by a Gaussian", Declare, Run);

bool HasFourChannels(PK_PixelFormat format) {
    constexpr PK_PixelFormat kSubsampled = 0x30, kAlpha = 0xc;
    return (format & kSubsampled) == 0 && (format & kAlpha) != 0;
}

void RequireFourChannels(PK_PixelFormat format) {
    if (HasFourChannels(format)) return;
    throw Failure(kExitFailed, "cannot blur a frame of " + FormatName(format) +
                                   ": only formats of four channels are blurred; take it to one with --from, "
                                   "such as --from BGRA_4444_15u");
}

} // namespace

Frame Blurred(const Frame& frame, const GaussianBlur& blur) {
    RequireFourChannels(frame.Format());
    constexpr int32_t kBothDirections = 3;
    Frame result(frame.Format(), frame.Width() + (blur.sigmaX > 0 ? 2 * blur.grow : 0),
                 frame.Height() + (blur.sigmaY > 0 ? 2 * blur.grow : 0));
    Require(PK_GaussianBlur(frame.Pixels(), frame.RowBytes(), frame.Width(), frame.Height(), frame.Format(),
                            result.Pixels(), result.RowBytes(), result.Width(), result.Height(),
                            result.Format(), blur.sigmaX, blur.sigmaY, blur.repeatEdge, blur.linear,
                            kBothDirections, blur.quality),
            "blur", frame);
    return result;
}

} // namespace tool
