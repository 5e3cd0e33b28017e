#pragma once

// What the codec bridges share: their kernels by layout and the walk over rows. A bridge is one fixed layout at each end, so there is no router and no chain.
//
// Kernel sources include BridgeKernels.h alone, since what is inline here may be compiled once only.

#include "convert/BridgeKernels.h"
#include "frame/Arguments.h"

#include <cstddef>

namespace PK {

/// The rows of an image that is read or written; row bytes of either sign.
template <class Byte>
struct Rows {
    Byte* first;
    ptrdiff_t rowBytes;

    template <class Pointer>
    Rows(Pointer* pixels, ptrdiff_t bytes) : first(static_cast<Byte*>(pixels)), rowBytes(bytes) {}

    Byte* operator[](int32_t row) const { return first + row * rowBytes; }
};

using SourceRows = Rows<const uint8_t>;
using DestinationRows = Rows<uint8_t>;

inline void ConvertRows(RowKernel convert, SourceRows source, DestinationRows destination, int32_t width,
                        int32_t height) {
    for (int32_t row = 0; row < height; ++row) convert(source[row], destination[row], width);
}

} // namespace PK
