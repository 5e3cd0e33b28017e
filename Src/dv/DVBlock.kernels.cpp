// The bodies for the coefficients of DV.

#include "dv/DVBlockKernels.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

constexpr int kBlock = 64;
inline I32 Magnitude(I32 x) {
    const I32 sign = ShiftRightSigned<31>(x);
    return (x ^ sign) - sign;
}

inline I32 Scaled(const int16_t* values, const float* factors, F32 roundUp) {
    const I32 x = LoadSignedWords(values), sign = ShiftRightSigned<31>(x);
    const I32 magnitude = Truncate(ToFloat((x ^ sign) - sign) * LoadFloats(factors) + roundUp);
    return (magnitude ^ sign) - sign;
}

void Scale(const DVBlockFactors& factors, float roundUp, int16_t* block) {
    const F32 add = Floats(roundUp);
    for (int i = 0; i < kBlock; i += 2 * kLanes)
        Store(block + i, PackSignedLanes(Scaled(block + i, factors + i, add),
                                         Scaled(block + i + kLanes, factors + i + kLanes, add)));
}

inline uint32_t SumOfLanes(I32 sum) {
    uint32_t lanes[kLanes], total = 0;
    Store(lanes, sum);
    for (int i = 0; i < kLanes; ++i) total += lanes[i];
    return total;
}

DVLineDifferences LineDifferences(const int16_t* samples) {
    constexpr int kLine = 8, kSixLines = 6 * kLine;
    I32 ofFrame = Ints(0), ofField = Ints(0);
    for (int i = 0; i < kSixLines; i += kLanes) {
        const I32 line = LoadSignedWords(samples + i);
        ofFrame = ofFrame + Magnitude(LoadSignedWords(samples + i + kLine) - line);
        ofField = ofField + Magnitude(LoadSignedWords(samples + i + 2 * kLine) - line);
    }
    return {SumOfLanes(ofFrame), SumOfLanes(ofField)};
}

uint32_t Greatest(const int16_t* block) {
    I32 greatest = Ints(0);
    for (int i = 0; i < kBlock; i += kLanes) greatest = Max(greatest, Magnitude(LoadSignedWords(block + i)));
    uint32_t lanes[kLanes], most = 0;
    Store(lanes, greatest);
    for (int i = 0; i < kLanes; ++i) most = lanes[i] > most ? lanes[i] : most;
    return most;
}

/// The bits of a float are its logarithm, linear between powers of two.
uint32_t SumOfLogarithms(const int16_t* block, float factor) {
    const F32 one = Floats(1), by = Floats(factor);
    I32 sum = Ints(0);
    for (int i = 0; i < kBlock; i += kLanes) {
        const F32 x = ToFloat(Magnitude(LoadSignedWords(block + i))) * by + one;
        sum = sum + ShiftRight<8>(Bits(x) - Bits(one));
    }
    return SumOfLanes(sum);
}

struct Quantiser {
    F32 roundUp, least;
    I32 greatest;

    I32 Levels(const int16_t* coefficients, const float* factors) {
        const F32 exact = ToFloat(Magnitude(LoadSignedWords(coefficients))) * LoadFloats(factors) + roundUp;
        const I32 levels = Truncate(exact) & NotGreater(least, exact);
        greatest = Max(greatest, levels);
        return levels;
    }
};

void Quantise(const int16_t* coefficients, const DVQuantisation& quantisation, DVLevels& levels) {
    Quantiser quantiser = {Floats(quantisation.roundUp), Floats(quantisation.least), Ints(0)};
    const float* factors = quantisation.factors;
    constexpr int kBytes = 4 * kLanes;
    uint64_t nonZero = 0;
    for (int i = 0; i < kBlock; i += kBytes) {
        I32 part[4];
        for (int k = 0; k < 4; ++k)
            part[k] = quantiser.Levels(coefficients + i + kLanes * k, factors + i + kLanes * k);
        const I32 bytes = PackLanes(part[0], part[1], part[2], part[3]);
        Store(levels.level + i, bytes);
        nonZero |= NonZeroBytes(bytes) << i;
    }
    levels.nonZero = nonZero;
    levels.areTooLarge = AnyNegative(Ints(255) - quantiser.greatest);
}

constexpr DVBlockKernels kKernels = {LineDifferences, Greatest, Scale, SumOfLogarithms, Quantise};

} // namespace
} // namespace PK_TARGET

template <>
const DVBlockKernels& DVBlockKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
