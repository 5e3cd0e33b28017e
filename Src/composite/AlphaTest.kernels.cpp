// Tells whether all pixels of a row are opaque, or all transparent.

#include "composite/BlackKernels.h"
#include "primitives/lanes/PixelLanes.h"

namespace PK::PK_TARGET {
namespace {

using enum AlphaPlace;

inline AlphaTest Told(I32 isOpaque, I32 isTransparent) {
    if (!AnyNegative(Not(isOpaque))) return AlphaTest::opaque;
    return AnyNegative(Not(isTransparent)) ? AlphaTest::mixed : AlphaTest::transparent;
}

/// The alphas of 8 bits that were seen, in their place.
template <AlphaPlace kAlpha>
struct CodeAlphas {
    static constexpr int32_t kPixelBytes = 4, kMask = kAlpha == last ? -0x1000000 : 0xff;
    I32 all = Ints(-1), any = Ints(0);

    void Take(const uint8_t* pixels) {
        all = all & LoadInts(pixels);
        any = any | LoadInts(pixels);
    }

    AlphaTest Told() const {
        const I32 mask = Ints(kMask);
        return PK_TARGET::Told(Equal(all & mask, mask), Equal(any & mask, Ints(0)));
    }
};

template <AlphaPlace kAlpha>
struct FloatAlphas {
    static constexpr int32_t kPixelBytes = 16;
    I32 isOpaque = Ints(-1), isTransparent = Ints(-1);

    void Take(const uint8_t* pixels) {
        const F32 alpha = Pixels32f<kAlpha>::Load(pixels).c3;
        isOpaque = isOpaque & IsNegligible(alpha - Floats(1));
        isTransparent = isTransparent & IsNegligible(alpha);
    }

    AlphaTest Told() const { return PK_TARGET::Told(isOpaque, isTransparent); }
};

/// What is left of a row is looked at as a group that its first pixel fills up.
template <class Alphas>
AlphaTest TestRow(const void* row, int32_t width) {
    constexpr int32_t kPixel = Alphas::kPixelBytes;
    const auto* pixels = static_cast<const uint8_t*>(row);
    Alphas alphas;
    if (width < 1) return AlphaTest::opaque;
    int32_t left = width;
    for (; left >= kLanes; left -= kLanes, pixels += kLanes * kPixel) alphas.Take(pixels);
    if (left > 0) {
        uint8_t group[kLanes * kPixel];
        for (int32_t i = 0; i < kLanes; ++i)
            std::memcpy(group + i * kPixel, i < left ? pixels + i * kPixel : row, kPixel);
        alphas.Take(group);
    }
    return alphas.Told();
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::AlphaTestKernels& PK::AlphaTestKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr AlphaTestKernels kernels = {
        .codes = TestRow<CodeAlphas<last>>,
        .codesAlphaFirst = TestRow<CodeAlphas<first>>,
        .floats = TestRow<FloatAlphas<last>>,
        .floatsAlphaFirst = TestRow<FloatAlphas<first>>,
    };
    return kernels;
}
