// The bodies for coefficients. Two values of 16 bits stand in each lane.

#include "primitives/Coefficients.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

constexpr int kLanesOfBlock = 32;

uint32_t CountZeros(const int16_t* block) {
    const I32 zero = Ints(0);
    I32 negativeCount = zero;
    for (int i = 0; i < kLanesOfBlock; i += kLanes) {
        const I32 pair = LoadInts(block + 2 * i);
        negativeCount = negativeCount + Equal(ShiftLeft<16>(pair), zero) + Equal(ShiftRight<16>(pair), zero);
    }
    uint32_t lanes[kLanes];
    Store(lanes, negativeCount);
    uint32_t sum = 0;
    for (int i = 0; i < kLanes; ++i) sum -= lanes[i];
    return sum;
}

/// Rows of 16-bit values in pairs. A product has 31 bits and a sign, so that half a unit of any scale that
/// matters can be added to it.
template <class Scaling>
struct ScaledProduct : Groups<2 * kLanes, Updated<Each<2>>, Each<2>> {
    explicit ScaledProduct(Scaling by) : scaling(by) {}

    Scaling scaling;

    void Group(const uint8_t* factors, uint8_t* data) const {
        const I32 values = LoadInts(data), factor = LoadInts(factors);
        const I32 even = scaling.Apply(MultiplyAddHalves(values & Ints(0xffff), factor));
        const I32 odd = scaling.Apply(MultiplyAddHalves(values & Ints(-0x10000), factor));
        I32 low, high;
        InterleaveInBlocks(even, odd, low, high);
        Store(data, PackSignedInBlocks(low, high));
    }
};

/// x / 2^bits to the nearest integer, ties to the even one, for bits from 1 to 31: adds just below half a
/// unit, and the lowest bit of the integer part.
struct Divided {
    int32_t bits;

    I32 Apply(I32 x) const {
        const I32 belowHalf = Ints((int32_t{1} << (bits - 1)) - 1);
        return ShiftRightSigned(x + belowHalf + (ShiftRightSigned(x, bits) & Ints(1)), bits);
    }
};

/// x times 2^bits for bits from 0 to 15, where what passes 16 bits may saturate first.
struct Multiplied {
    int32_t bits;

    I32 Apply(I32 x) const { return ShiftLeft(Max(Ints(-32768), Min(Ints(32767), x)), bits); }
};

void MultiplyScaled(const void* factors, void* data, ptrdiff_t count, const int32_t& scale) {
    // Every product is at most half of 2^31 and rounds to 0 there; 2^15 times anything but 0 saturates.
    constexpr int32_t kMostDivided = 31, kMostMultiplied = 15;
    if (scale > 0) {
        RunRow(ScaledProduct<Divided>({scale < kMostDivided ? scale : kMostDivided}), count, data, factors);
    } else {
        RunRow(ScaledProduct<Multiplied>({scale > -kMostMultiplied ? -scale : kMostMultiplied}), count, data,
               factors);
    }
}

constexpr CoefficientKernels kKernels = {CountZeros, MultiplyScaled};

} // namespace
} // namespace PK_TARGET

template <>
const CoefficientKernels& CoefficientKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
