#pragma once

// The blocks of a segment as bits: the code words of each, and their three-pass packing into the areas of the five
// macroblocks.

#include "dv/DVBlockKernels.h"
#include "dv/DVFormat.h"
#include "dv/DVTables.h"

#include <span>

namespace PK {

/// A block of a segment on its way to code words.
struct DVBlock {
    int16_t*
        coefficients; ///< Samples, line after line; then weighted, in the order of the scan, with a place 0 of 0.
    int16_t dc;
    uint8_t mode; ///< The bit of the head: 1 for 2-4-8; of DV100, for fields.
    uint8_t classNumber;
    bool isDummy; ///< Has no samples.
};

/// Bits of a block's head and end: DC, mode, class, and the word behind the last level.
inline constexpr int32_t kDVHeadBits = 12, kDVLeastBits = 16;

/// How many bits a block takes with these levels.
int32_t BitsOfBlock(const DVLevels& levels);

/// Where the blocks of a macroblock have their areas, in bytes.
struct DVArea {
    uint8_t offset, bytes;
};
std::span<const DVArea> AreasOfMacroblock(int32_t blocks);

/// The bits of the blocks of a segment, until they are packed.
class DVSegmentWriter {
public:
    static constexpr int32_t kMostBlocks = 8 * kMacroblocksOfSegment;

    explicit DVSegmentWriter(int32_t blocksOfMacroblock)
        : fBlocks(blocksOfMacroblock), fAreas(AreasOfMacroblock(blocksOfMacroblock)) {}

    /// Sets the bits of a block.
    /// \param place  in the segment.
    void SetBlock(int32_t place, const DVBlock& block, const DVLevels& levels);

    /// Writes all behind the QNO of each macroblock. What has no room is dropped, and what is left over is ones.
    void Pack(uint8_t* segment);

private:
    static constexpr int32_t kRoom =
        256; // 63 of the longest words, and a head, have 231 bytes, and ones are behind them

    struct Bits {
        int32_t count; // in all
        int32_t packed;
        alignas(8) uint8_t bytes[kRoom];
    };

    /// The part of an area that its own block has left.
    struct Spare {
        uint8_t* bytes;
        int32_t next, end; // in bits
    };

    void FillOwnArea(int32_t place, uint8_t* macroblock);
    void Move(Bits& from, Spare& to) const;
    void FillSpare(int32_t firstBlock, int32_t endBlock);

    int32_t fBlocks;
    std::span<const DVArea> fAreas;
    uint8_t* fSegmentEnd = nullptr;
    Bits fBits[kMostBlocks];
    Spare fSpare[kMostBlocks];
};

} // namespace PK
