// The bodies of the vector mathematics.

#include "primitives/VectorMath.h"
#include "primitives/simd/Elementary.h"
#include "primitives/simd/RunGroups.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

struct LaneGroup {
    static constexpr int kElements = kLanes;
    static constexpr int kSourceElement = 4, kDestinationElement = 4;
};

struct Powers : LaneGroup {
    static void Group(const uint8_t* x, const uint8_t* y, uint8_t* result) {
        F32 base[1] = {LoadFloats(x)};
        const F32 exponent[1] = {LoadFloats(y)};
        Pow(base, exponent);
        Store(result, base[0]);
    }
};

struct MaskedExponentials : LaneGroup {
    static void Group(const uint8_t* mask, uint8_t* values) {
        const F32 x = LoadFloats(values);
        F32 exponential[1] = {x};
        Exp(exponential);
        Store(values, Select(LoadInts(mask), exponential[0], x));
    }
};

struct Quotients : LaneGroup {
    static void Group(const uint8_t* dividends, const uint8_t* divisors, uint8_t* result) {
        Store(result, Divide(LoadInts(dividends), LoadInts(divisors)));
    }
};

void PowArray(const float* x, const float* y, float* result, int32_t count) {
    RunGroups(Powers{}, count, result, x, y);
}

void ExpArray(const int32_t* mask, float* values, int32_t count) {
    RunGroups(MaskedExponentials{}, count, values, mask);
}

void DivideArray(const int32_t* dividends, const int32_t* divisors, int32_t* quotients, int32_t count) {
    RunGroups(Quotients{}, count, quotients, dividends, divisors);
}

constexpr VectorMathKernels kKernels = {PowArray, ExpArray, DivideArray};

} // namespace
} // namespace PK_TARGET

template <>
const VectorMathKernels& VectorMathKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
