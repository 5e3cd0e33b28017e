#pragma once

// Start-up of the three domains of primitives. Each has one body per primitive or chooses by the capability
// flags at every call, so there is nothing to prepare and nothing to warn of yet.

#include <cstdint>

namespace PK {

/// Each returns 0 for success, a positive number for a warning, a negative one for an error.
int32_t InitialiseImagePrimitives() noexcept;
int32_t InitialiseSignalPrimitives() noexcept;
int32_t InitialiseVectorPrimitives() noexcept;

/// What a status means, as constant text.
const char* PrimitiveStatusText(int32_t status) noexcept;

} // namespace PK
