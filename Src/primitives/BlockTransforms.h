#pragma once

// The cosine transforms of 8 x 8 blocks that the DV codecs stand on.
//
// A block is 64 values of 16 bits, line after line, at any alignment. All transforms are orthonormal: with
// C(0) = 1 / sqrt(8), C(k) = 1/2 and samples p(x, y), the coefficient of column h and line v is
//
//   8-8      F(h, v) = C(h) C(v) sum over x, y of p(x, y) cos(pi v (2y + 1) / 16) cos(pi h (2x + 1) / 16)
//   2-4-8    F(h, u)     = C(h) C(u) sum over x, z of [p(x, 2z) + p(x, 2z + 1)] cos(pi u (2z + 1) / 8)
//                                                     cos(pi h (2x + 1) / 16)
//            F(h, u + 4)   the same with p(x, 2z) - p(x, 2z + 1), u = 0 to 3
//
// so that a flat block of v has the one coefficient 8 v at place 0. The 2-4-8 form is for lines of two fields
// that differ: lines 0 to 3 of its coefficients are of the sums of neighbouring lines, 4 to 7 of their
// differences. The inverse transforms are the transposed ones.
//
// Results are rounded to integers by the current rounding mode and saturated to 16 bits. The work runs in
// float: before rounding, a result is off by less than 2^-22 times the root of the sum of the squares of the
// block, which is below 1/16 for every block and below 0.0005 for samples of eight bits.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PK {

/// The bodies of one target. They check nothing; a caller with many blocks takes Best<BlockTransformKernels>()
/// once and calls these. Source and destination may be the same block, but must not overlap otherwise.
struct BlockTransformKernels {
    using Transform = void (*)(const int16_t* source, int16_t* destination);
    Transform forward8x8, inverse8x8, forward248, inverse248;

    static constexpr const char* kFamily = "BlockTransform";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const BlockTransformKernels& For();
};

/// The forward 8-8 transform. The two blocks may be the same one, but must not overlap otherwise.
/// \return 0; -8 for a null pointer.
int32_t ForwardDCT8x8(const int16_t* source, int16_t* destination) noexcept;

/// The inverse 8-8 transform, in place.
/// \return 0; -8 for a null pointer.
int32_t InverseDCT8x8(int16_t* block) noexcept;

/// The forward 2-4-8 transform, in place.
/// \return 0; -8 for a null pointer.
int32_t ForwardDCT248(int16_t* block) noexcept;

/// The inverse 2-4-8 transform, in place.
/// \return 0; -8 for a null pointer.
int32_t InverseDCT248(int16_t* block) noexcept;

} // namespace PK
