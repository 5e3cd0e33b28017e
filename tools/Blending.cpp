#include "Blending.h"

#include "Failure.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <utility>

namespace tool {
namespace {

constexpr const char* kNames[] = {
    "Color",       "ColorBurn",   "ColorDodge", "Darken",     "DarkerColor", "Difference",   "Dissolve",
    "Exclusion",   "HardLight",   "HardMix",    "Hue",        "Lighten",     "LighterColor", "LinearBurn",
    "LinearDodge", "LinearLight", "Luminosity", "Multiply",   "Normal",      "Overlay",      "PinLight",
    "Saturation",  "Screen",      "SoftLight",  "VividLight", "Subtract",    "Divide",
};
static_assert(std::size(kNames) == PK_BlendMode_Divide + 1);

} // namespace

std::span<const char* const> ModeNames() {
    return kNames;
}

PK_BlendMode ModeOfName(const std::string& name) {
    const auto* const found = std::ranges::find(kNames, name);
    if (found != std::end(kNames)) return static_cast<PK_BlendMode>(found - kNames);
    std::string all;
    for (const char* const known : kNames) all += std::string(all.empty() ? "" : ", ") + known;
    throw Failure(kExitUsage, "there is no blend mode '" + name + "'; the modes are " + all);
}

Frame Blended(const Frame& top, const Frame& back, const Blend& blend) {
    if (top.Width() != back.Width() || top.Height() != back.Height())
        throw Failure(kExitFailed, "the pictures differ in size: the top one has " + SizeText(top) +
                                       ", the back one " + SizeText(back));
    Frame result(blend.inLinear ? PK_PixelFormat_BGRA_4444_32f_Linear : back.Format(), back.Width(),
                 back.Height());
    const auto lay = [&](const uint8_t* from, const uint8_t* behind, uint8_t* to, int32_t rows) {
        Require(PK_CompositeWithBlendMode(from, top.RowBytes(), top.Format(), behind, back.RowBytes(),
                                          back.Format(), to, result.RowBytes(), result.Format(), back.Width(),
                                          rows, blend.opacity, blend.mode, kDefaultQuality, blend.inLinear),
                "composite", back);
    };
    if (blend.mode == PK_BlendMode_Dissolve) { // row by row it draws the same numbers each time
        std::srand(1);
        for (int32_t row = 0; row < back.Height(); ++row)
            lay(top.Row(row), back.Row(row), result.Row(row), 1);
    } else {
        lay(top.Pixels(), back.Pixels(), result.Pixels(), back.Height());
    }
    return blend.inLinear ? Converted(result, back.Format(), kDefaultQuality) : std::move(result);
}

} // namespace tool
