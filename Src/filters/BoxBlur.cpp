// PK_BoxBlur: lines in bundles that stay in the cache through all passes.

#include <PixelKiln/BoxBlur.h>

#include "filters/BoxBlurKernels.h"
#include "frame/RowScratch.h"
#include "primitives/Dispatch.h"
#include "primitives/TransposeKernels.h"

#include <algorithm>
#include <cstring>
#include <span>
#include <utility>

namespace PK {
namespace {

constexpr int32_t kSmallestSide = 4;
constexpr uint64_t kLargestBundleScratch = 0x4000000; // longer lines go one by one

/// The lines of an image, which are its rows or its columns.
struct Lines {
    uint8_t* first;
    bool areColumns;
    int64_t rowStep; // bytes from row to row
    int32_t length;  // pixels
    int32_t count;

    int64_t PixelStep() const { return areColumns ? rowStep : 4; }
    int64_t LineStep() const { return areColumns ? 4 : rowStep; }
};

Lines LinesOf(uint8_t* image, int32_t rowBytes, int32_t width, int32_t height, int32_t flags) {
    if ((flags & PK_BoxBlur_Columns) == 0) return {image, false, rowBytes, width, height};
    return {image, true, rowBytes / 4 * 4, height, width}; // columns step by whole pixels
}

uint32_t FilteredBytes(int32_t flags) {
    uint32_t bytes = 0;
    for (int i = 0; i < 4; ++i)
        if ((flags >> i & 1) != 0) bytes |= 0xffu << (8 * i);
    return bytes;
}

class Passes {
public:
    Passes(std::span<const double> radii, int32_t flags, int32_t length)
        : fRadii(radii), fFlags(flags), fLength(length) {}

    /// Calls run(pass) for each pass in order, but for those whose window is the pixel itself, which change nothing:
    /// radii that count as 0.
    template <class Run>
    void ForEach(Run run) const {
        for (const double radius : fRadii) {
            const BoxPass pass = PassOf(radius);
            if (pass.size > 1 || pass.weight > 0) run(pass);
        }
    }

    int32_t LargestSize() const {
        int32_t largest = 0; // no pass
        ForEach([&](const BoxPass& pass) { largest = std::max(largest, pass.size); });
        return largest;
    }

private:
    BoxPass PassOf(double radius) const {
        if (!(radius > 0)) radius = 0;
        const auto whole = static_cast<int32_t>(radius);
        const auto weight = static_cast<int32_t>((radius - whole) * 255.0);
        return {fLength, whole + 1, weight, (fFlags & PK_BoxBlur_Renormalise) != 0, FilteredBytes(fFlags)};
    }

    std::span<const double> fRadii;
    int32_t fFlags;
    int32_t fLength;
};

/// Copies \p length runs of kBytes.
template <size_t kBytes>
void CopyRuns(const uint8_t* source, int64_t sourceStep, uint8_t* destination, int64_t destinationStep,
              int32_t length) {
    for (int32_t i = 0; i < length; ++i)
        std::memcpy(destination + i * destinationStep, source + i * sourceStep, kBytes);
}

void CopyColumns(const uint8_t* source, int64_t sourceStep, uint8_t* destination, int64_t destinationStep,
                 int32_t length, int32_t count) {
    if (count == kBundleLines) {
        CopyRuns<kBundleStep>(source, sourceStep, destination, destinationStep, length);
        return;
    }
    for (int32_t offset = 0; offset < 4 * count; offset += 4)
        CopyRuns<4>(source + offset, sourceStep, destination + offset, destinationStep, length);
}

/// One line after the other, through the caller's scratch.
void BlurSingly(const Lines& lines, const Passes& passes, uint8_t* scratch) {
    const BoxBlurKernels::Run blur = Best<BoxBlurKernels>().line;
    const size_t bytes = size_t{4} * lines.length;
    uint8_t* line = scratch + 4 * (int64_t{lines.length} + lines.count);
    for (int32_t i = 0; i < lines.count; ++i) {
        uint8_t* first = lines.first + i * lines.LineStep();
        CopyRuns<4>(first, lines.PixelStep(), line, 4, lines.length);
        passes.ForEach([&](const BoxPass& pass) {
            std::memcpy(scratch, line, bytes);
            blur(pass, scratch, line);
        });
        CopyRuns<4>(line, 4, first, lines.PixelStep(), lines.length);
    }
}

void GatherBundle(const Lines& lines, uint8_t* first, int32_t count, uint8_t* bundle) {
    if (count < kBundleLines) std::memset(bundle, 0, size_t{kBundleStep} * lines.length);
    if (lines.areColumns)
        CopyColumns(first, lines.rowStep, bundle, kBundleStep, lines.length, count);
    else
        Best<TransposeKernels>().pixels4({first, lines.rowStep, bundle, kBundleStep, count, lines.length});
}

void ScatterBundle(const Lines& lines, const uint8_t* bundle, uint8_t* first, int32_t count) {
    if (lines.areColumns)
        CopyColumns(bundle, kBundleStep, first, lines.rowStep, lines.length, count);
    else
        Best<TransposeKernels>().pixels4({bundle, kBundleStep, first, lines.rowStep, lines.length, count});
}

/// Two bundles of scratch, between which the passes go to and fro.
void BlurInBundles(const Lines& lines, const Passes& passes, uint8_t* scratch) {
    const BoxBlurKernels::Run blur = Best<BoxBlurKernels>().bundle;
    for (int32_t i = 0; i < lines.count; i += kBundleLines) {
        const int32_t count = std::min(kBundleLines, lines.count - i);
        uint8_t* first = lines.first + i * lines.LineStep();
        uint8_t* from = scratch;
        uint8_t* to = scratch + int64_t{kBundleStep} * lines.length;
        GatherBundle(lines, first, count, from);
        passes.ForEach([&](const BoxPass& pass) {
            blur(pass, from, to);
            std::swap(from, to);
        });
        ScatterBundle(lines, from, first, count);
    }
}

void Blur(const Lines& lines, const Passes& passes, uint8_t* callerScratch) {
    const int32_t size = passes.LargestSize();
    if (size == 0) return;
    const uint64_t bytes = 2 * uint64_t{kBundleStep} * lines.length;
    if (BoxFits32Bits(size) && bytes <= kLargestBundleScratch) {
        const PK_Result result = WithRowScratch(bytes, [&](uint8_t* scratch) {
            BlurInBundles(lines, passes, scratch);
            return PK_Success;
        });
        if (result == PK_Success) return;
    }
    BlurSingly(lines, passes, callerScratch);
}

} // namespace
} // namespace PK

void PK_BoxBlur(int32_t passCount, double* radii, int32_t flags, void* scratch, void* image, int32_t rowBytes,
                int32_t width, int32_t height) noexcept {
    using namespace PK;
    if (passCount < 1 || !radii || !scratch || !image) return;
    if (width < kSmallestSide || height < kSmallestSide) return;
    const double limit = std::min(width, height) - 3;
    const std::span<double> all(radii, static_cast<size_t>(passCount));
    for (double& radius : all)
        if (radius > limit) radius = limit;
    if (FilteredBytes(flags) == 0) return;

    const Lines lines = LinesOf(static_cast<uint8_t*>(image), rowBytes, width, height, flags);
    Blur(lines, Passes(all, flags, lines.length), static_cast<uint8_t*>(scratch));
}
