// Scaled floats to integers. A multiplication by a power of two is exact, but for results below the least
// normal float, which become 0 either way.

#include "primitives/ConvertFloat.h"
#include "primitives/lanes/RowDriver.h"

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
struct ToInt32 : Scale, Groups<kLanes, Each<4>, Each<4>> {
    using Scale::Scale;

    /// What the conversion cannot tell becomes INT32_MIN, whose complement is INT32_MAX.
    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 x = Load(source);
        const I32 tooGreat = NotGreater(Floats(0x1p31f), x);
        Store(destination, (ToInteger<kNearest>(x) ^ tooGreat) & IsNumber(x));
    }
};

template <bool kNearest>
struct ToInt16 : Scale, Groups<2 * kLanes, Each<2>, Each<4>> {
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

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::ConvertFloatKernels& PK::ConvertFloatKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr ConvertFloatKernels kernels = {RowWith<ToInt32<true>>, RowWith<ToInt32<false>>,
                                                    RowWith<ToInt16<true>>, RowWith<ToInt16<false>>};
    return kernels;
}
