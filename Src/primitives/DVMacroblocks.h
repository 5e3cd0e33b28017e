#pragma once

// Decoded blocks of DV as bytes. A block is eight lines of eight samples of 16 bits around 0; a sample v becomes 255 if it
// is 128 or more, else max(v, -128) + 128.

#include "primitives/simd/Targets.h"

#include <cstddef>
#include <cstdint>

namespace PK {

/// Lines of 16 luma samples as pairs of pixels, YUYV: of two blocks of luma and one each of U and V.
struct DVPairs {
    const int16_t* left;
    const int16_t* right;
    const int16_t* u;
    const int16_t* v;
    int32_t
        lineStep; ///< 1 for all eight lines of the blocks, 2 for every second, from where the pointers are
};

/// The bodies of one target. They check nothing.
struct DVMacroblockKernels {
    /// 64 samples to 64 bytes.
    void (*toBytes)(const int16_t* block, uint8_t* bytes);

    /// Rows of 32 bytes, 8 / lineStep of them.
    void (*toYUYV)(const DVPairs& pairs, uint8_t* destination, ptrdiff_t rowBytes);

    static constexpr const char* kFamily = "DVMacroblock";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DVMacroblockKernels& For(); // DVMacroblocks.kernels.cpp
};

/// Five macroblocks of DV50, of 16 x 8 pixels each, to YUYV.
/// \param blocks       of each macroblock the first of six: Y left, one that is dropped, Y right, another, V, U.
/// \param destination  where each begins.
/// \param lineStep     1, or 2 for every second line from that of the pointers: four rows are written then.
/// \return 0; -8 for a null pointer.
int32_t PackMacroblocksDV50(const int16_t* const (&blocks)[5], uint8_t* const (&destination)[5],
                            ptrdiff_t rowBytes, int32_t lineStep) noexcept;

/// Where a piece of a macroblock of DV100 goes, 16 x 8 pixels.
struct DVPiece {
    uint8_t* destination; ///< of its first line that is wanted; null for none of them
    ptrdiff_t rowBytes;
    int32_t firstLine, lineStep; ///< those of the piece that are wanted
};

/// Five macroblocks of DV100, of two pieces each, to YUYV.
/// \param blocks  5 x 8 blocks: four of Y, two of each piece, then V of each, then U of each.
/// \return 0; -8 for null blocks.
int32_t PackMacroblocksDV100(const int16_t* blocks, const DVPiece (&pieces)[5][2]) noexcept;

} // namespace PK
