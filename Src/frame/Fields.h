#pragma once

// What the numbers of fields tell.

#include <cstdint>

namespace PK {

/// Whether an image has fields, of which this one comes first in time. Any other number is a progressive image.
constexpr bool IsInterlaced(int32_t field) {
    return field == 1 || field == 2;
}

} // namespace PK
