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

/// A block has no use for sixteen lanes: those bodies are the ones of eight.
template <int kVectorLanes>
const DVTransformKernels& Bodies() {
    if constexpr (kVectorLanes > kSide) {
        return DVTransformKernels::For<Target::avx2>();
    } else {
        static constexpr DVTransformKernels kernels = {Inverse<InverseEight>, Inverse<InverseFields>, Half};
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
