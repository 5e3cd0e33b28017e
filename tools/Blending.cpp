#include "Blending.h"

#include "Failure.h"

#include <algorithm>
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
    Require(PK_CompositeWithBlendMode(top.Pixels(), top.RowBytes(), top.Format(), back.Pixels(),
                                      back.RowBytes(), back.Format(), result.Pixels(), result.RowBytes(),
                                      result.Format(), back.Width(), back.Height(), blend.opacity, blend.mode,
                                      kDefaultQuality, blend.inLinear),
            "composite", back);
    return blend.inLinear ? Converted(result, back.Format(), kDefaultQuality) : std::move(result);
}

} // namespace tool
