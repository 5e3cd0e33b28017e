// One run of a repeated pixel.

#include "primitives/FillPixels.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

constexpr size_t kVector = 4 * kLanes;
static_assert(sizeof(FillPattern::bytes) >= FillPattern::kPeriod + kVector);

inline I32 LoadPhase(const FillPattern& pattern, size_t at) {
    return LoadInts(pattern.bytes + at % FillPattern::kPeriod);
}

/// The first and the last vector lie anywhere and overlap the aligned ones between them.
void FillRun(uint8_t* destination, size_t bytes, const FillPattern& pattern) {
    if (bytes < kVector) {
        std::memcpy(destination, pattern.bytes, bytes);
        return;
    }
    Store(destination, LoadPhase(pattern, 0));
    size_t at = kVector - (reinterpret_cast<uintptr_t>(destination) & (kVector - 1));
    const I32 pixels = LoadPhase(pattern, at);
    for (; at + 4 * kVector <= bytes; at += 4 * kVector) {
        Store(destination + at, pixels);
        Store(destination + at + kVector, pixels);
        Store(destination + at + 2 * kVector, pixels);
        Store(destination + at + 3 * kVector, pixels);
    }
    for (; at + kVector <= bytes; at += kVector) Store(destination + at, pixels);
    Store(destination + bytes - kVector, LoadPhase(pattern, bytes - kVector));
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::FillKernels& PK::FillKernels::For<PK::Target::PK_TARGET>() {
    static constexpr FillKernels kernels = {PK_TARGET::FillRun};
    return kernels;
}
