// From the levels of a block of DV to its samples.

#include "primitives/DVTransforms.h"
#include "primitives/lanes/BlockButterflies.h"

namespace PK {
namespace PK_TARGET {
namespace {

/// Levels as coefficients. What DC gives to every sample is added at the end.
struct Levels {
    Levels(const int16_t* levels, const DVSteps& by)
        : block(levels), factors(by.factors->raster), step(Floats(by.step)), bias(Floats(by.bias)),
          flat(Floats(0.5f * static_cast<float>(levels[0]))) {}

    F32 Load(int line, int column = 0) const {
        const int place = kSide * line + column;
        return ToFloat(
            Nearest(ToFloat(LoadSignedWords(block + place)) * (LoadFloats(factors + place) * step) + bias));
    }
    F32 Finish(F32 samples) const { return samples + flat; }

    const int16_t* block;
    const float* factors;
    F32 step, bias, flat;
};

template <class ColumnButterfly>
void Inverse(const int16_t* levels, const DVSteps& steps, int16_t* samples) {
    TransformBlock<ColumnButterfly, InverseEight>(Levels(levels, steps), samples);
}

/// The levels of a block for each block of lanes.
class LevelsOfLanes {
public:
    static constexpr int kBlocks = kLanes / 4;

    LevelsOfLanes(const int16_t* levels, const DVSteps* steps) : fLevels(levels) {
        fFactors = reinterpret_cast<const uint8_t*>(steps[0].factors->parted);
        float step[kBlocks], bias[kBlocks], flat[kBlocks];
        for (int i = 0; i < kBlocks; ++i) {
            step[i] = steps[i].step;
            bias[i] = steps[i].bias;
            flat[i] = 0.5f * static_cast<float>(levels[kLevels * i]);
            fToFactors[4 * i] = reinterpret_cast<const uint8_t*>(steps[i].factors->parted) - fFactors;
        }
        fStep = LoadOnePerBlock(step);
        fBias = LoadOnePerBlock(bias);
        fFlat = LoadOnePerBlock(flat);
    }

    void Load(int line, F32& even, F32& odd) const {
        const I32 words = Bits(LoadFloatBlocks(fLevels + kSide * line, kLevels * sizeof(int16_t)));
        even = Coefficients(ShiftRightSigned<16>(ShiftLeft<16>(words)), 2 * line);
        odd = Coefficients(ShiftRightSigned<16>(words), 2 * line + 1);
    }
    F32 Finish(F32 samples) const { return samples + fFlat; }

private:
    static constexpr int kLevels = kSide * kSide;

    F32 Coefficients(I32 levels, int halfLine) const {
        const F32 factors = LoadFloatBlocksAt(fFactors + 4 * halfLine * sizeof(float), fToFactors);
        return ToFloat(Nearest(ToFloat(levels) * (factors * fStep) + fBias));
    }

    const int16_t* fLevels;
    const uint8_t* fFactors;
    int64_t fToFactors[kLanes];
    F32 fStep, fBias, fFlat;
};

template <class ColumnButterfly>
void InverseBlocks(const int16_t* levels, const DVSteps (&steps)[kDVBlocksAtOnce], int16_t* samples) {
    constexpr int kLevels = kSide * kSide;
    if constexpr (LevelsOfLanes::kBlocks == kDVBlocksAtOnce) {
        TransformBlocksOfLanes<ColumnButterfly, InverseEight>(LevelsOfLanes(levels, steps), samples,
                                                              kLevels * sizeof(int16_t));
    } else {
        for (int i = 0; i < kDVBlocksAtOnce; ++i)
            Inverse<ColumnButterfly>(levels + kLevels * i, steps[i], samples + kLevels * i);
    }
}

[[maybe_unused]] void Half(const int16_t* levels, const DVSteps& steps, int16_t* samples) {
    ReduceBlock(Levels(levels, steps), samples);
}

/// The four samples of a quarter are the lanes of a pixel.
template <bool kHasTwist>
void Quarter(const int16_t* levels, const DVSteps& steps, int16_t* samples) {
    // The mean of cos(pi / 8) and cos(3 pi / 8), by 1/2, and 1 / sqrt(8) across; and the square of that mean, by 1/4.
    constexpr float kSlope = 0.11548494f, kTwist = 0.10669417f;
    const auto product = [&](int32_t place) {
        return static_cast<float>(levels[place]) * (steps.factors->raster[place] * steps.step) + steps.bias;
    };
    const float twist = kHasTwist ? product(9) : 0;
    const F32 coefficients = ToFloat(Nearest(PixelFloats(product(1), product(8), twist, 0)));
    const F32 across = ShufflePixel<0, 0, 0, 0>(coefficients) * PixelFloats(kSlope, -kSlope, kSlope, -kSlope);
    const F32 down = ShufflePixel<1, 1, 1, 1>(coefficients) * PixelFloats(kSlope, kSlope, -kSlope, -kSlope);
    const F32 both = ShufflePixel<2, 2, 2, 2>(coefficients) * PixelFloats(kTwist, -kTwist, -kTwist, kTwist);
    const I32 four = Nearest(Floats(0.5f * static_cast<float>(levels[0])) + ((across + down) + both));
    alignas(64) int16_t words[2 * kLanes];
    Store(words, PackSignedInBlocks(four, four));
    std::memcpy(samples, words, 4 * sizeof(int16_t));
}

/// One block has no use for sixteen lanes: those bodies are the ones of eight.
template <int kVectorLanes>
const DVTransformKernels& Bodies() {
    if constexpr (kVectorLanes > kSide) {
        return DVTransformKernels::For<Target::avx2>();
    } else {
        static constexpr DVTransformKernels kernels = {Inverse<InverseEight>, Inverse<InverseFields>, Half,
                                                       Quarter<true>, Quarter<false>};
        return kernels;
    }
}

constexpr DVFourBlocksKernels kFourBlocks = {InverseBlocks<InverseEight>, InverseBlocks<InverseFields>};

} // namespace
} // namespace PK_TARGET

template <>
const DVTransformKernels& DVTransformKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::Bodies<PK_TARGET::kLanes>();
}

template <>
const DVFourBlocksKernels& DVFourBlocksKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kFourBlocks;
}

} // namespace PK
