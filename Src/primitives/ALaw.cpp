#include "primitives/ALaw.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

namespace PK {

int32_t ALawToLinear16(const uint8_t* source, int16_t* destination, int32_t count) noexcept {
    if (source == nullptr || destination == nullptr) return kStatusNullPointer;
    if (count < 0) return kStatusBadSize;
    Best<ALawKernels>().toLinear16(source, destination, count);
    return kStatusOk;
}

} // namespace PK
