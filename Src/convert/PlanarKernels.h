#pragma once

// The row kernels of planar 4:2:0, one structure a kernel source. Kernel sources include this header, so it holds nothing
// that the compiler could emit once per instruction set.

#include "primitives/KernelShapes.h"

namespace PK {

/// What two rows of chroma give to the row between them, in eighths.
struct ChromaWeights {
    int32_t first, second;
};

/// Planes of bytes to pixels. A row of chroma has a sample for every two pixels, the last of an odd width included.
struct PlanarDecodeKernels {
    /// (first a + second b + 4) >> 3.
    TwoRowKernelWith<ChromaWeights> blendChroma;

    /// Chroma as it stands. The second luma of a lone last pixel is that of the pixel.
    PlanesRow toUYVY;

    /// Opaque, with a chroma for each pixel: from samples that stand at the even pixels, or between the two.
    PlanesRow toVUYXFromEven;
    PlanesRow toVUYXFromBetween;

    /// Opaque, from every first, second, fourth or eighth luma sample and its chroma, unfiltered. Of the rows as many
    /// samples are read as pixels are left out.
    PlanesRow every1, every2, every4, every8;

    static constexpr const char* kFamily = "PlanarDecode";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const PlanarDecodeKernels& For(); // PlanarDecode.kernels.cpp
};

/// Rows that get wider on the way: each plane to floats in the range of bytes, these if need be to another matrix, and then
/// to pixels.
struct PlanarWidenKernels {
    /// Of two samples a, (a + b) >> 1, b; the width counts what comes out.
    RowKernel by3To2;

    /// Of three samples a, (a + 2 b) x 0.33333334, (2 b + c) x 0.33333334, c.
    RowKernel by4To3;

    /// From the matrix of BT.601 to that of BT.709: Y of Y, U and V, and U and V of both.
    PlanesRow lumaTo709;
    TwoRowKernel uTo709, vTo709;

    /// Four times a sample, rounded to nearest, in words: codes of 10 bits.
    RowKernel toWords;

    /// Rounded to nearest, by the current mode, chroma serving two pixels; to RGB through a matrix.
    PlanesRow toUYVY, toVUYX;
    PlanesRow toBGRX601, toBGRX709;

    static constexpr const char* kFamily = "PlanarWiden";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const PlanarWidenKernels& For(); // PlanarWiden.kernels.cpp
};

/// Pixels of four bytes to planes.
struct PlanarEncodeKernels {
    /// A row of pixels to luma and, for each pair, the sums of its U in the lower and its V in the upper half of four bytes:
    /// weighed 1-2-1 around the even pixel, where the first pixel stands for the one before it. There is room for the sums
    /// of whole groups of kGroup pixels.
    using EncodeRow = void (*)(const void* pixels, void* luma, void* sums, int32_t width);
    static constexpr int32_t kGroup = 64;
    EncodeRow fromVUYP;
    EncodeRow fromBGRX601, fromBGRX709; ///< opaque, or with alpha multiplied in already
    EncodeRow fromBGRA601, fromBGRA709;

    /// The sums of two rows to a byte for each pair, >> 3.
    TwoRowKernel u, v;

    static constexpr const char* kFamily = "PlanarEncode";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const PlanarEncodeKernels& For(); // PlanarEncode.kernels.cpp
};

} // namespace PK
