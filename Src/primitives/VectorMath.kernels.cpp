// The bodies of the vector mathematics.

#include "primitives/VectorMath.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/simd/Elementary.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

struct Powers : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    static void Group(const uint8_t* x, const uint8_t* y, uint8_t* result) {
        F32 base[1] = {LoadFloats(x)};
        const F32 exponent[1] = {LoadFloats(y)};
        Pow(base, exponent);
        Store(result, base[0]);
    }
};

struct MaskedExponentials : Groups<kLanes, Updated<Each<4>>, Each<4>> {
    static void Group(const uint8_t* mask, uint8_t* values) {
        const F32 x = LoadFloats(values);
        F32 exponential[1] = {x};
        Exp(exponential);
        Store(values, Select(LoadInts(mask), exponential[0], x));
    }
};

struct Quotients : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    static void Group(const uint8_t* dividends, const uint8_t* divisors, uint8_t* result) {
        Store(result, Divide(LoadInts(dividends), LoadInts(divisors)));
    }
};

constexpr VectorMathKernels kKernels = {TwoRows<Powers>, Row<MaskedExponentials>, TwoRows<Quotients>};

} // namespace
} // namespace PK_TARGET

template <>
const VectorMathKernels& VectorMathKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
