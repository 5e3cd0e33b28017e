#pragma once

// The memory of one image, on the heap and exactly as large as the rows reach, so that the address sanitizer
// sees the first byte too far. What lies between rows and in front of the image holds a known pattern, and is
// off limits for the sanitizer too.

#include "support/ByteStream.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace PKFuzz {

/// Where the rows of an image lie. A block of bytes is one row; an image that nothing may touch has none.
struct RowsLayout {
    size_t rowLength = 0; ///< bytes of a row that a call may touch
    size_t rows = 0;
    int32_t rowBytes = 0; ///< as the call gets it; its size does not count for fewer than two rows

    /// Bytes from the lowest to behind the highest.
    size_t Extent() const;
};

/// Row bytes for rows of a length: without padding, with a little, or padded to \p usual, of either sign; any
/// number where they do not count.
int32_t DrawRowBytes(ByteStream& stream, size_t rowLength, size_t rows, int32_t usual);

class ImageMemory {
public:
    /// Begins a drawn number of bytes below 64 behind an address that malloc gave. The rows are 0.
    ImageMemory(const RowsLayout& layout, ByteStream& stream);
    ~ImageMemory();
    ImageMemory(const ImageMemory&) = delete;
    ImageMemory& operator=(const ImageMemory&) = delete;

    const RowsLayout& Layout() const { return fLayout; }

    /// The first row as a call walks them; never null.
    uint8_t* Pixels() const { return fImage + OffsetOfRow(0); }

    /// The bytes of all rows, one after the other in the order in which a call walks them.
    std::vector<uint8_t> Rows() const;
    void SetRows(const std::vector<uint8_t>& rows);

    bool IsPaddingIntact() const;

private:
    size_t OffsetOfRow(size_t row) const;
    template <class Function>
    void ForEachGap(Function function) const;
    void CloseGaps() const;
    void OpenGaps() const;

    RowsLayout fLayout;
    size_t fHead;
    uint8_t* fAllocation;
    uint8_t* fImage;
};

} // namespace PKFuzz
