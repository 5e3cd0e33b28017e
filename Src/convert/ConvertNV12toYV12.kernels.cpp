// Rows of a surface of interleaved chroma. Bytes change their place, none is computed with.

#include "convert/ConvertNV12toYV12Kernels.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kLine = 64; // bytes that memory gives at once
constexpr int32_t kVector = sizeof(I32);
// Bytes: lines are fetched so early before they are stored to, which saves a twentieth of the time.
constexpr int32_t kAhead = 1024;

inline int32_t Lesser(int32_t a, int32_t b) {
    return a < b ? a : b;
}

void CopySurfaceRow(const void* sourceRow, void* destinationRow, int32_t width) {
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    const auto beforeLine = static_cast<int32_t>(-reinterpret_cast<uintptr_t>(source) & (kLine - 1));
    const int32_t head = Lesser(beforeLine, width);
    if (head > 0) std::memcpy(destination, source, static_cast<size_t>(head));
    int32_t at = head;
    for (; width - at >= kLine; at += kLine) {
        I32 line[kLine / kVector];
        for (int i = 0; i < kLine / kVector; ++i) line[i] = LoadStreamed(source + at + i * kVector);
        __builtin_prefetch(destination + at + kAhead);
        for (int i = 0; i < kLine / kVector; ++i) Store(destination + at + i * kVector, line[i]);
    }
    if (at < width) std::memcpy(destination + at, source + at, static_cast<size_t>(width - at));
}

inline void PartGroup(const uint8_t* source, uint8_t* first, uint8_t* second) {
    I32 even, odd;
    SeparateBytes(LoadInts(source), LoadInts(source + kVector), even, odd);
    Store(first, even);
    Store(second, odd);
}

/// What is left of a row goes through the same group on copies.
void PartPairsRow(const uint8_t* source, uint8_t* first, uint8_t* second, int32_t pairs) {
    int32_t at = 0;
    for (; pairs - at >= kVector; at += kVector) PartGroup(source + int64_t{2} * at, first + at, second + at);
    if (at >= pairs) return;
    const auto left = static_cast<size_t>(pairs - at);
    uint8_t group[2 * kVector] = {}, parted[2][kVector];
    std::memcpy(group, source + int64_t{2} * at, 2 * left);
    PartGroup(group, parted[0], parted[1]);
    std::memcpy(first + at, parted[0], left);
    std::memcpy(second + at, parted[1], left);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::NV12Kernels& PK::NV12Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr NV12Kernels kernels = {.copySurface = CopySurfaceRow, .partPairs = PartPairsRow};
    return kernels;
}
