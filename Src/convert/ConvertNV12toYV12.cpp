// Decoded surfaces whose two chroma samples are interleaved, to three planes.

#include <PixelKiln/Planar.h>

#include "convert/ConvertNV12toYV12Kernels.h"
#include "frame/Arguments.h"
#include "frame/Bands.h"
#include "frame/Planes.h"
#include "primitives/Dispatch.h"

#include <algorithm>

namespace PK {
namespace {

constexpr int32_t kBandRows = 32;

// Chroma on its way: rows, or of long ones a stripe, that stay in the inner cache until they are parted. On the stack:
// nobody could be told that there is no memory.
constexpr int32_t kScratchBytes = 0x4000;

/// Luma, and pairs of chroma samples two bytes wide.
struct Surface {
    Plane<const uint8_t> luma, pairs;
};

/// The work on a band of luma rows and the chroma rows that belong to it.
class ConvertNV12toYV12_Threaded {
public:
    ConvertNV12toYV12_Threaded(const Surface& source, const DestinationPlanes& destination)
        : fSource(source), fDestination(destination) {}

    PK_Result operator()(int32_t firstRow, int32_t endRow) const {
        for (int32_t row = firstRow; row < endRow; ++row)
            fKernels.copySurface(fSource.luma.Row(row), fDestination[0].Row(row), fSource.luma.width);
        const int32_t pairs = fSource.pairs.width;
        for (int32_t pair = 0; pair < pairs; pair += kScratchBytes / 2)
            PartStripe(firstRow / 2, endRow / 2, pair, std::min(kScratchBytes / 2, pairs - pair));
        return PK_Success;
    }

private:
    void PartStripe(int32_t firstRow, int32_t endRow, int32_t firstPair, int32_t pairs) const {
        const int32_t rows = kScratchBytes / (2 * pairs);
        for (int32_t row = firstRow; row < endRow; row += rows)
            PartRows(row, std::min(row + rows, endRow), firstPair, pairs);
    }

    /// First all out of the surface, then apart: between reads that are waited for, nothing is done.
    void PartRows(int32_t firstRow, int32_t endRow, int32_t firstPair, int32_t pairs) const {
        alignas(64) uint8_t scratch[kScratchBytes];
        const int32_t bytes = 2 * pairs;
        uint8_t* copy = scratch;
        for (int32_t row = firstRow; row < endRow; ++row, copy += bytes)
            fKernels.copySurface(fSource.pairs.Row(row) + 2 * ptrdiff_t{firstPair}, copy, bytes);
        copy = scratch;
        for (int32_t row = firstRow; row < endRow; ++row, copy += bytes)
            fKernels.partPairs(copy, fDestination[1].Row(row) + firstPair,
                               fDestination[2].Row(row) + firstPair, pairs);
    }

    Surface fSource;
    DestinationPlanes fDestination;
    const NV12Kernels& fKernels = Best<NV12Kernels>();
};

} // namespace
} // namespace PK

using namespace PK;

template <int Member>
void PK_ConvertNV12toYV12_SSE4(const void* luma, int32_t lumaRowBytes, const void* chroma,
                               int32_t chromaRowBytes, void* const destinationPlanes[3],
                               const int32_t destinationRowBytes[3], int32_t width, int32_t height) noexcept {
    if (ResultOfSize(width, height, BelowZero::Empty)) return;
    if (HasNull({luma, destinationPlanes, destinationRowBytes})) return;
    const auto planes =
        PlanesOf<uint8_t>(destinationPlanes, destinationRowBytes, width, height, Chroma::k420);
    const Plane<uint8_t>& first = planes[1];
    if (HasNull({planes[0].pixels})) return;
    if (!first.IsEmpty() && HasNull({chroma, first.pixels, planes[2].pixels})) return;

    constexpr ptrdiff_t kStep = Member == 0 ? 1 : 2; // rows of the source for each row of the destination
    const Surface surface = {
        {static_cast<const uint8_t*>(luma), kStep * lumaRowBytes, width, height},
        {static_cast<const uint8_t*>(chroma), kStep * chromaRowBytes, first.width, first.height}};
    RunInBands(height, Bands::OfRows(kBandRows), ConvertNV12toYV12_Threaded(surface, planes));
}

template PK_API void PK_ConvertNV12toYV12_SSE4<0>(const void*, int32_t, const void*, int32_t, void* const[3],
                                                  const int32_t[3], int32_t, int32_t) noexcept;
template PK_API void PK_ConvertNV12toYV12_SSE4<1>(const void*, int32_t, const void*, int32_t, void* const[3],
                                                  const int32_t[3], int32_t, int32_t) noexcept;
