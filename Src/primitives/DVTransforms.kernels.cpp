// From the levels of a block of DV to its samples.

#include "primitives/DVTransforms.h"
#include "primitives/lanes/BlockButterflies.h"

namespace PK {
namespace PK_TARGET {
namespace {

/// Levels as coefficients. What DC gives to every sample is added at the end.
struct Levels {
    Levels(const int16_t* levels, const DVSteps& by)
        : block(levels), factors(by.factors), step(Floats(by.step)),
          flat(Floats(0.5f * static_cast<float>(levels[0]))) {}

    F32 Load(int line, int column = 0) const {
        const int place = kSide * line + column;
        return ToFloat(
            Nearest(ToFloat(LoadSignedWords(block + place)) * (LoadFloats(factors + place) * step)));
    }
    F32 Finish(F32 samples) const { return samples + flat; }

    const int16_t* block;
    const float* factors;
    F32 step, flat;
};

template <class ColumnButterfly>
void Inverse(const int16_t* levels, const DVSteps& steps, int16_t* samples) {
    TransformBlock<ColumnButterfly, InverseEight>(Levels(levels, steps), samples);
}

void Half(const int16_t* levels, const DVSteps& steps, int16_t* samples) {
    ReduceBlock(Levels(levels, steps), samples);
}

template <bool kHasTwist>
void Quarter(const int16_t* levels, const DVSteps& steps, int16_t* samples) {
    constexpr float kSlope =
        0.11548494f; // the mean of cos(pi / 8) and cos(3 pi / 8), by 1/2, and 1 / sqrt(8) across
    constexpr float kTwist = 0.10669417f; // the square of that mean, by 1/4
    const auto product = [&](int32_t place) {
        return static_cast<float>(levels[place]) * (steps.factors[place] * steps.step);
    };
    float coefficients[kLanes];
    Store(coefficients, ToFloat(Nearest(PixelFloats(product(1), product(8), kHasTwist ? product(9) : 0, 0))));
    const float flat = 0.5f * static_cast<float>(levels[0]);
    const float across = kSlope * coefficients[0], down = kSlope * coefficients[1],
                twist = kTwist * coefficients[2];
    const I32 four = Nearest(PixelFloats(flat + ((across + down) + twist), flat - ((across - down) + twist),
                                         flat + ((across - down) - twist), flat - ((across + down) - twist)));
    alignas(64) int16_t words[2 * kLanes];
    Store(words, PackSignedInBlocks(four, four));
    std::memcpy(samples, words, 4 * sizeof(int16_t));
}

/// A block has no use for sixteen lanes: those bodies are the ones of eight.
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

} // namespace
} // namespace PK_TARGET

template <>
const DVTransformKernels& DVTransformKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::Bodies<PK_TARGET::kLanes>();
}

} // namespace PK
