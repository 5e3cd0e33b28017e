#pragma once

// What the rasteriser of the quad warp hands to the kernels that fill a span.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PK {

/// The image that is read. Bounds are inclusive.
struct WarpSource {
    const uint8_t* pixels; // column 0 of row 0
    int32_t stride;        // pixels from one row to the next
    int32_t left, top, right, bottom;

    // Bilinear sampling finds its upper row as nearest(y x rowScale + rowOffset) x rowStep - rowShift, and the
    // lower one rowStep further down: so it keeps to the rows of one field.
    float rowScale, rowOffset;
    int32_t rowStep, rowShift;
    int32_t lastRow; // the last that bilinear sampling may read: of the field, at or above the bottom

    bool offsetsFit; // whether the offset of every pixel, in pixels, fits 32 bits
};

/// How the pixels are written.
struct WarpPaint {
    int32_t opacity;      // 0 to 255
    bool writesEdgeAlpha; // the copying rule writes the edge alpha, whatever the source's alpha
};

/// Pixels side by side, with the place in the source and the edge alpha of the first and their slopes.
struct WarpSpan {
    uint8_t* pixels;
    int64_t count;
    float u, v, a;
    float du, dv, da;
};

using FillWarpSpan = void (*)(const WarpSource& source, const WarpPaint& paint, const WarpSpan& span);

enum class WarpSampling : uint8_t { nearest, bilinear };

/// One function for each rule of writing.
template <WarpSampling kSampling>
struct WarpKernels {
    FillWarpSpan featherOver; // colours over the destination by the edge alpha
    FillWarpSpan copy;
    FillWarpSpan blendBGRA;
    FillWarpSpan blendVUYA;
    FillWarpSpan blendOther; // formats whose colours are not mixed

    static constexpr const char* kFamily =
        kSampling == WarpSampling::nearest ? "WarpNearest" : "WarpBilinear";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const WarpKernels& For();
};
using WarpNearestKernels = WarpKernels<WarpSampling::nearest>;
using WarpBilinearKernels = WarpKernels<WarpSampling::bilinear>;

} // namespace PK
