#pragma once

// The compression of a video segment of DV25 and DV50: from samples to five DIF blocks.

#include "dv/DVPolicy.h"
#include "dv/DVSegmentWriter.h"

namespace PK {

struct BlockTransformKernels;
struct CoefficientKernels;

/// Compresses segment after segment, and begins the search for a quantiser where the one before has found its own.
class SegmentCompressor {
public:
    /// \param haveDummies  the second and fourth block of a macroblock have no samples: DV50.
    SegmentCompressor(const DVPolicy& policy, bool haveDummies);
    virtual ~SegmentCompressor() = default;
    SegmentCompressor(const SegmentCompressor&) = delete;
    SegmentCompressor& operator=(const SegmentCompressor&) = delete;

    /// Where a block takes its samples, less 128 and taken 2^(policy.sampleBits) times. Blocks stand one behind the other.
    int16_t* Samples(int32_t macroblock, int32_t block) {
        return fBlocks[macroblock * fBlocksOfMacroblock + block].coefficients;
    }

    /// Compresses the samples, which it overwrites.
    /// \param segment  five DIF blocks. Their IDs stay as they are.
    virtual void Compress(uint8_t* segment);

protected:
    SegmentCompressor(const DVPolicy& policy, int32_t blocksOfMacroblock, int32_t firstStep);

    /// A quantiser of a block.
    struct Quantiser {
        const DVBlockFactors& factors;
        float least; ///< Levels below are left out.
        uint8_t qno, classNumber;
    };

    static constexpr int32_t kMostSteps = 32;

    /// The quantisers that there are for a block, by step from the coarsest, 0, to the finest.
    /// \param isTooLarge  a level has passed 255 with the quantiser that is otherwise meant.
    virtual Quantiser QuantiserOf(const DVBlock& block, int32_t step, bool isTooLarge) const;
    virtual int32_t FinestStep() const;

    std::span<DVBlock> Blocks() {
        return {fBlocks, static_cast<size_t>(kMacroblocksOfSegment * fBlocksOfMacroblock)};
    }

    /// Sets the coefficients of a block from its values line after line.
    static void TakeInOrder(DVBlock& block, const int16_t* values);
    /// DC from a transform of samples: a quarter of it.
    int16_t DCOf(int16_t transformed) const;

    /// Chooses quantisers, and writes code words.
    void QuantiseAndWrite(float roundUp, uint8_t* segment);

    const DVPolicy& fPolicy;
    const BlockTransformKernels& fTransforms;
    const CoefficientKernels& fCoefficientKernels;
    const DVBlockKernels& fKernels;

private:
    static constexpr int32_t kBudget = 3040, kUnknown = -1;
    static constexpr int32_t kKeptSteps = 2; ///< The search ends between two neighbours.
    static constexpr int32_t kMostBlocks = 8;

    /// As it is with a quantiser. That of a dummy stays without levels.
    struct QuantisedBlock {
        DVLevels levels{};
        uint8_t qno = 0, classNumber = 0;
    };
    struct QuantisedMacroblock {
        int32_t step;
        QuantisedBlock blocks[kMostBlocks];
    };

    void Transform(DVBlock& block) const;
    void Weigh(int32_t mode, int16_t* values) const;
    bool MayBeInFields(const int16_t* samples) const;
    bool IsBetterInFields(const int16_t* frame, const int16_t* fields) const;
    void ChooseClass(DVBlock& block, int32_t placeInMacroblock) const;
    void Quantise(const DVBlock& block, int32_t step, QuantisedBlock& quantised) const;
    std::span<const QuantisedBlock> QuantisedAt(int32_t macroblock, int32_t step);
    int32_t BitsOfMacroblock(int32_t macroblock, int32_t step);
    bool Fits(int32_t step);
    int32_t FinestThatFits();
    void RefineMacroblocks(int32_t (&steps)[kMacroblocksOfSegment]);

    int32_t fBlocksOfMacroblock;
    int32_t fLastStep;
    float fRoundUp = 0;
    int32_t fBits[kMacroblocksOfSegment]
                 [kMostSteps]; ///< Of the segment at hand, as far as they were asked for.
    QuantisedMacroblock fQuantised[kMacroblocksOfSegment][kKeptSteps];
    DVSegmentWriter fWriter;
    DVBlock fBlocks[DVSegmentWriter::kMostBlocks];
    alignas(64) int16_t fMemory[DVSegmentWriter::kMostBlocks][kCoefficients]{};
};

} // namespace PK
