#pragma once

// A picture placed in another, as motion does it.

#include "Frame.h"

namespace tool {

struct Placing {
    PK_Point position = {0.5f, 0.5f}, anchor = {0.5f, 0.5f}, scale = {1, 1}; ///< y from the top
    double rotation = 0;
    double opacity = 1;
    double softness = 0;
    bool smoothEdges = false;
    PK_BlendMode mode = PK_BlendMode_Normal;
    int32_t sourceField = 0, destinationField = 0;
    int32_t renderField = 0; ///< of the destination, which alone is drawn; 0: all rows
    int32_t quality = kDefaultQuality;
};

/// Between two placings, a fraction of the way from the first; what is no number is that of the first.
Placing Between(const Placing& from, const Placing& to, double way);

/// The picture in the format that is sampled at a quality.
Frame ToBePlaced(const Frame& picture, int32_t quality);

/// \param picture  as ToBePlaced makes it.
/// \param back     of any raster format.
void Place(const Frame& picture, const Placing& placing, Frame& back);

} // namespace tool
