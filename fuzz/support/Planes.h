#pragma once

// Images of three planes as calls take them.

#include "support/ByteStream.h"
#include "support/ImageMemory.h"

#include <cstdint>
#include <deque>

namespace PKFuzz {

/// Y, U and V with drawn rows; now and then one of them is given as null.
struct Planes {
    /// Of the layouts, row bytes are drawn.
    Planes(const RowsLayout (&extents)[3], ByteStream& stream);

    void CheckPadding() const;
    void CheckStay() const;

    std::deque<SourceImage> memory;
    void* pointers[3];
    const void* sources[3];
    int32_t rowBytes[3];
    bool hasNull = false; ///< where there are samples
};

} // namespace PKFuzz
