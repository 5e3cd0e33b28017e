#include "support/ImageMemory.h"

#include "support/Check.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <new>
#include <sanitizer/asan_interface.h>

namespace PKFuzz {

namespace {

constexpr uint8_t kPattern = 0xa5;

size_t Step(const RowsLayout& layout) {
    return static_cast<size_t>(std::abs(int64_t{layout.rowBytes}));
}

} // namespace

size_t RowsLayout::Extent() const {
    return rows == 0 ? 0 : (rows - 1) * Step(*this) + rowLength;
}

RowsLayout DrawLayout(ByteStream& stream, size_t rowLength, size_t rows) {
    if (rows < 2 && stream.OneIn(4)) return {rowLength, rows, stream.AnyI32()};
    const auto packed = static_cast<int32_t>(rowLength);
    int32_t padding = 0;
    switch (stream.Below(3)) {
    case 1:
        padding = stream.Between(0, 70);
        break;
    case 2:
        padding = static_cast<int32_t>(-rowLength % 128);
        break;
    default:
        break;
    }
    const int32_t rowBytes = packed + std::min(padding, INT32_MAX - packed);
    return {rowLength, rows, stream.OneIn(3) ? -rowBytes : rowBytes};
}

RowsLayout DrawLayout(ByteStream& stream, int64_t rowLength, Size size) {
    if (!size.HasPixels()) return {0, 0, stream.AnyI32()};
    return DrawLayout(stream, static_cast<size_t>(rowLength), static_cast<size_t>(size.height));
}

ImageMemory::ImageMemory(const RowsLayout& layout, ByteStream& stream)
    : fLayout(layout), fHead(stream.Bool() ? stream.Below(64) / layout.alignment * layout.alignment : 0),
      fAllocation(static_cast<uint8_t*>(std::malloc(fHead + layout.Extent()))), fImage(fAllocation + fHead) {
    if (fAllocation == nullptr) throw std::bad_alloc();
    std::memset(fAllocation, kPattern, fHead + fLayout.Extent());
    for (size_t row = 0; row < fLayout.rows; ++row)
        std::memset(fImage + OffsetOfRow(row), 0, fLayout.rowLength);
    CloseGaps();
}

ImageMemory::~ImageMemory() {
    OpenGaps();
    std::free(fAllocation);
}

size_t ImageMemory::OffsetOfRow(size_t row) const {
    if (fLayout.rows < 2) return 0;
    return Step(fLayout) * (fLayout.rowBytes < 0 ? fLayout.rows - 1 - row : row);
}

std::vector<uint8_t> ImageMemory::Rows() const {
    std::vector<uint8_t> rows(fLayout.Bytes());
    for (size_t row = 0; row < fLayout.rows; ++row)
        std::copy_n(fImage + OffsetOfRow(row), fLayout.rowLength, rows.data() + row * fLayout.rowLength);
    return rows;
}

void ImageMemory::SetRows(const std::vector<uint8_t>& rows) {
    for (size_t row = 0; row < fLayout.rows; ++row)
        std::copy_n(rows.data() + row * fLayout.rowLength, fLayout.rowLength, fImage + OffsetOfRow(row));
}

std::vector<uint8_t> ImageMemory::DrawRows(ByteStream& stream) {
    std::vector<uint8_t> rows(fLayout.Bytes());
    stream.Fill(rows.data(), rows.size());
    SetRows(rows);
    return rows;
}

void ImageMemory::CheckPadding() const {
    Check(IsPaddingIntact(), "bytes outside the rows stay");
}

bool ImageMemory::IsPaddingIntact() const {
    OpenGaps();
    bool intact = true;
    ForEachGap([&](const uint8_t* gap, size_t bytes) {
        intact = intact && std::all_of(gap, gap + bytes, [](uint8_t byte) { return byte == kPattern; });
    });
    CloseGaps();
    return intact;
}

template <class Function>
void ImageMemory::ForEachGap(Function function) const {
    function(fAllocation, fHead);
    for (size_t row = 0; row + 1 < fLayout.rows; ++row) // by place in memory, not in the order of the walk
        function(fImage + row * Step(fLayout) + fLayout.rowLength, Step(fLayout) - fLayout.rowLength);
}

// The sanitizer closes what its granules of 8 bytes allow: a gap from where it begins to the last boundary.
void ImageMemory::CloseGaps() const {
    ForEachGap([]([[maybe_unused]] const uint8_t* gap, [[maybe_unused]] size_t bytes) {
        ASAN_POISON_MEMORY_REGION(gap, bytes);
    });
}

void ImageMemory::OpenGaps() const {
    ASAN_UNPOISON_MEMORY_REGION(fAllocation, fHead + fLayout.Extent());
}

void SourceImage::CheckStays(const char* rule) const {
    CheckPadding();
    CheckSame(fContent, Rows(), rule);
}

} // namespace PKFuzz
