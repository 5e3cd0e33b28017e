#include "dv/DV100SegmentCompressor.h"

#include "primitives/BlockTransforms.h"

namespace PK {
namespace {

constexpr int32_t kBlocks = 8;     // of a macroblock
constexpr int32_t kLumaBlocks = 4; // of them
constexpr int32_t kRows = std::size(kDV100QNO);
constexpr int32_t kFirstRow = 6; // where the search begins in the first segment
constexpr float kNearest = 0.5f;

using FactorsOfBlock = std::array<float, kCoefficients>;

/// What coefficients are multiplied by in the place of division by the tables: 32 over an entry.
template <int32_t kBits>
constexpr auto kWeights = [] {
    std::array<FactorsOfBlock, std::size(kDV100Weights)> weights{};
    for (size_t table = 0; table < weights.size(); ++table)
        for (int32_t place = 0; place < kCoefficients; ++place)
            weights[table][place] = static_cast<float>(32.0 * (1 << kBits) / kDV100Weights[table][place]);
    return weights;
}();

/// And in the place of division by the steps.
template <int32_t kBits>
constexpr auto kStepFactors = [] {
    std::array<FactorsOfBlock, kRows> factors{};
    for (int32_t row = 0; row < kRows; ++row)
        factors[row].fill(static_cast<float>(1.0 / (1 << kBits) / kDV100QNO[row].step));
    return factors;
}();

constexpr int32_t kBestBits = kBestDVPolicy.coefficientBits;

const DVBlockFactors& AsFactors(const FactorsOfBlock& factors) {
    return *reinterpret_cast<const DVBlockFactors*>(factors.data());
}

} // namespace

DV100SegmentCompressor::DV100SegmentCompressor(const DVPolicy& policy, bool is720p)
    : SegmentCompressor(policy, kBlocks, kRows - 1 - kFirstRow), fIs720p(is720p) {}

SegmentCompressor::Quantiser DV100SegmentCompressor::QuantiserOf(const DVBlock&, int32_t step, bool) const {
    const int32_t row = kRows - 1 - step;
    const auto& factors = fPolicy.coefficientBits == 0 ? kStepFactors<0> : kStepFactors<kBestBits>;
    return {AsFactors(factors[static_cast<size_t>(row)]), 1, kDV100QNO[row].qno, kDV100QNO[row].classNumber};
}

int32_t DV100SegmentCompressor::FinestStep() const {
    return kRows - 1;
}

void DV100SegmentCompressor::Compress(uint8_t* segment) {
    const bool isWhole = fPolicy.coefficientBits == 0;
    const auto& weights = isWhole ? kWeights<0> : kWeights<kBestBits - kBestDVPolicy.sampleBits>;
    const float roundUp = isWhole ? fPolicy.roundUpHD : kNearest;
    int32_t place = 0;
    for (DVBlock& block : Blocks()) {
        const int32_t inMacroblock = place % kBlocks;
        const size_t table = (fIs720p ? 2 : 0) + (inMacroblock < kLumaBlocks ? 0 : 1);
        alignas(64) int16_t values[kCoefficients];
        fTransforms.forward8x8(block.coefficients, values);
        block.dc = DCOf(values[0]);
        fKernels.scale(AsFactors(weights[table]), roundUp, values);
        block.mode = 0; // which orders the coefficients
        TakeInOrder(block, values);
        // The bit tells frames from fields in the first block alone; elsewhere it is set.
        block.mode = inMacroblock != 0 || fAreOfFields[place / kBlocks] ? 1 : 0;
        ++place;
    }
    QuantiseAndWrite(fPolicy.roundUpHD, segment);
}

} // namespace PK
