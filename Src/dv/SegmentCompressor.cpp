#include "dv/SegmentCompressor.h"

#include "primitives/BlockTransforms.h"
#include "primitives/Coefficients.h"
#include "primitives/Dispatch.h"

#include <algorithm>
#include <cmath>

namespace PK {
namespace {

constexpr int32_t kBlocks = 6;     // of a macroblock
constexpr int32_t kLumaBlocks = 4; // of them
constexpr int32_t kScale16 = 16;   // of the weights that are 16-bit fractions
constexpr int16_t kLeastDC = -256, kGreatestDC = 255;

constexpr float PowerOfTwo(int32_t exponent) {
    float power = 1;
    for (; exponent > 0; --exponent) power *= 2;
    for (; exponent < 0; ++exponent) power /= 2;
    return power;
}

/// 1 / step of each row of kDVRowShifts, for coefficients of so many fractional bits.
template <int32_t kBits>
constexpr auto kRowFactors = [] {
    std::array<std::array<float, kCoefficients>, kDVQuantRows> factors{};
    for (int32_t row = 0; row < kDVQuantRows; ++row)
        for (int32_t place = 0; place < kCoefficients; ++place)
            factors[row][place] = PowerOfTwo(-kDVRowShifts[row][AreaOf(place)] - kBits);
    return factors;
}();
constexpr int32_t kBestBits = kBestDVPolicy.coefficientBits;

const DVBlockFactors& FactorsOfRow(int32_t row, int32_t coefficientBits) {
    const auto& rows = coefficientBits == 0 ? kRowFactors<0> : kRowFactors<kBestBits>;
    return *reinterpret_cast<const DVBlockFactors*>(rows[static_cast<size_t>(row)].data());
}

/// The forward weights, by mode, for the best policy.
constexpr auto kFineWeights = [] {
    std::array<std::array<float, kCoefficients>, kDVModes> weights{};
    for (int32_t mode = 0; mode < kDVModes; ++mode)
        for (int32_t place = 0; place < kCoefficients; ++place)
            weights[mode][place] = static_cast<float>(WeightProduct(mode, place) / 2) *
                                   PowerOfTwo(kBestBits - kBestDVPolicy.sampleBits);
    return weights;
}();

/// The steps of one quantiser for all blocks, from the coarsest. At the coarse end, class 3 has steps that no other class
/// has, and then small levels are left out.
struct Step {
    uint8_t qno, classNumber;
    float least;
};
constexpr Step kSteps[] = {{0, 3, 6}, {0, 3, 4},  {0, 3, 3},  {0, 3, 2},  {0, 3, 1},
                           {2, 3, 1}, {0, 2, 1},  {2, 2, 1},  {4, 2, 1},  {6, 2, 1},
                           {8, 2, 1}, {10, 2, 1}, {12, 2, 1}, {14, 2, 1}, {15, 2, 1}};

} // namespace

SegmentCompressor::SegmentCompressor(const DVPolicy& policy, bool haveDummies)
    : SegmentCompressor(policy, kBlocks, 0) {
    if (!haveDummies) return;
    for (int32_t i = 0; i < kMacroblocksOfSegment; ++i)
        for (const int32_t place : {1, 3}) {
            DVBlock& block = fBlocks[kBlocks * i + place];
            block.isDummy = true;
            block.dc = kLeastDC;
        }
}

SegmentCompressor::SegmentCompressor(const DVPolicy& policy, int32_t blocksOfMacroblock, int32_t firstStep)
    : fPolicy(policy), fTransforms(Best<BlockTransformKernels>()),
      fCoefficientKernels(Best<CoefficientKernels>()), fKernels(Best<DVBlockKernels>()),
      fBlocksOfMacroblock(blocksOfMacroblock), fLastStep(firstStep), fWriter(blocksOfMacroblock) {
    for (int32_t i = 0; i < DVSegmentWriter::kMostBlocks; ++i) fBlocks[i] = {fMemory[i], 0, 0, 0, false};
}

void SegmentCompressor::TakeInOrder(DVBlock& block, const int16_t* values) {
    const DVScan& scan = kScan[block.mode];
    for (int32_t i = 0; i < kCoefficients; ++i) block.coefficients[i] = values[scan[i]];
    block.coefficients[0] = 0;
}

int16_t SegmentCompressor::DCOf(int16_t transformed) const {
    const int32_t bits = fPolicy.sampleBits + 2;
    const int32_t dc = (transformed + (1 << (bits - 1))) >> bits;
    return static_cast<int16_t>(std::clamp<int32_t>(dc, kLeastDC, kGreatestDC));
}

void SegmentCompressor::Weigh(int32_t mode, int16_t* values) const {
    if (fPolicy.coefficientBits != 0) {
        const auto& weights = kFineWeights[static_cast<size_t>(mode)];
        fKernels.scale(*reinterpret_cast<const DVBlockFactors*>(weights.data()), 0.5f, values);
        return;
    }
    const DVFactors& weights = kForwardWeights[static_cast<size_t>(mode)];
    fCoefficientKernels.multiplyScaled16s(weights.data(), values, kCoefficients, kScale16);
    if (mode == 0) return;
    constexpr int32_t kFieldDifference = 32;
    values[kFieldDifference] = static_cast<int16_t>(-values[kFieldDifference]);
}

bool SegmentCompressor::MayBeInFields(const int16_t* samples) const {
    if (fPolicy.mode == DVPolicy::Mode::MoreZeros) return true;
    const DVLineDifferences differences = fKernels.lineDifferences(samples);
    return 4 * differences.ofFrame > 3 * differences.ofField;
}

bool SegmentCompressor::IsBetterInFields(const int16_t* frame, const int16_t* fields) const {
    if (fPolicy.mode == DVPolicy::Mode::MoreZeros)
        return fCoefficientKernels.countZeros8x8(frame) < fCoefficientKernels.countZeros8x8(fields);
    const float unit = PowerOfTwo(-fPolicy.coefficientBits);
    return fKernels.sumOfLogarithms(fields, unit) < fKernels.sumOfLogarithms(frame, unit);
}

void SegmentCompressor::Transform(DVBlock& block) const {
    alignas(64) int16_t frame[kCoefficients], fields[kCoefficients];
    fTransforms.forward8x8(block.coefficients, frame);
    const int16_t dc = DCOf(frame[0]);
    Weigh(0, frame);
    block.dc = fPolicy.coefficientBits == 0 ? std::clamp(frame[0], kLeastDC, kGreatestDC) : dc;
    block.mode = 0;
    if (MayBeInFields(block.coefficients)) {
        fTransforms.forward248(block.coefficients, fields);
        Weigh(1, fields);
        block.mode = IsBetterInFields(frame, fields) ? 1 : 0;
    }
    TakeInOrder(block, block.mode == 1 ? fields : frame);
}

/// 12 more, a class more. Chroma begins one class higher, and its second block two.
void SegmentCompressor::ChooseClass(DVBlock& block, int32_t placeInMacroblock) const {
    if (fPolicy.classes != DVPolicy::Class::ByMagnitude) return;
    const auto greatest = static_cast<int32_t>(fKernels.greatest(block.coefficients));
    constexpr int32_t kMagnitudes = 12, kHighest = 3;
    const int32_t first = std::max(0, placeInMacroblock - kLumaBlocks + 1);
    block.classNumber = static_cast<uint8_t>(std::min(greatest / kMagnitudes + first, kHighest));
}

SegmentCompressor::Quantiser SegmentCompressor::QuantiserOf(const DVBlock& block, int32_t step,
                                                            bool isTooLarge) const {
    if (fPolicy.classes == DVPolicy::Class::ByMagnitude) {
        const auto qno = static_cast<uint8_t>(step);
        return {FactorsOfRow(kDVQuantRow[block.classNumber][qno], fPolicy.coefficientBits), 1, qno,
                block.classNumber};
    }
    const Step& of = kSteps[step];
    const uint8_t classNumber = isTooLarge ? kDVClasses - 1 : of.classNumber;
    return {FactorsOfRow(kDVQuantRow[classNumber][of.qno], fPolicy.coefficientBits), of.least, of.qno,
            classNumber};
}

int32_t SegmentCompressor::FinestStep() const {
    if (fPolicy.classes == DVPolicy::Class::ByMagnitude) return kDVQuantisers - 1;
    return static_cast<int32_t>(std::size(kSteps)) - 1;
}

void SegmentCompressor::Quantise(const DVBlock& block, int32_t step, QuantisedBlock& quantised) const {
    for (bool isTooLarge = false;; isTooLarge = true) {
        const Quantiser quantiser = QuantiserOf(block, step, isTooLarge);
        fKernels.quantise(block.coefficients, {quantiser.factors, fRoundUp, quantiser.least},
                          quantised.levels);
        quantised.qno = quantiser.qno;
        quantised.classNumber = quantiser.classNumber;
        if (!quantised.levels.areTooLarge || isTooLarge) return;
    }
}

int32_t SegmentCompressor::BitsOfMacroblock(int32_t macroblock, int32_t step) {
    int32_t& known = fBits[macroblock][step];
    if (known == kUnknown) {
        known = 0;
        for (const QuantisedBlock& block : QuantisedAt(macroblock, step))
            known += block.levels.areTooLarge ? kBudget : BitsOfBlock(block.levels);
    }
    return known;
}

std::span<const SegmentCompressor::QuantisedBlock> SegmentCompressor::QuantisedAt(int32_t macroblock,
                                                                                  int32_t step) {
    QuantisedMacroblock& kept = fQuantised[macroblock][step % kKeptSteps];
    const auto count = static_cast<size_t>(fBlocksOfMacroblock);
    if (kept.step != step) {
        kept.step = step;
        for (size_t i = 0; i < count; ++i) {
            const DVBlock& block = fBlocks[static_cast<size_t>(macroblock) * count + i];
            if (!block.isDummy) Quantise(block, step, kept.blocks[i]);
        }
    }
    return {kept.blocks, count};
}

bool SegmentCompressor::Fits(int32_t step) {
    int32_t bits = 0;
    for (int32_t i = 0; i < kMacroblocksOfSegment && bits <= kBudget; ++i) bits += BitsOfMacroblock(i, step);
    return bits <= kBudget;
}

/// From the step of the segment before. The coarsest is taken without a test.
int32_t SegmentCompressor::FinestThatFits() {
    int32_t step = fLastStep;
    if (Fits(step)) {
        while (step < FinestStep() && Fits(step + 1)) ++step;
    } else {
        do --step;
        while (step > 0 && !Fits(step));
    }
    return std::max(step, 0);
}

/// Goes on by a step with those macroblocks that together make the most of the room that is left, as long as there are
/// such.
void SegmentCompressor::RefineMacroblocks(int32_t (&steps)[kMacroblocksOfSegment]) {
    for (;;) {
        int32_t room = kBudget, more[kMacroblocksOfSegment], candidates = 0;
        for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) {
            const int32_t bits = BitsOfMacroblock(i, steps[i]);
            room -= bits;
            if (steps[i] == FinestStep()) continue;
            more[i] = BitsOfMacroblock(i, steps[i] + 1) - bits;
            candidates |= 1 << i;
        }
        int32_t best = 0, mostTaken = INT32_MIN;
        for (int32_t set = 1; set < 1 << kMacroblocksOfSegment; ++set) {
            if ((set & ~candidates) != 0) continue;
            int32_t taken = 0;
            for (int32_t i = 0; i < kMacroblocksOfSegment; ++i)
                if ((set >> i & 1) != 0) taken += more[i];
            if (taken > room || taken < mostTaken) continue;
            best = set;
            mostTaken = taken;
        }
        if (best == 0) return;
        for (int32_t i = 0; i < kMacroblocksOfSegment; ++i) steps[i] += best >> i & 1;
    }
}

