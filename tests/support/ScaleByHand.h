#pragma once

// What a scale-and-convert call does, made of other exported calls as the rules tell it, and of loops over pixels.

#include "reference/ReferenceScaleRoute.h"

#include <PixelKiln/Types.h>

namespace PKTest {

struct ScaleMemory {
    const uint8_t* source;
    int32_t sourceRowBytes;
    uint8_t* destination;
    int32_t destinationRowBytes;
};

/// The exported call.
PK_Result CallScale(const PKReference::ScaleNumbers& call, const ScaleMemory& memory);

/// For sources of any size from 1 on; a stream is one of planar 4:2:0.
PK_Result ScaleByHand(const PKReference::ScaleNumbers& call, const ScaleMemory& memory);

} // namespace PKTest
