#pragma once

// What the codec bridges share: their kernels by layout, the answers that need no look at memory, and the walk
// over rows. A bridge is one fixed layout at each end, so there is no router and no chain.
//
// Kernel sources include BridgeKernels.h alone, since what is inline here may be compiled once only.

#include "convert/BridgeKernels.h"
#include "convert/Image.h"

#include <PixelKiln/Types.h>

#include <initializer_list>
#include <optional>

namespace PK {

/// The result of a bridge that has nothing to convert or must refuse; none where there is work to do.
inline std::optional<PK_Result> ResultWithoutWork(int32_t width, int32_t height,
                                                  std::initializer_list<const void*> pointers) {
    if (height < 1 || width == 0) return PK_Success;
    if (width < 0 || width > kMaximumWidth) return PK_ErrFailed;
    for (const void* pointer : pointers)
        if (pointer == nullptr) return PK_ErrFailed;
    return std::nullopt;
}

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
