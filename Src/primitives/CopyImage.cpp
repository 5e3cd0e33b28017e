#include "primitives/CopyImage.h"

#include "primitives/Status.h"

#include <cstring>

namespace PK {

int32_t CopyImage8u(const uint8_t* source, ptrdiff_t sourceStep, uint8_t* destination,
                    ptrdiff_t destinationStep, int32_t width, int32_t height) noexcept {
    if (source == nullptr || destination == nullptr) return kStatusNullPointer;
    if (width < 1) return kStatusSuccess;
    for (int32_t row = 0; row < height; ++row) {
        std::memcpy(destination + row * destinationStep, source + row * sourceStep,
                    static_cast<size_t>(width));
    }
    return kStatusSuccess;
}

} // namespace PK
