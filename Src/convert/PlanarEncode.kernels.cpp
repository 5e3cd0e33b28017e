// Four-byte pixels to planes of bytes.

#include "convert/PlanarKernels.h"
#include "convert/RGBStages.h"

namespace PK::PK_TARGET {
namespace {

/// Carries the chroma of a group's last pixel, and the place of the sums, to the next group.
template <class Stage>
struct Encode : Groups<4 * kLanes, Each<1>, Each<4>> {
    static_assert(Encode::kElements <= PlanarEncodeKernels::kGroup);

    Encode(I32 before, uint8_t* sums) : fBefore(before), fSums(sums) {}

    void StoreSums(YUVPixels first, YUVPixels second) {
        I32 even, odd;
        SeparateLanes(first.chroma, second.chroma, even, odd);
        Store(fSums, ShiftInLane(fBefore, odd) + even + even + odd);
        fBefore = odd;
        fSums += sizeof(I32);
    }

    void Group(const uint8_t* source, uint8_t* luma) {
        YUVPixels pixels[4];
        Stage::Load(source, pixels[0], pixels[1]);
        Stage::Load(source + 8 * kLanes, pixels[2], pixels[3]);
        Store(luma, PackLanes(pixels[0].luma, pixels[1].luma, pixels[2].luma, pixels[3].luma));
        StoreSums(pixels[0], pixels[1]);
        StoreSums(pixels[2], pixels[3]);
    }

    I32 fBefore; // in the last lane
    uint8_t* fSums;
};

template <class Stage>
void PlanesFromRow(const void* pixels, void* luma, void* sums, int32_t width) {
    if (width <= 0) return;
    const I32 before = OnePixel<Stage>(static_cast<const uint8_t*>(pixels)).chroma;
    RunRow(Encode<Stage>(before, static_cast<uint8_t*>(sums)), width, luma, pixels);
}

/// The byte of a half.
template <int kBit>
struct ChromaOfSums : Groups<4 * kLanes, Each<1>, Each<4>, Each<4>> {
    static I32 Chroma(const uint8_t* first, const uint8_t* second) {
        return ShiftRight<kBit + 3>(LoadInts(first) + LoadInts(second)) & Ints(0xff);
    }

    static void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) {
        constexpr int32_t kStep = sizeof(I32);
        Store(destination, PackLanes(Chroma(first, second), Chroma(first + kStep, second + kStep),
                                     Chroma(first + 2 * kStep, second + 2 * kStep),
                                     Chroma(first + 3 * kStep, second + 3 * kStep)));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::PlanarEncodeKernels& PK::PlanarEncodeKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr PlanarEncodeKernels kernels = {
        .fromVUYP = PlanesFromRow<PackedVUYA>,
        .fromBGRX601 = PlanesFromRow<OpaqueRGB<kRGB8ToYUV601>>,
        .fromBGRX709 = PlanesFromRow<OpaqueRGB<kRGB8ToYUV709>>,
        .fromBGRA601 = PlanesFromRow<StraightRGB<kRGB8ToYUV601>>,
        .fromBGRA709 = PlanesFromRow<StraightRGB<kRGB8ToYUV709>>,
        .u = TwoRows<ChromaOfSums<0>>,
        .v = TwoRows<ChromaOfSums<16>>,
    };
    return kernels;
}