void SegmentCompressor::QuantiseAndWrite(float roundUp, uint8_t* segment) {
    fRoundUp = roundUp;
    for (auto& bits : fBits) std::fill(std::begin(bits), std::end(bits), kUnknown);
    for (auto& macroblock : fQuantised)
        for (QuantisedMacroblock& kept : macroblock) kept.step = kUnknown;
    fLastStep = FinestThatFits();
    int32_t steps[kMacroblocksOfSegment];
    std::fill(std::begin(steps), std::end(steps), fLastStep);
    if (fPolicy.quantiser == DVPolicy::Quantiser::OfMacroblock) RefineMacroblocks(steps);
    for (int32_t macroblock = 0, place = 0; macroblock < kMacroblocksOfSegment; ++macroblock) {
        const auto quantised = QuantisedAt(macroblock, steps[macroblock]);
        constexpr int32_t kQNO = 3; // behind the ID
        segment[kDIFBlockBytes * macroblock + kQNO] = quantised[0].qno;
        for (const QuantisedBlock& of : quantised) {
            DVBlock& block = fBlocks[place];
            block.classNumber = of.classNumber;
            fWriter.SetBlock(place++, block, of.levels);
        }
    }
    fWriter.Pack(segment);
}

void SegmentCompressor::Compress(uint8_t* segment) {
    int32_t place = 0;
    for (DVBlock& block : Blocks()) {
        const int32_t inMacroblock = place++ % fBlocksOfMacroblock;
        if (block.isDummy) continue;
        Transform(block);
        ChooseClass(block, inMacroblock);
    }
    QuantiseAndWrite(fPolicy.roundUp, segment);
}

} // namespace PK
