// Scaled floats to integers. A multiplication by a power of two is exact, but for results below the least
// normal float, which become 0 either way.

#include "primitives/ConvertFloat.h"
#include "primitives/simd/RunGroups.h"

namespace PK::PK_TARGET {
namespace {

template <bool kNearest>
inline I32 ToInteger(F32 x) {
    if constexpr (kNearest)
        return Nearest(x);
    else
        return Truncate(x);
}

/// All bits set unless x is NaN.
inline I32 IsNumber(F32 x) {
    return NotGreater(x, x);
}

struct Scale {
    explicit Scale(PowerOfTwo scale) : fFirst(Floats(scale.first)), fSecond(Floats(scale.second)) {}

    F32 Load(const uint8_t* source) const { return LoadFloats(source) * fFirst * fSecond; }

    F32 fFirst, fSecond;
};

template <bool kNearest>
struct ToInt32 : Scale {
    static constexpr size_t kElements = kLanes;
    static constexpr size_t kSourceElement = 4, kDestinationElement = 4;
    using Scale::Scale;

    /// What the conversion cannot tell becomes INT32_MIN, whose complement is INT32_MAX.
    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 x = Load(source);
        const I32 tooGreat = NotGreater(Floats(0x1p31f), x);
        Store(destination, (ToInteger<kNearest>(x) ^ tooGreat) & IsNumber(x));
    }
};

template <bool kNearest>
struct ToInt16 : Scale {
    static constexpr size_t kElements = 2 * kLanes;
    static constexpr size_t kSourceElement = 4, kDestinationElement = 2;
    using Scale::Scale;

    /// Limited from above, since what is too great for the conversion would become the least integer.
    I32 Lanes(const uint8_t* source) const {
        const F32 x = Load(source);
        return ToInteger<kNearest>(AtMost(Floats(INT16_MAX), x)) & IsNumber(x);
    }

    void Group(const uint8_t* source, uint8_t* destination) const {
        Store(destination, PackSignedLanes(Lanes(source), Lanes(source + 4 * kLanes)));
    }
};

template <class Formula>
void ConvertRun(const uint8_t* source, uint8_t* destination, size_t count, PowerOfTwo scale) {
    RunGroups(Formula(scale), static_cast<ptrdiff_t>(count), destination, source);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::ConvertFloatKernels& PK::ConvertFloatKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr ConvertFloatKernels kernels = {ConvertRun<ToInt32<true>>, ConvertRun<ToInt32<false>>,
                                                    ConvertRun<ToInt16<true>>, ConvertRun<ToInt16<false>>};
    return kernels;
}
