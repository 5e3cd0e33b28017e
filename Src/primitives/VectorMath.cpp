#include "primitives/VectorMath.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

namespace PK {

int32_t VectorPow(const float* x, const float* y, float* result, int32_t count) noexcept {
    if (x == nullptr || y == nullptr || result == nullptr) return kStatusNullPointer;
    Best<VectorMathKernels>().pow(x, y, result, count);
    return kStatusOk;
}

int32_t VectorExp(const int32_t* mask, float* values, int32_t count) noexcept {
    if (mask == nullptr || values == nullptr) return kStatusNullPointer;
    Best<VectorMathKernels>().exp(mask, values, count);
    return kStatusOk;
}

int32_t VectorDivide(const int32_t* dividends, const int32_t* divisors, int32_t* quotients,
                     int32_t count) noexcept {
    if (dividends == nullptr || divisors == nullptr || quotients == nullptr) return kStatusNullPointer;
    Best<VectorMathKernels>().divide(dividends, divisors, quotients, count);
    return kStatusOk;
}

} // namespace PK
