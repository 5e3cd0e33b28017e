#pragma once

// The memory of one image, on the heap and exactly as large as the rows reach, so that the address sanitizer
// sees the first byte too far. What lies between rows and in front of the image holds a known pattern, and is
// off limits for the sanitizer too.

#include "support/ByteStream.h"
#include "support/Size.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace PKFuzz {

/// Where the rows of an image lie. A block of bytes is one row; an image that nothing may touch has none.
struct RowsLayout {
    size_t rowLength = 0; ///< bytes of a row that a call may touch
    size_t rows = 0;
    int32_t rowBytes = 0;   ///< as the call gets it; its size does not count for fewer than two rows
    uint32_t alignment = 1; ///< of the lowest row, in bytes up to 16

    /// Bytes of the rows alone.
    size_t Bytes() const { return rows * rowLength; }

    /// Bytes from the lowest to behind the highest.
    size_t Extent() const;
};

/// Rows with row bytes for their length: without padding, with a little, or padded to 128 bytes as buffers are,
/// of either sign; any number where they do not count.
RowsLayout DrawLayout(ByteStream& stream, size_t rowLength, size_t rows);

/// The same for an image; no memory and any row bytes where it has no pixels.
RowsLayout DrawLayout(ByteStream& stream, int64_t rowLength, Size size);

class ImageMemory {
public:
    /// Begins a drawn number of bytes below 64 behind an address that malloc gave. The rows are 0.
    ImageMemory(const RowsLayout& layout, ByteStream& stream);
    ~ImageMemory();
    ImageMemory(const ImageMemory&) = delete;
    ImageMemory& operator=(const ImageMemory&) = delete;

    const RowsLayout& Layout() const { return fLayout; }

    int32_t RowBytes() const { return fLayout.rowBytes; }

    /// The first row as a call walks them; never null.
    uint8_t* Pixels() const { return fImage + OffsetOfRow(0); }

    /// The bytes of all rows, one after the other in the order in which a call walks them.
    std::vector<uint8_t> Rows() const;
    void SetRows(const std::vector<uint8_t>& rows);

    /// Fills the rows and tells with what.
    std::vector<uint8_t> DrawRows(ByteStream& stream);

    /// Holds a call to have written to the rows alone.
    void CheckPadding() const;

private:
    size_t OffsetOfRow(size_t row) const;
    bool IsPaddingIntact() const;
    template <class Function>
    void ForEachGap(Function function) const;
    void CloseGaps() const;
    void OpenGaps() const;

    RowsLayout fLayout;
    size_t fHead;
    uint8_t* fAllocation;
    uint8_t* fImage;
};

/// An image that calls read: its rows are drawn, and stay.
class SourceImage : public ImageMemory {
public:
    SourceImage(const RowsLayout& layout, ByteStream& stream)
        : ImageMemory(layout, stream), fContent(DrawRows(stream)) {}

    const std::vector<uint8_t>& Content() const { return fContent; }

    /// Holds a call to have written neither to the rows nor between them.
    void CheckStays(const char* rule = "the source stays") const;

private:
    std::vector<uint8_t> fContent;
};

} // namespace PKFuzz
