#include "dv/DVSegment.h"

#include "dv/ReduceBlock.h"
#include "primitives/FirstUse.h"

#include <algorithm>

namespace PK {
namespace {

/// Integers in parts of a unit, but for that of DC.
constexpr DVFactorTable FactorTable(const DVFactors& factors, float unit) {
    constexpr int32_t kSide = 8;
    DVFactorTable table{};
    for (int32_t i = 1; i < kCoefficients; ++i) {
        const int32_t column = i % kSide;
        const float factor = static_cast<float>(factors[i]) / unit;
        table.raster[i] = factor;
        table.parted[i - column + column / 2 + (column % 2) * kSide / 2] = factor;
    }
    return table;
}

/// The steps of DV25 and DV50 by mode and row.
constexpr auto kInverseSteps = [] {
    std::array<std::array<DVFactorTable, kDVQuantRows>, kDVModes> tables{};
    for (int32_t mode = 0; mode < kDVModes; ++mode)
        for (int32_t row = 0; row < kDVQuantRows; ++row)
            tables[mode][row] = FactorTable(kDVDequant[mode][row], kDVDequantUnit);
    return tables;
}();

/// What the step of DV100 is multiplied by.
constexpr auto kInverseWeights = [] {
    std::array<DVFactorTable, std::size(kDV100Weights)> tables{};
    for (size_t i = 0; i < tables.size(); ++i) tables[i] = FactorTable(kDV100Weights[i], kDV100WeightUnit);
    return tables;
}();

} // namespace

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
    constexpr uint8_t kPlaces[] = {4, 18, 32, 46, 60, 70}, kSign = 0x80;
    for (int32_t i = 0; i < kMacroblocksOfSegment; ++i, segment += kDIFBlockBytes)
        for (int32_t j = 0; j < Blocks(); ++j)
            Block(i, j)[0] = static_cast<int16_t>((segment[kPlaces[j]] ^ kSign) - kSign);
}

void DVDecodeState::Parse(const uint8_t* segment) {
    std::fill_n(fCoefficients, kMacroblocksOfSegment * Blocks() * kCoefficients, int16_t{0});
    const DVParseDepth depth = DepthOfReduction(fSize);
    if (fFormat.IsHD())
        HuffmanDecodeSegmentDV100(segment, kScan[0], &fTable, fCoefficients, fParameters, depth);
    else
        HuffmanDecodeSegmentDV(segment, kScan, &fTable, fCoefficients, fParameters, depth);
}

/// What levels are multiplied by to be coefficients of the orthonormal transform.
DVSteps DVDecodeState::Steps(int32_t macroblock, int32_t block) const {
    const uint32_t parameters = Parameters(macroblock, block);
    const uint32_t mode = parameters >> 6 & 1, classNumber = parameters >> 4 & 3, qno = parameters >> 16;
    if (!fFormat.IsHD()) return {&kInverseSteps[mode][kDVQuantRow[classNumber][qno]], 1};
    constexpr int32_t kLumaBlocks = 4;
    const auto& weights = kInverseWeights[(fFormat.isProgressive ? 2 : 0) + (block < kLumaBlocks ? 0 : 1)];
    constexpr float kHalvesGoUp =
        1 / (2 * kDV100WeightUnit); // and nothing else does: products are in these units
    return {&weights, static_cast<float>(kDV100Steps[qno] << classNumber), kHalvesGoUp};
}

bool DVDecodeState::Is248(int32_t macroblock, int32_t block) const {
    return !fFormat.IsHD() && (Parameters(macroblock, block) & kModeBit) != 0;
}

/// Blocks of one mode.
void DVDecodeState::TransformFour(int32_t macroblock, int32_t firstBlock) {
    DVSteps steps[kDVBlocksAtOnce];
    for (int32_t i = 0; i < kDVBlocksAtOnce; ++i) steps[i] = Steps(macroblock, firstBlock + i);
    int16_t* const blocks = Block(macroblock, firstBlock);
    const bool is248 = Is248(macroblock, firstBlock);
    (is248 ? fFourTransforms.inverse248 : fFourTransforms.inverse88)(blocks, steps, blocks);
}

DVTransformKernels::Transform DVDecodeState::TransformOf(bool is248) const {
    if (fSize == DVSize::Full) return is248 ? fTransforms.inverse248 : fTransforms.inverse88;
    return ReduceBlockDV(fTransforms, fSize, is248);
}

void DVDecodeState::Transform(int32_t macroblock) {
    if (fHasLinesInTurns[macroblock] && fSize != DVSize::Full) return JoinHalvedFields(macroblock);
    for (int32_t i = 0; i < Blocks();) {
        const auto isAsFirst = [&](int32_t other) {
            return Is248(macroblock, i + other) == Is248(macroblock, i);
        };
        if (fSize == DVSize::Full && i + kDVBlocksAtOnce <= Blocks() && isAsFirst(1) && isAsFirst(2) &&
            isAsFirst(3)) {
            TransformFour(macroblock, i);
            i += kDVBlocksAtOnce;
            continue;
        }
        int16_t* const block = Block(macroblock, i);
        TransformOf(Is248(macroblock, i))(block, Steps(macroblock, i), block);
        ++i;
    }
}

/// Blocks of the lines of one field each to half the size: in the first the upper four lines of both, in the second the
/// lower four.
void DVDecodeState::JoinHalvedFields(int32_t macroblock) {
    constexpr int32_t kPairs[][2] = {{0, 2}, {1, 3}, {4, 5}, {6, 7}};
    for (const auto& [upper, lower] : kPairs) {
        int16_t* const first = Block(macroblock, upper);
        int16_t* const second = Block(macroblock, lower);
        fTransforms.inverse88(first, Steps(macroblock, upper), first);
        fTransforms.inverse88(second, Steps(macroblock, lower), second);
        int16_t joined[kCoefficients / 2];
        for (int32_t i = 0; i < kCoefficients / 2; ++i) {
            const int32_t sum = first[2 * i] + first[2 * i + 1] + second[2 * i] + second[2 * i + 1];
            joined[i] = static_cast<int16_t>((sum + 2) >> 2);
        }
        std::copy_n(joined, kCoefficients / 4, first);
        std::copy_n(joined + kCoefficients / 4, kCoefficients / 4, second);
    }
}

} // namespace PK
