// pixelkiln boxblur: box filters along rows and columns.

#include "Commands.h"
#include "Failure.h"
#include "Formats.h"
#include "Operations.h"

#include <algorithm>
#include <cmath>
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
        throw Failure(kExitFailed, "cannot blur a frame of " + std::to_string(frame.Width()) + "x" +
                                       std::to_string(frame.Height()) +
                                       ": no side may be shorter than 4 pixels");
}

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

void RunBoxBlur(const BoxBlurOptions& options) {
    if (std::isnan(options.radius)) throw Failure(kExitUsage, "the radius is no number");
    const bool both = options.rows == options.columns;
    const BoxBlur blur = {options.radius, options.passes, both || options.rows, both || options.columns,
                          options.renormalise};
    PipeFramesInTheirFormat(options, [&](const Frame& frame) {
        Frame blurred = Copied(frame);
        Blur(blurred, blur);
        return blurred;
    });
}

} // namespace tool
