#include "dv/DVSegment.h"

#include "dv/ReduceBlock.h"
#include "primitives/FirstUse.h"

#include <algorithm>

namespace PK {

const DVHuffmanTable& DVCodeTable() {
    static constinit FirstUse<DVHuffmanTable> sTable;
    return sTable.Get([] {
        DVHuffmanTable table{};
        InitDVHuffmanTable(kDVCodes, {kDVRunEscape, kDVAmplitudeEscape}, &table);
        return table;
    });
}

void DVDecodeState::Decode(const uint8_t* segment, const DVPlace (&places)[kMacroblocksOfSegment]) {
    if (fSize == DVSize::Eighth) return TakeDC(segment);
    Parse(segment);
    for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) {
        // The lines below the last whole macroblock are too few for it.
        fHasLinesInTurns[i] = fFormat.IsHD() && !fFormat.isProgressive && places[i].shape == DVShape::kHD &&
                              (Parameters(i, 0) & kModeBit) != 0;
        Transform(i);
    }
}

/// DC without its lowest bit is the mean of the block.
void DVDecodeState::TakeDC(const uint8_t* segment) {
    constexpr uint8_t kPlaces[] = {4, 18, 32, 46, 60, 70};
    for (int32_t i = 0; i < kMacroblocksOfSegment; ++i, segment += kDIFBlockBytes)
        for (int32_t j = 0; j < Blocks(); ++j) Block(i, j)[0] = static_cast<int8_t>(segment[kPlaces[j]]);
}

void DVDecodeState::Parse(const uint8_t* segment) {
    std::fill_n(fCoefficients, kMacroblocksOfSegment * Blocks() * kCoefficients, int16_t{0});
    const DVParseDepth depth = DepthOfReduction(fSize);
    if (fFormat.IsHD())
        HuffmanDecodeSegmentDV100(segment, kScan[0], &fTable, fCoefficients, fParameters, depth);
    else
        HuffmanDecodeSegmentDV(segment, kScan, &fTable, fCoefficients, fParameters, depth);
}

/// Levels to the coefficients of the orthonormal transform.
void DVDecodeState::Dequantise(int16_t* block, int32_t index, uint32_t parameters) const {
    const uint32_t mode = parameters >> 6 & 1, classNumber = parameters >> 4 & 3, qno = parameters >> 16;
    if (!fFormat.IsHD()) {
        constexpr int32_t kFactorScale = 8;
        block[0] = static_cast<int16_t>(2 * block[0]);
        fProducts.multiplyScaled16s(kDVDequant[mode][kDVQuantRow[classNumber][qno]].data(), block,
                                    kCoefficients, kFactorScale);
        return;
    }
    constexpr int32_t kLumaBlocks = 4, kWeightScale = 5;
    const auto dc = static_cast<int16_t>(4 * block[0]);
    const DVFactors& weights = kDV100Weights[(fFormat.isProgressive ? 2 : 0) + (index < kLumaBlocks ? 0 : 1)];
    fProducts.multiplySteps(weights.data(), block, kCoefficients,
                            {kDV100Steps[qno] << classNumber, kWeightScale});
    block[0] = dc;
}

void DVDecodeState::Transform(int32_t macroblock) {
    for (int32_t i = 0; i < Blocks(); ++i) Dequantise(Block(macroblock, i), i, Parameters(macroblock, i));
    if (fHasLinesInTurns[macroblock] && fSize != DVSize::Full) {
        constexpr int32_t kPairs[][2] = {{0, 2}, {1, 3}, {4, 5}, {6, 7}};
        for (const auto& [first, second] : kPairs)
            JoinHalvedFields(Block(macroblock, first), Block(macroblock, second));
        return;
    }
    for (int32_t i = 0; i < Blocks(); ++i) {
        int16_t* const block = Block(macroblock, i);
        if (fSize != DVSize::Full)
            ReduceBlockDV(fTransforms, block, fSize);
        else if (!fFormat.IsHD() && (Parameters(macroblock, i) & kModeBit) != 0)
            fTransforms.inverse248(block, block);
        else
            fTransforms.inverse8x8(block, block);
    }
}

/// Blocks of the lines of one field each to half the size: the upper four lines of both, then the lower four.
void DVDecodeState::JoinHalvedFields(int16_t* first, int16_t* second) const {
    fTransforms.inverse8x8(first, first);
    fTransforms.inverse8x8(second, second);
    int16_t joined[kCoefficients / 2];
    for (int32_t i = 0; i < kCoefficients / 2; ++i) {
        const int32_t sum = first[2 * i] + first[2 * i + 1] + second[2 * i] + second[2 * i + 1];
        joined[i] = static_cast<int16_t>((sum + 2) >> 2);
    }
    std::copy_n(joined, kCoefficients / 4, first);
    std::copy_n(joined + kCoefficients / 4, kCoefficients / 4, second);
}

} // namespace PK
