#include "primitives/Coefficients.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

namespace PK {

int32_t CountZeros8x8(const int16_t* block, uint32_t* count) noexcept {
    if (block == nullptr || count == nullptr) return kStatusNullPointer;
    *count = Best<CoefficientKernels>().countZeros8x8(block);
    return kStatusOk;
}

int32_t MultiplyScaled16s(const int16_t* factors, int16_t* data, int32_t count, int32_t scale) noexcept {
    if (factors == nullptr || data == nullptr) return kStatusNullPointer;
    Best<CoefficientKernels>().multiplyScaled16s(factors, data, count, scale);
    return kStatusOk;
}

} // namespace PK
