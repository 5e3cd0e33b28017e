// pixelkiln warp: a picture drawn into a quadrilateral.

#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "Numbers.h"
#include "Operations.h"
#include "Png.h"
#include "SharedWords.h"

#include <algorithm>
#include <optional>

namespace tool {
namespace {

// Corners of the picture as one sees it, in the rows of memory.
std::array<double, 8> InMemory(std::array<double, 8> quad, const Frame& frame) {
    if (PK_IsOriginTopLeft(frame.Format())) return quad;
    for (size_t y = 1; y < quad.size(); y += 2) quad[y] = frame.Height() - quad[y];
    return quad;
}

std::array<double, 8> CornersOf(const Frame& frame) {
    const double right = frame.Width();
    const double bottom = frame.Height();
    return {0, 0, right, 0, right, bottom, 0, bottom};
}

void RequireBlended(PK_PixelFormat format) {
    if (format == PK_PixelFormat_BGRA_4444_8u || format == PK_PixelFormat_VUYA_4444_8u) return;
    throw Failure(kExitFailed, "cannot warp a frame of " + FormatName(format) +
                                   ": only BGRA_4444_8u and VUYA_4444_8u are composited; take it to one with "
                                   "--from");
}

Frame Background(const Frame& picture, const std::optional<Frame>& onto) {
    if (onto) return Converted(*onto, picture.Format(), kDefaultQuality);
    Frame black(picture.Format(), picture.Width(), picture.Height());
    Fill(black, "black");
    return black;
}

struct Options : PipeOptions {
    Warp warp;
    std::string quad;
    std::string onto;
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words
        .Take("--quad", options.quad,
              "x0,y0,...,x3,y3: where the corners go, in pixels, clockwise from the top left one")
        .Required();
    words.Take("--onto", options.onto, "PNG file to draw on; without it, black");
    words.Take("--feather", options.warp.feather, "Width of a soft rim in pixels; needs quality 3")
        .Between(0.0, 1e6)
        .ShowDefault();
    words.Take("--opacity", options.warp.opacity, "0 to 255").Between(0, 255).ShowDefault();
}

void Run(const Options& options) {
    const std::vector<double> numbers = ParseNumbers(options.quad, 8, "a quadrilateral x0,y0,...,x3,y3");
    Warp warp = options.warp;
    warp.quality = options.quality;
    std::copy(numbers.begin(), numbers.end(), warp.quad.begin());
    std::optional<Frame> onto;
    if (!options.onto.empty()) onto.emplace(ReadPng(options.onto));
    PipeFramesInTheirFormat(options, [&](const Frame& frame) {
        RequireBlended(frame.Format());
        Frame background = Background(frame, onto);
        DrawWarped(frame, warp, background);
        return background;
    });
}

const Command sWarp(Group::Operations, "warp", "Draw frames into a quadrilateral", Declare, Run);

} // namespace

void DrawWarped(const Frame& picture, const Warp& warp, Frame& background) {
    RequireBlended(picture.Format());
    const PK_Rect source = {0, 0, picture.Width(), picture.Height()};
    const PK_Rect destination = {0, 0, background.Width(), background.Height()};
    const std::array<double, 8> from = InMemory(CornersOf(picture), picture);
    const std::array<double, 8> to = InMemory(warp.quad, background);
    const bool blend = true;
    const PK_Result result = PK_WarpAffineQuad(
        nullptr, nullptr, picture.Pixels(), picture.RowBytes(), &source, from.data(), background.Pixels(),
        background.RowBytes(), &destination, to.data(), warp.quality, warp.opacity, blend,
        /*keepSourceAlpha=*/false, picture.Format(), /*field=*/0, /*ignoreFields=*/false,
        /*featherOver=*/false, warp.feather);
    Require(result, "warp", picture);
}

} // namespace tool
