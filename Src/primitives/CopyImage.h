#pragma once

// The row-wise copy of 8-bit images.

#include <cstddef>
#include <cstdint>

namespace PK {

/// Copies `height` rows of `width` bytes. The images must not overlap.
/// \param sourceStep       bytes from one row of the source to the next, of either sign.
/// \param destinationStep  the same for the destination.
/// \return 0; -8 for a null pointer. A width or height below 1 copies nothing.
int32_t CopyImage8u(const uint8_t* source, ptrdiff_t sourceStep, uint8_t* destination,
                    ptrdiff_t destinationStep, int32_t width, int32_t height) noexcept;

} // namespace PK
