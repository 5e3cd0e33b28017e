// pixelkiln fill: a frame of one colour.

#include "Command.h"
#include "Failure.h"
#include "Numbers.h"
#include "Operations.h"
#include "SharedWords.h"

namespace tool {
namespace {

struct NamedFill {
    const char* name;
    PK_Result (*fill)(void*, int32_t, int32_t, int32_t, PK_PixelFormat) noexcept;
};

constexpr NamedFill kNamedFills[] = {
    {"black", PK_FillWithOpaqueBlack},
    {"white", PK_FillWithOpaqueWhite},
    {"clear-black", PK_FillWithTransparentBlack},
    {"clear-white", PK_FillWithTransparentWhite},
};

bool IsV210(PK_PixelFormat format) {
    return format == PK_PixelFormat_V210_422_10u || format == PK_PixelFormat_V210_422_10u_709;
}

std::array<uint8_t, 4> ParseColour(const std::string& text) {
    const std::vector<double> numbers =
        ParseNumbers(text, 4, "black, white, clear-black, clear-white, nor a colour R,G,B,A");
    for (const double number : numbers)
        if (!(number >= 0 && number <= 255 && number == static_cast<int>(number)))
            throw Failure(kExitUsage,
                          "the samples of the colour '" + text + "' must be whole, from 0 to 255");
    const auto sample = [&](size_t i) { return static_cast<uint8_t>(numbers[i]); };
    return {sample(2), sample(1), sample(0), sample(3)};
}

struct Options : PipeOptions {
    std::string colour;
};

constexpr const char* kNotes =
    R"(A PNG is written from the format of --to, so that its losses show. 4:2:2 formats are filled in whole
pairs of pixels, and V210 with R,G,B,A in whole groups of six: what is left of a row stays 0.

Examples:
  pixelkiln fill black.v210 --size 1920x1080 --to V210_422_10u --colour black
  pixelkiln fill orange.png --size 640x360 --colour 255,128,0,255
)";

void Declare(Words& words, Options& options) {
    AddOutput(words, options);
    AddQuality(words, options.quality);
    words.Take("--size", options.size, "Width x height of the frame, such as 1920x1080").Required();
    words.Take("--to", options.to, "Format to fill; needed for raw frames");
    words.Take("--colour", options.colour, "black, white, clear-black, clear-white, or R,G,B,A from 0 to 255")
        .Required();
    words.Flag("--packed", options.packed, "Rows of a raw frame have no padding");
    words.Notes(kNotes);
}

void Run(const Options& options) {
    WriteMadeFrame(options, [&](Frame& frame) { Fill(frame, options.colour); });
}

const Command sFill(Group::Frames, "fill", "Make a frame of one colour", Declare, Run);

} // namespace

void Fill(Frame& frame, const std::string& colour) {
    for (const NamedFill& named : kNamedFills)
        if (colour == named.name) {
            const PK_Result result =
                named.fill(frame.Pixels(), frame.RowBytes(), frame.Width(), frame.Height(), frame.Format());
            Require(result, "fill", frame);
            return;
        }
    const std::array<uint8_t, 4> pixel = ParseColour(colour);
    const PK_Result result = PK_FillWithColor(frame.Pixels(), frame.RowBytes(), frame.Width(), frame.Height(),
                                              frame.Format(), pixel.data(), PK_PixelFormat_BGRA_4444_8u);
    // By rule a V210 image is filled and refused at once.
    if (!(IsV210(frame.Format()) && result == PK_ErrBadDstFormat)) Require(result, "fill", frame);
}

} // namespace tool
