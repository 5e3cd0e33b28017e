#include "primitives/Initialise.h"

namespace PK {

int32_t InitialiseImagePrimitives() noexcept {
    return 0;
}

int32_t InitialiseSignalPrimitives() noexcept {
    return 0;
}

int32_t InitialiseVectorPrimitives() noexcept {
    return 0;
}

const char* PrimitiveStatusText(int32_t status) noexcept {
    if (status == 0) return "No error";
    return status > 0 ? "Warning" : "Error";
}

} // namespace PK
