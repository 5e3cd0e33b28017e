// Lays a row over opaque black.

#include "composite/BlackKernels.h"
#include "primitives/lanes/ByteScale.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

using enum AlphaPlace;

/// 0 to 255, truncated from opacity x 255 + 0.5.
inline I32 CodeOf(float opacity) {
    return Truncate(Min(Max(Floats(opacity * 255 + 0.5f), Floats(0)), Floats(255)));
}

/// c x a / 255, with the opacity in a, each product divided to the nearest.
template <AlphaPlace kAlpha>
struct OverBlackRGB : PixelGroup<4, 4> {
    explicit OverBlackRGB(float amount) : opacity(CodeOf(amount)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 pixels = LoadInts(source);
        const I32 alpha = kAlpha == last ? ShiftRight<24>(pixels) : pixels & Ints(0xff);
        const I32 scaled = ScaleBytes(pixels, MultiplyBytes(alpha, opacity));
        Store(destination, scaled | Ints(kAlpha == last ? -0x1000000 : 0xff));
    }

    I32 opacity;
};

constexpr int32_t kChromaZero = 128, kLumaZero = 16;

/// x / 255 of integers of either sign.
inline I32 DivideSignedBy255(I32 x) {
    const auto shifted = [](I32 y) { return ShiftRightSigned<8>(y + (ShiftRightSigned<31>(y) & Ints(255))); };
    return shifted(x + shifted(x + Ints(128)) + Ints(128));
}

/// (c - zero) x a / 255 + zero by integers.
struct OverBlackYUVCodes : PixelGroup<4, 4> {
    explicit OverBlackYUVCodes(float amount) : opacity(CodeOf(amount)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 pixels = LoadInts(source);
        const IntChannels c = ByteChannels(pixels);
        const I32 alpha = MultiplyBytes(c.c3, opacity);
        const auto scaled = [alpha]<int32_t kZero>(I32 code) {
            return DivideSignedBy255((code - Ints(kZero)) * alpha) + Ints(kZero);
        };
        const I32 result = PackByteChannels(scaled.template operator()<kChromaZero>(c.c0),
                                            scaled.template operator()<kChromaZero>(c.c1),
                                            scaled.template operator()<kLumaZero>(c.c2), Ints(255));
        Store(destination, Select(Equal(alpha, Ints(255)), pixels | Ints(-0x1000000), result));
    }

    I32 opacity;
};

struct ByPixel {
    static I32 Passes(F32 alpha) { return NotGreater(Floats(-kNegligible), alpha - Floats(254.5f)); }
};
struct ByFours {
    static I32 Passes(F32 alpha) { return WhereGroupAgrees(NotGreater(Floats(254.5f), alpha)); }
};

/// (c - zero) x a / 255 + zero by floats, rounded; what is nearly opaque passes.
template <class Rule>
struct OverBlackYUVFloats : PixelGroup<4, 4> {
    explicit OverBlackYUVFloats(float amount) : opacity(Floats(amount)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 pixels = LoadInts(source);
        const IntChannels c = ByteChannels(pixels);
        const F32 alpha = ToFloat(c.c3) * opacity;
        const F32 part = alpha * Floats(0x1.010102p-8f); // the float nearest to 1 / 255
        const auto scaled = [part]<int32_t kZero>(I32 code) {
            return Nearest((ToFloat(code) - Floats(kZero)) * part + Floats(kZero));
        };
        const I32 result = PackByteChannels(scaled.template operator()<kChromaZero>(c.c0),
                                            scaled.template operator()<kChromaZero>(c.c1),
                                            scaled.template operator()<kLumaZero>(c.c2), Ints(255));
        Store(destination, Select(Rule::Passes(alpha), pixels | Ints(-0x1000000), result));
    }

    F32 opacity;
};

void OverBlackYUVRow(const void* source, void* destination, ptrdiff_t width, const float& opacity) {
    if constexpr (kTarget == Target::plain)
        RunRow(OverBlackYUVCodes(opacity), width, destination, source);
    else
        RunRowWithEnds<16, 4>(OverBlackYUVFloats<ByPixel>(opacity), OverBlackYUVFloats<ByFours>(opacity),
                              width, destination, source);
}

template <AlphaPlace kAlpha>
struct OverBlackFloats : PixelGroup<16, 16> {
    explicit OverBlackFloats(float amount) : opacity(Floats(amount)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const Channels c = Pixels32f<kAlpha>::Load(source);
        const F32 alpha = c.c3 * opacity;
        const I32 passes = Less(Floats(1), Floats(kNegligible) + alpha);
        const auto scaled = [&](F32 x) { return Select(passes, x, x * alpha); };
        Pixels32f<kAlpha>::Store(destination, {scaled(c.c0), scaled(c.c1), scaled(c.c2), Floats(1)});
    }

    F32 opacity;
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::BlackKernels& PK::BlackKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr BlackKernels kernels = {
        .rgb8u = RowWith<OverBlackRGB<last>, float>,
        .rgb8uAlphaFirst = RowWith<OverBlackRGB<first>, float>,
        .yuv8u = OverBlackYUVRow,
        .floats = RowWith<OverBlackFloats<last>, float>,
        .floatsAlphaFirst = RowWith<OverBlackFloats<first>, float>,
    };
    return kernels;
}
