#pragma once

// Rows that the processor does not fetch ahead by itself.

#include "convert/Image.h"

#include <algorithm>

namespace PK {

/// Fetches rows of an image into the cache before they are read, where the walk is against memory order or rows lie
/// apart. The processor expects what follows in memory, and so waits at the beginning of every such row; rows that
/// follow each other are left to it.
class RowsAhead {
public:
    explicit RowsAhead(const SourceImage& image)
        : fImage(image), fRowBytes(static_cast<ptrdiff_t>(BytesOfRow(image.format, image.width))),
          fIsNeeded(image.rowBytes < fRowBytes || image.rowBytes - fRowBytes > kPadding) {}

    /// Fetches the beginning of a row and of each of its pages. The processor finds the rest; lines that it brings
    /// anyway would be asked for twice, which takes up to a quarter of the time. A row behind the last is none.
    void Fetch(int32_t row) const {
        if (!fIsNeeded || row >= fImage.height) return;
        const uint8_t* const bytes = fImage.Row(row);
        const auto place = static_cast<ptrdiff_t>(reinterpret_cast<uintptr_t>(bytes) % kPage);
        for (ptrdiff_t page = 0; page < fRowBytes; page += kPage - (place + page) % kPage) {
            const ptrdiff_t end = std::min(page + kFetched, fRowBytes);
            for (ptrdiff_t at = page; at < end; at += kCacheLine) FetchLine(bytes[at]);
        }
    }

private:
    /// An instruction of its own: the compiler takes a function that does nothing but __builtin_prefetch for one
    /// without effect, and drops it.
    static void FetchLine(const uint8_t& byte) { asm volatile("prefetcht0 %0" : : "m"(byte)); }

    static constexpr ptrdiff_t kPage = 4096, kCacheLine = 64;
    static constexpr ptrdiff_t kFetched = 8 * kCacheLine;
    static constexpr ptrdiff_t kPadding = 256; // rows with less between them follow each other

    const SourceImage& fImage;
    ptrdiff_t fRowBytes;
    bool fIsNeeded;
};

} // namespace PK
