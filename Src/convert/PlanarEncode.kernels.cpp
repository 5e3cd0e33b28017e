// Four-byte VUYA pixels to planes of bytes.

#include "convert/DownsampleRow.h"
#include "convert/PlanarKernels.h"

namespace PK::PK_TARGET {
namespace {

struct LumaOfPixels : Groups<4 * kLanes, Each<1>, Each<4>> {
    static I32 Luma(const uint8_t* pixels) { return ShiftRight<16>(LoadInts(pixels)) & Ints(0xff); }

    static void Group(const uint8_t* source, uint8_t* destination) {
        constexpr int32_t kStep = 4 * kLanes;
        Store(destination, PackLanes(Luma(source), Luma(source + kStep), Luma(source + 2 * kStep),
                                     Luma(source + 3 * kStep)));
    }
};

/// U and V of kLanes pixels, each the sum of two rows.
inline I32 ChromaSum(const uint8_t* first, const uint8_t* second) {
    return PackedVUYA::Chroma(LoadInts(first)) + PackedVUYA::Chroma(LoadInts(second));
}

/// Carries the chroma of a group's last pixels to the next group.
struct ChromaOfRows : Groups<4 * kLanes, Each<2, 2>, Each<4>, Each<4>> {
    explicit ChromaOfRows(I32 before) : fBefore(before) {}

    I32 Pairs(const uint8_t* first, const uint8_t* second) {
        constexpr int32_t kStep = 4 * kLanes;
        I32 even, odd;
        SeparateLanes(ChromaSum(first, second), ChromaSum(first + kStep, second + kStep), even, odd);
        const I32 sum = ShiftInLane(fBefore, odd) + even + even + odd;
        fBefore = odd;
        return ShiftRight<3>(sum) & Ints(0x00ff00ff);
    }

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) {
        constexpr int32_t kHalf = 8 * kLanes;
        const I32 pairs = Pairs(first, second);
        Store(destination, PackHalves(pairs, Pairs(first + kHalf, second + kHalf)));
    }

    I32 fBefore; // in the last lane
};

void ChromaRow(const void* first, const void* second, void* destination, int32_t width) {
    if (width <= 0) return;
    uint32_t pixels[2];
    std::memcpy(&pixels[0], first, sizeof pixels[0]);
    std::memcpy(&pixels[1], second, sizeof pixels[1]);
    const auto chroma = [](uint32_t pixel) { return PackedVUYA::Chroma(Ints(static_cast<int32_t>(pixel))); };
    RunRow(ChromaOfRows(chroma(pixels[0]) + chroma(pixels[1])), width, destination, first, second);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::PlanarEncodeKernels& PK::PlanarEncodeKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr PlanarEncodeKernels kernels = {.luma = Row<LumaOfPixels>, .chroma = ChromaRow};
    return kernels;
}
