// The bodies of conversions between two power laws.

#include "colour/ApproxPower.h"
#include "colour/ColourKernels.h"
#include "colour/ColourLanes.h"
#include "colour/GamutClipLanes.h"

namespace PK {
namespace PK_TARGET {
namespace {

template <bool kMatrix, bool kClip>
void ConvertAs(const void* source, void* destination, ptrdiff_t count, const GammaConversion& conversion) {
    const F32 inExponent = Floats(conversion.inExponent), outExponent = Floats(conversion.outExponent);
    const MatrixLanes lanes(conversion.matrix);
    const Weights luma(conversion.luma);
    ForPixelGroups(source, destination, count, [=](F32(&colour)[3]) {
        Signs signs = TakeSigns(colour);
        ApproxPow(colour, inExponent);
        if constexpr (kMatrix) {
            PutSigns(colour, signs);
            lanes.Apply(colour);
            if constexpr (kClip) ClipGamut(colour, luma);
            signs = TakeSigns(colour);
        }
        ApproxPow(colour, outExponent);
        PutSigns(colour, signs);
    });
}

void Convert(const void* source, void* destination, ptrdiff_t count, const GammaConversion& conversion) {
    const auto convert = !conversion.needMatrix ? ConvertAs<false, false>
                         : conversion.gamutClip ? ConvertAs<true, true>
                                                : ConvertAs<true, false>;
    convert(source, destination, count, conversion);
}

constexpr GammaKernels kKernels = {Convert};

} // namespace
} // namespace PK_TARGET

template <>
const GammaKernels& GammaKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
