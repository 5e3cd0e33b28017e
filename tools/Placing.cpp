#include "Placing.h"

#include "Failure.h"

#include <cmath>

namespace tool {
namespace {

/// Turned over: the library counts from the bottom.
PK_Point FromBottom(PK_Point place) {
    return {place.x, 1 - place.y};
}

PK_Point Between(PK_Point from, PK_Point to, double way) {
    const auto w = static_cast<float>(way);
    return {std::lerp(from.x, to.x, w), std::lerp(from.y, to.y, w)};
}

} // namespace

Placing Between(const Placing& from, const Placing& to, double way) {
    Placing placing = from;
    placing.position = Between(from.position, to.position, way);
    placing.anchor = Between(from.anchor, to.anchor, way);
    placing.scale = Between(from.scale, to.scale, way);
    placing.rotation = std::lerp(from.rotation, to.rotation, way);
    placing.opacity = std::lerp(from.opacity, to.opacity, way);
    placing.softness = std::lerp(from.softness, to.softness, way);
    return placing;
}

Frame ToBePlaced(const Frame& picture, int32_t quality) {
    constexpr int32_t kCubic = 5; // samples one format alone
    return Converted(picture, quality == kCubic ? PK_PixelFormat_BGRP_4444_32f_Linear : picture.Format(),
                     kDefaultQuality);
}

void Place(const Frame& picture, const Placing& placing, Frame& back) {
    Require(PK_MotionWithBlendMode(picture.Pixels(), picture.RowBytes(), picture.Width(), picture.Height(),
                                   picture.Format(), placing.sourceField, nullptr, back.Pixels(),
                                   back.RowBytes(), back.Width(), back.Height(), back.Format(),
                                   placing.destinationField, 1, 1, FromBottom(placing.position),
                                   FromBottom(placing.anchor), placing.scale, placing.rotation,
                                   static_cast<float>(placing.opacity), placing.softness, placing.smoothEdges,
                                   placing.renderField, placing.mode, placing.quality, false),
            "place", picture);
}

} // namespace tool
