#include "dv/DVSegment.h"

#include "dv/ReduceBlock.h"
#include "primitives/FirstUse.h"

#include <algorithm>

namespace PK {
namespace {

using Factors = std::array<float, kCoefficients>;

/// The steps of DV25 and DV50 by mode and row, without the fractional bits.
constexpr auto kInverseSteps = [] {
    std::array<std::array<Factors, kDVQuantRows>, kDVModes> steps{};
    for (int32_t mode = 0; mode < kDVModes; ++mode)
        for (int32_t row = 0; row < kDVQuantRows; ++row)
            for (int32_t i = 1; i < kCoefficients; ++i)
                steps[mode][row][i] = static_cast<float>(kDVDequant[mode][row][i]) / kDVDequantUnit;
    return steps;
}();

/// What the step of DV100 is multiplied by.
constexpr auto kInverseWeights = [] {
    std::array<Factors, std::size(kDV100Weights)> weights{};
    for (size_t table = 0; table < std::size(kDV100Weights); ++table)
        for (int32_t i = 1; i < kCoefficients; ++i)
            weights[table][i] = static_cast<float>(kDV100Weights[table][i]) / kDV100WeightUnit;
    return weights;
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

/// What levels are multiplied by to be coefficients of the orthonormal transform.
DVSteps DVDecodeState::Steps(int32_t macroblock, int32_t block) const {
    const uint32_t parameters = Parameters(macroblock, block);
    const uint32_t mode = parameters >> 6 & 1, classNumber = parameters >> 4 & 3, qno = parameters >> 16;
    if (!fFormat.IsHD()) return {kInverseSteps[mode][kDVQuantRow[classNumber][qno]].data(), 1};
    constexpr int32_t kLumaBlocks = 4;
    const auto& weights = kInverseWeights[(fFormat.isProgressive ? 2 : 0) + (block < kLumaBlocks ? 0 : 1)];
    return {weights.data(), static_cast<float>(kDV100Steps[qno] << classNumber)};
}

DVTransformKernels::Transform DVDecodeState::TransformOf(bool is248) const {
    if (fSize == DVSize::Full) return is248 ? fTransforms.inverse248 : fTransforms.inverse88;
    return ReduceBlockDV(fTransforms, fSize, is248);
}

void DVDecodeState::Transform(int32_t macroblock) {
    if (fHasLinesInTurns[macroblock] && fSize != DVSize::Full) return JoinHalvedFields(macroblock);
    for (int32_t i = 0; i < Blocks(); ++i) {
        int16_t* const block = Block(macroblock, i);
        const bool is248 = !fFormat.IsHD() && (Parameters(macroblock, i) & kModeBit) != 0;
        TransformOf(is248)(block, Steps(macroblock, i), block);
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
