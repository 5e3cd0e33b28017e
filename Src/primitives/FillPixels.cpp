#include "primitives/FillPixels.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

#include <algorithm>
#include <cstring>

namespace PK {

namespace {

// From these sizes of an image and a run on the processor's string instructions are faster than stores of vectors:
// they take possession of whole cache lines without reading them first. Below, the image stays in the cache, or they
// take longer to begin.
constexpr size_t kStringImage = size_t{1} << 20;
constexpr size_t kStringRun = size_t{1} << 12;
constexpr size_t kCacheLine = 64;

FillPattern Repeat(const void* pixel, size_t pixelBytes) {
    FillPattern pattern;
    for (size_t at = 0; at < sizeof pattern.bytes; at += pixelBytes)
        std::memcpy(pattern.bytes + at, pixel, pixelBytes);
    return pattern;
}

/// The pattern as it stands `at` bytes further on.
FillPattern Rotated(const FillPattern& pattern, size_t at) {
    return Repeat(pattern.bytes + at % FillPattern::kPeriod, FillPattern::kPeriod);
}

/// Fills eight bytes at a time.
void StoreString(uint8_t* destination, size_t bytes, const FillPattern& pattern) {
    uint64_t word;
    std::memcpy(&word, pattern.bytes, sizeof word);
    size_t words = bytes / sizeof word;
    asm volatile("rep stosq" : "+D"(destination), "+c"(words) : "a"(word) : "memory");
}

/// Runs that are long enough for whole cache lines.
class LongRuns {
public:
    LongRuns(const FillKernels& kernels, const FillPattern& pattern) : fKernels(kernels), fPattern(pattern) {}

    void Fill(uint8_t* destination, size_t bytes) {
        const size_t head = -reinterpret_cast<uintptr_t>(destination) & (kCacheLine - 1);
        const size_t lines = (bytes - head) & ~(kCacheLine - 1);
        const FillPattern aligned = Rotated(fPattern, head);
        fKernels.run(destination, head, fPattern);
        const bool isEveryHalfTheSame = std::memcmp(aligned.bytes, aligned.bytes + 8, 8) == 0;
        if (isEveryHalfTheSame)
            StoreString(destination + head, lines, aligned);
        else
            MoveString(destination + head, lines, aligned);
        fKernels.run(destination + head + lines, bytes - head - lines, aligned);
    }

private:
    static constexpr size_t kPage = 4096;
    static constexpr size_t kBlock = size_t{1}
                                     << 14; // stays in the first cache beside the lines that are written

    /// Copies from a block of the pattern. Each part has the place in its page that its destination has: a tenth
    /// faster than any other.
    void MoveString(uint8_t* destination, size_t bytes, const FillPattern& pattern) {
        FillBlock(pattern);
        while (bytes > 0) {
            const size_t place = reinterpret_cast<uintptr_t>(destination) & (kPage - 1);
            const size_t part = std::min(bytes, kBlock - place);
            const uint8_t* from = fBlock + place;
            size_t words = part / sizeof(uint64_t);
            asm volatile("rep movsq" : "+D"(destination), "+S"(from), "+c"(words) : : "memory");
            bytes -= part;
        }
    }

    /// The block of the run before serves as long as runs begin at the same place in a cache line's pattern.
    void FillBlock(const FillPattern& pattern) {
        if (fIsBlockFilled && std::memcmp(fBlock, pattern.bytes, FillPattern::kPeriod) == 0) return;
        fKernels.run(fBlock, kBlock, pattern);
        fIsBlockFilled = true;
    }

    const FillKernels& fKernels;
    const FillPattern& fPattern;
    bool fIsBlockFilled = false;
    alignas(kPage) uint8_t fBlock[kBlock];
};

void FillLongRows(const FillKernels& kernels, uint8_t* destination, ptrdiff_t step, size_t bytes,
                  ptrdiff_t rows, const FillPattern& pattern) {
    LongRuns runs(kernels, pattern);
    for (ptrdiff_t row = 0; row < rows; ++row) runs.Fill(destination + row * step, bytes);
}

int32_t FillPixels(const void* value, size_t pixelBytes, uint8_t* destination, ptrdiff_t step, int32_t width,
                   int32_t height) {
    if (value == nullptr || destination == nullptr) return kStatusNullPointer;
    if (width < 0 || height < 0) return kStatusBadSize;
    size_t bytes = static_cast<size_t>(width) * pixelBytes;
    ptrdiff_t rows = height;
    if (step == static_cast<ptrdiff_t>(bytes)) { // no gap between the rows
        bytes *= static_cast<size_t>(height);
        rows = std::min<ptrdiff_t>(rows, 1);
    }
    const FillPattern pattern = Repeat(value, pixelBytes);
    const FillKernels& kernels = Best<FillKernels>();
    if (bytes >= kStringRun && bytes * static_cast<size_t>(rows) >= kStringImage)
        FillLongRows(kernels, destination, step, bytes, rows, pattern);
    else
        for (ptrdiff_t row = 0; row < rows; ++row) kernels.run(destination + row * step, bytes, pattern);
    return kStatusOk;
}

} // namespace

int32_t FillPixels4x8u(const uint8_t value[4], uint8_t* destination, ptrdiff_t step, int32_t width,
                       int32_t height) noexcept {
    return FillPixels(value, 4, destination, step, width, height);
}

int32_t FillPixels4x16u(const uint16_t value[4], uint8_t* destination, ptrdiff_t step, int32_t width,
                        int32_t height) noexcept {
    return FillPixels(value, 8, destination, step, width, height);
}

int32_t FillPixels4x32f(const float value[4], uint8_t* destination, ptrdiff_t step, int32_t width,
                        int32_t height) noexcept {
    return FillPixels(value, 16, destination, step, width, height);
}

} // namespace PK
