#pragma once

// A segment of DV between its bytes and its places in the picture: the decoder's working record.

#include "dv/DVPlacement.h"
#include "dv/DVTables.h"
#include "primitives/DVHuffman.h"
#include "primitives/DVTransforms.h"
#include "primitives/Dispatch.h"

namespace PK {

/// The size of a decoded picture, as a shift of the whole.
enum class DVSize : uint8_t { Full, Half, Quarter, Eighth };

/// Samples of a block along a line, and lines.
constexpr int32_t SideOfBlock(DVSize size) {
    return 8 >> static_cast<int32_t>(size);
}

/// The table of the code, made at the first need.
const DVHuffmanTable& DVCodeTable();

/// On the stack of the call.
class DVDecodeState {
public:
    DVDecodeState(const DVFormat& format, DVSize size) : fFormat(format), fSize(size) {}

    /// Parses the five macroblocks of a segment and makes samples around 0 of them: of each block as many as its size has,
    /// line after line.
    /// \param segment  400 bytes of whatever content.
    /// \param places   of the macroblocks.
    void Decode(const uint8_t* segment, const DVPlace (&places)[kMacroblocksOfSegment]);

    const int16_t* Block(int32_t macroblock, int32_t block) const {
        return fCoefficients + Offset(macroblock, block);
    }

    /// The two pieces of a macroblock of DV100 have the lines of one field each. What is reduced has not.
    bool HasLinesInTurns(int32_t macroblock) const {
        return fHasLinesInTurns[macroblock] && fSize == DVSize::Full;
    }

private:
    static constexpr int32_t kMostBlocks = kMacroblocksOfSegment * 8;
    static constexpr uint32_t kModeBit = 0x40;

    int32_t Blocks() const { return fFormat.BlocksOfMacroblock(); }
    int32_t Offset(int32_t macroblock, int32_t block) const {
        return kCoefficients * (macroblock * Blocks() + block);
    }
    int16_t* Block(int32_t macroblock, int32_t block) { return fCoefficients + Offset(macroblock, block); }
    uint32_t Parameters(int32_t macroblock, int32_t block) const {
        return fParameters[macroblock * Blocks() + block];
    }

    void TakeDC(const uint8_t* segment);
    void Parse(const uint8_t* segment);
    DVSteps Steps(int32_t macroblock, int32_t block) const;
    bool Is248(int32_t macroblock, int32_t block) const;
    DVTransformKernels::Transform TransformOf(bool is248) const;
    void TransformFour(int32_t macroblock, int32_t firstBlock);
    void Transform(int32_t macroblock);
    void JoinHalvedFields(int32_t macroblock);

    const DVFormat& fFormat;
    DVSize fSize;
    const DVHuffmanTable& fTable = DVCodeTable();
    const DVTransformKernels& fTransforms = Best<DVTransformKernels>();
    const DVFourBlocksKernels& fFourTransforms = Best<DVFourBlocksKernels>();
    bool fHasLinesInTurns[kMacroblocksOfSegment] = {};
    uint32_t fParameters[kMostBlocks] = {};
    alignas(64) int16_t fCoefficients[kMostBlocks * kCoefficients] = {};
};

} // namespace PK
