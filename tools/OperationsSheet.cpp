#include "OperationsSheet.h"

#include "Operations.h"

#include <utility>

namespace tool {
namespace {

constexpr double kQuad[] = {0.2, 0.06, 0.95, 0.2, 0.8, 0.95, 0.05, 0.75}; // as fractions of the sides

Frame Filled(const Frame& like, const char* colour) {
    Frame frame(like.Format(), like.Width(), like.Height());
    Fill(frame, colour);
    return frame;
}

/// A picture too small for the blur stays as it is.
Frame BoxBlurred(const Frame& picture, const BoxBlur& blur) {
    constexpr int32_t kLeastSide = 4;
    Frame frame = Copied(picture);
    if (picture.Width() >= kLeastSide && picture.Height() >= kLeastSide) Blur(frame, blur);
    return frame;
}

Frame Warped(const Frame& picture, float feather, Frame background) {
    Warp warp = {{}, feather};
    for (size_t i = 0; i < warp.quad.size(); ++i)
        warp.quad[i] = kQuad[i] * (i % 2 == 0 ? picture.Width() : picture.Height());
    DrawWarped(picture, warp, background);
    return background;
}

Frame Stamped(const Frame& picture, const Stamp& stamp) {
    Frame frame = Copied(picture);
    Burn(frame, stamp);
    return frame;
}

} // namespace

std::vector<Tile> OperationTiles(const Frame& picture) {
    const auto feather = static_cast<float>(picture.Width()) / 16;
    std::vector<Tile> tiles;
    const auto add = [&](const char* title, const char* caption, Frame frame) {
        tiles.emplace_back(title, caption, std::move(frame));
    };
    add("fill", "255,128,0,255", Filled(picture, "255,128,0,255"));
    add("rotate", "90 degrees", Rotated(picture, 90));
    add("box blur", "radius 10, borders kept", BoxBlurred(picture, {10, 1, true, true, true}));
    add("box blur", "radius 10, borders fading", BoxBlurred(picture, {10, 1, true, true, false}));
    add("box blur", "radius 6.5, three passes, rows", BoxBlurred(picture, {6.5, 3, true, false, true}));
    add("warp", "over black", Warped(picture, 0, Filled(picture, "black")));
    add("warp", "feather of a sixteenth, over itself",
        Warped(picture, feather, BoxBlurred(picture, {20, 2, true, true, true})));
    add("stamp", "decimal and hexadecimal",
        Stamped(Stamped(picture, {-1234567, {0.04F, 0.04F}, 0.1F, false}),
                {0xbeef, {0.04F, 0.3F}, 0.2F, true}));
    return tiles;
}

} // namespace tool
