#pragma once

// The pixel conversions of a colour space as functions of values.

#include "support/ColourPixels.h"

#include <PixelKiln/ColorSpace.h>

namespace PKTest {

enum class Way { kFromHub, kToHub };

inline void Convert(const PK::ColorSpace& space, Way way, const float* source, float* destination,
                    int32_t count, bool gamutClip = false) {
    if (way == Way::kFromHub)
        space.ConvertPixelsFromRec709(source, destination, count, gamutClip);
    else
        space.ConvertPixelsToRec709(source, destination, count, gamutClip);
}

inline ColourPixels Convert(const PK::ColorSpace& space, Way way, const ColourPixels& pixels,
                            bool gamutClip = false) {
    ColourPixels result(pixels.size());
    Convert(space, way, Floats(pixels), Floats(result), static_cast<int32_t>(pixels.size()), gamutClip);
    return result;
}

/// One pixel in a group of eight, which the vector bodies take where there are any.
inline ColourPixel ConvertInBulk(const PK::ColorSpace& space, Way way, const ColourPixel& pixel,
                                 bool gamutClip = false) {
    return Convert(space, way, ColourPixels(8, pixel), gamutClip).front();
}

/// One pixel by itself.
inline ColourPixel ConvertAlone(const PK::ColorSpace& space, Way way, const ColourPixel& pixel,
                                bool gamutClip = false) {
    return Convert(space, way, ColourPixels(1, pixel), gamutClip).front();
}

inline ColourPixel Grey(float value) {
    return {value, value, value, 1};
}

} // namespace PKTest
