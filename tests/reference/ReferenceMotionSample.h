#pragma once

// Motion's sampling of one row, restated pixel by pixel: in float, where it is the arithmetic that bodies are held to, and in
// double precision, where it is the definition.

#include <PixelKiln/Types.h>

#include <array>
#include <cstdint>
#include <vector>

namespace PKReference {

/// Columns 0 and on of one row, from what stands in a format.
struct MotionSource {
    const uint8_t* pixels; ///< column 0 of row 0
    int64_t rowBytes;
    PK_Rect rect; ///< what may be read
    PK_PixelFormat format;
    bool smoothEdges;
};

struct MotionLine {
    PK_Point at, step;
    int32_t columns;
    bool rotated;
};

/// Where a column lies, and whether far from all edges. Where a row that is not turned has columns that are close enough,
/// the two rows that it lies between are mixed first.
struct MotionPlace {
    PK_Point at;
    bool isInside;
    bool isMixed = false;
};

struct MotionPlaces {
    int32_t first;
    std::vector<MotionPlace> places;
};

MotionPlaces WalkMotionLine(const PK_Rect& rect, const MotionLine& line, int32_t margin);

/// \tparam Real  float or double.
template <class Real>
std::array<Real, 4> SampleBilinear(const MotionSource& source, const MotionPlace& place);

/// Weights of an axis: 128 rows.
struct MotionWeights {
    const int16_t* weights;
    int32_t width;
};

struct MotionSum {
    std::array<double, 4> pixel;
    double magnitude; ///< what the products add up to without their signs
};

/// Premultiplied float RGB, as a sum over the area that both axes reach.
MotionSum SampleByWeights(const MotionSource& source, PK_Point at, MotionWeights x, MotionWeights y);

} // namespace PKReference
