#pragma once

// The parse of a video segment of DV: five macroblocks of six or eight blocks, whose code words fill areas of fixed size
// first, then what is spare in the macroblock, then what is spare in the segment. Source: IEC 61834-2, SMPTE 314M and 370M.

#include "primitives/DVCodes.h"

#include <array>
#include <cstdint>
#include <span>

namespace PK {

/// The places in the block by the place in the scan.
using DVScan = std::array<uint8_t, 64>;

/// Code words by the bits that they begin with. Every bit string has an entry: what no encoder writes leads somewhere too.
struct DVHuffmanTable {
    static constexpr uint32_t kIndexBits = 11;

    /// A step along the scan and the level there. A step that leads past any block ends it.
    struct Symbol {
        int16_t level;
        uint8_t advance;
        uint8_t bits; ///< with the sign; 0 where kIndexBits do not tell
    };

    /// The first one or two code words in kIndexBits bits. Where there is one, it stands for the second too, so that two
    /// can always be written.
    struct Pair {
        int16_t firstLevel, secondLevel;
        uint8_t firstAdvance, advance; ///< of the first, and of all
        uint8_t firstBits, bits;
    };

    Pair pairs[1 << kIndexBits];
    Symbol longCodes[1 << kIndexBits]; ///< by the bits behind the first five, which are ones
};

/// Builds the table of a code.
/// \param codes    the list, as kDVCodes.
/// \param escapes  for runs and for amplitudes.
/// \return 0; -8 for a null pointer.
int32_t InitDVHuffmanTable(std::span<const DVCode> codes, const DVEscape (&escapes)[2],
                           DVHuffmanTable* table) noexcept;

/// How far blocks are parsed: to the end, or only until they have passed the last place of the scan that is wanted.
struct DVParseDepth {
    static constexpr uint8_t kAll = 64;
    uint8_t stop88 = kAll, stop248 = kAll;
};

/// Decodes the five DIF blocks of a segment of DV25 or DV50. The parse ends where the bits do: whatever they are, nothing
/// outside the segment is read, and a block stays as far as it came.
/// \param segment       400 bytes.
/// \param scans         the places in the block by the place in the scan, of 8-8 and of 2-4-8 mode.
/// \param coefficients  5 x 6 blocks of 64 zeros, which receive DC (9 bits with a sign) and levels in raster order.
/// \param blockParams   receives a word for each block: in byte 0 bit 6 the mode and bits 5 and 4 the class, in byte 2 bits
///                      3 to 0 the QNO of the macroblock.
/// \return 0; -8 for a null pointer.
int32_t HuffmanDecodeSegmentDV(const uint8_t* segment, const DVScan (&scans)[2], const DVHuffmanTable* table,
                               int16_t* coefficients, uint32_t* blockParams,
                               DVParseDepth depth = {}) noexcept;

/// The same for DV100: 5 x 8 blocks, all of 8-8 mode. The mode bit of a macroblock's first block tells field lines.
/// \param scan  of 8-8 mode.
int32_t HuffmanDecodeSegmentDV100(const uint8_t* segment, const DVScan& scan, const DVHuffmanTable* table,
                                  int16_t* coefficients, uint32_t* blockParams,
                                  DVParseDepth depth = {}) noexcept;

} // namespace PK
