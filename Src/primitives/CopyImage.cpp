#include "primitives/CopyImage.h"

#include <cstring>

namespace PK {

namespace {

constexpr int32_t kNullPointer = -8;

} // namespace

int32_t CopyImage8u(const uint8_t* source, ptrdiff_t sourceStep, uint8_t* destination,
                    ptrdiff_t destinationStep, int32_t width, int32_t height) noexcept {
    if (source == nullptr || destination == nullptr) return kNullPointer;
    if (width < 1) return 0;
    for (int32_t row = 0; row < height; ++row) {
        std::memcpy(destination + row * destinationStep, source + row * sourceStep,
                    static_cast<size_t>(width));
    }
    return 0;
}

} // namespace PK
