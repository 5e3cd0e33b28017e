#pragma once

// Kernels that sample one row of motion's destination: they walk along a straight line through the source and leave a
// premultiplied float pixel for each column in the order of BGRA or VUYA, at the scale of the source's codes. Kernel
// sources include this header.

#include "primitives/KernelShapes.h"

namespace PK {

/// Weights for one axis, as ResampleKernel has them: 128 rows of `width`, at most 20. A width below 1 has none.
struct ResampleTable {
    const int16_t* weights;
    int32_t width;
};

/// first to inner is sampled with a look at the edges of the source, as is right to end; what is between lies inside.
struct MotionParts {
    int32_t first, inner, right, end;
};

/// Where the columns of rows that are not turned lie in the source, the same for all rows of a band. The first of them that
/// is sampled fills it.
struct MotionColumns {
    static constexpr int32_t kMore = 16; // that are written behind the last one

    int32_t* pixels;  // for each column the first pixel that it takes
    int32_t* weights; // bits of its fraction of the way to the next one, or the phase of a table
    MotionParts parts = {0, 0, 0, 0};
    bool areNear = false; // those of a vector are no further apart than it is wide
};

struct MotionRow {
    const uint8_t* pixels; // column 0 of row 0, which need not be in the rectangle
    int64_t rowBytes;
    int32_t left, top, right, bottom; // what may be read; right and bottom are exclusive
    float x, y;                       // where the first column lies in the source
    float stepX, stepY;               // from one column to the next
    int32_t columns;
    bool rotated;                   // else y is the same for all columns
    bool smoothEdges;               // what lies outside is transparent; else the nearest pixel stands for it
    bool isOpaque;                  // alpha means nothing and counts as full; of what is not straight
    ResampleTable kernelX, kernelY; // only read at the highest quality
    MotionColumns* shared;          // by the rows of a band; not read where they are turned
};

/// The columns that the source reaches. Others are not written.
struct MotionSpan {
    int32_t first, count;
};

/// \param line  a pixel of four floats for each column.
using SampleMotionRow = MotionSpan (*)(const MotionRow& row, float* line);

/// \param margin  that a place inside keeps from the edges, and that one outside may have.
MotionParts PartsOfRow(const MotionRow& row, int32_t margin) noexcept;

/// The layouts that have kernels, after each of which stands, where there is one, that with alpha first.
enum MotionLayout : int32_t {
    kMotionRGB8,
    kMotionRGB8AlphaFirst,
    kMotionYUV8,
    kMotion15,
    kMotion15AlphaFirst,
    kMotionFloats,
    kMotionFloatsAlphaFirst,
    kMotionLayouts
};

enum class MotionAlpha : int32_t { straight, premultiplied };

/// (channel - zero) x scale, by channel.
struct LineScale {
    float zero[4], scale[4];
};

struct MotionSampleKernels {
    SampleMotionRow straight[kMotionLayouts];
    SampleMotionRow premultiplied[kMotionLayouts]; // and opaque

    // Takes a line to the range of floats; in place, too.
    RowKernelWith<LineScale> scaleLine;

    static constexpr const char* kFamily = "MotionSample";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const MotionSampleKernels& For();
};

/// By the weights of two tables: premultiplied floats.
struct MotionResampleKernels {
    SampleMotionRow alphaLast, alphaFirst;

    static constexpr const char* kFamily = "MotionResample";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const MotionResampleKernels& For();
};

} // namespace PK
