// Products of bytes in 16-bit halves, and their rounding quotients by powers of two.

#include "primitives/MultiplyConstant.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

inline I32 InEveryLane(uint32_t bits) {
    return Ints(static_cast<int32_t>(bits));
}

/// Each half limited to 255.
inline I32 SaturateHalves(I32 halves) {
    const I32 low = Ints(0x00ff00ff);
    const I32 above = MinHalves(ShiftRight<8>(halves) & low, Ints(0x00010001));
    return (halves | MultiplyHalves(above, low)) & low;
}

/// nearest(half / 2^scale), ties to even. The product with `unit` holds quotient and fraction; adding the
/// quotient's lowest bit to a fraction of exactly one half makes it round up.
inline I32 ScaleHalves(I32 halves, I32 unit) {
    const I32 quotient = MultiplyHalvesHigh(halves, unit);
    const I32 fraction = MultiplyHalves(halves, unit) | (quotient & Ints(0x00010001));
    const I32 sum = AverageHalves(fraction, Ints(0x7ffe7ffe)); // (fraction + 0x7fff) / 2
    return quotient + (ShiftRight<15>(sum) & Ints(0x00010001));
}

template <bool kScaled>
struct Multiply : Groups<kLanes, Each<4>, Each<4>> {

    explicit Multiply(ChannelFactors factors)
        : fEven(InEveryLane(factors.even)), fOdd(InEveryLane(factors.odd)), fUnit(InEveryLane(factors.unit)) {
    }

    I32 Channels(I32 halves, I32 factors) const {
        const I32 products = MultiplyHalves(halves, factors);
        if constexpr (kScaled)
            return MinHalves(ScaleHalves(products, fUnit), Ints(0x00ff00ff)); // quotients are below 32768
        else
            return SaturateHalves(products);
    }

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 pixels = LoadInts(source), low = Ints(0x00ff00ff);
        const I32 even = Channels(pixels & low, fEven);
        const I32 odd = Channels(ShiftRight<8>(pixels) & low, fOdd);
        Store(destination, even | ShiftLeft<8>(odd));
    }

    I32 fEven, fOdd, fUnit;
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::MultiplyConstantKernels& PK::MultiplyConstantKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr MultiplyConstantKernels kernels = {RowWith<Multiply<false>>, RowWith<Multiply<true>>};
    return kernels;
}
