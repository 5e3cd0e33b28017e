// The bridges from three planes of 10-bit words.

#include "convert/Bridges.h"
#include "frame/Planes.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/CodecBridges.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace PK {
namespace {

constexpr int32_t kGroupPixels = kV210Unit.pixels, kGroupBytes = kV210Unit.bytes;

/// Rows of Y, U and V; those of one row of the picture, or of two.
struct RowsOfPlanes {
    const uint8_t* rows[6];

    RowsOfPlanes(const SourcePlanes& planes, int32_t row, int32_t nextRow)
        : rows{planes[0].Row(row),     planes[1].Row(row),     planes[2].Row(row),
               planes[0].Row(nextRow), planes[1].Row(nextRow), planes[2].Row(nextRow)} {}
    RowsOfPlanes(const SourcePlanes& planes, int32_t row) : RowsOfPlanes(planes, row, row) {}
};

std::optional<PK_Result> ResultWithoutPlanes(const void* const planes[3], const int32_t planeRowBytes[3],
                                             int32_t width, int32_t height, const void* destination) {
    if (const auto result = ResultWithoutWork(width, height, {planes, planeRowBytes, destination}))
        return result;
    return ResultWithoutWork(width, height, {planes[0], planes[1], planes[2]});
}

/// One row of V210. Whole groups are written as they come; of a last one that is not full, no more than the
/// row has room for.
class V210Row {
public:
    V210Row(int32_t width, int32_t lumasPerPixel, int32_t rowBytes)
        : fWholePixels(width / kGroupPixels * kGroupPixels), fRest(width - fWholePixels),
          fLumaOffset(ptrdiff_t{2} * lumasPerPixel * fWholePixels),
          fGroupOffset(ptrdiff_t{fWholePixels} / kGroupPixels * kGroupBytes),
          fRestBytes(std::clamp<ptrdiff_t>(std::abs(ptrdiff_t{rowBytes}) - fGroupOffset, 0, kGroupBytes)) {}

    void Convert(PlanesRow convert, RowsOfPlanes source, uint8_t* destination) const {
        convert(source.rows, destination, fWholePixels);
        if (fRest == 0) return;
        for (int i = 0; i < 6; ++i) source.rows[i] += i % 3 == 0 ? fLumaOffset : fLumaOffset / 2;
        uint8_t group[kGroupBytes];
        convert(source.rows, group, fRest);
        std::memcpy(destination + fGroupOffset, group, static_cast<size_t>(fRestBytes));
    }

private:
    int32_t fWholePixels, fRest;
    ptrdiff_t fLumaOffset, fGroupOffset, fRestBytes;
};

} // namespace
} // namespace PK

PK_Result PK_ConvertW210toV210(const void* const planes[3], const int32_t planeRowBytes[3], int32_t width,
                               int32_t height, void* destination, int32_t destinationRowBytes) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutPlanes(planes, planeRowBytes, width, height, destination))
        return *result;
    const SourcePlanes source = PlanesOf<const uint8_t>(planes, planeRowBytes, width, height, Chroma::k422);
    const DestinationRows rows(destination, destinationRowBytes);
    const V210Row v210(width, 1, destinationRowBytes);
    const PlanesRow convert = Best<W210Kernels>().toV210;
    for (int32_t row = 0; row < height; ++row) v210.Convert(convert, {source, row}, rows[row]);
    return PK_Success;
}

PK_Result PK_TempConvertW210toV210ToReplacePanasonicLTDebayering(const void* const planes[3],
                                                                 const int32_t planeRowBytes[3],
                                                                 int32_t width, int32_t height,
                                                                 void* destination,
                                                                 int32_t destinationRowBytes) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutPlanes(planes, planeRowBytes, width, height, destination))
        return *result;
    const SourcePlanes source = PlanesOf<const uint8_t>(planes, planeRowBytes, width, height, Chroma::k422);
    const DestinationRows evenRows(destination, ptrdiff_t{2} * destinationRowBytes);
    const DestinationRows oddRows(evenRows.first + destinationRowBytes, evenRows.rowBytes);
    const V210Row v210(width, 1, destinationRowBytes);
    const W210Kernels& kernels = Best<W210Kernels>();
    for (int32_t row = 0; row < height; ++row) {
        v210.Convert(kernels.toV210, {source, row}, evenRows[row]);
        v210.Convert(kernels.averageToV210, {source, row, std::min(row + 1, height - 1)}, oddRows[row]);
    }
    return PK_Success;
}

PK_Result PK_QuarterScaleConvertW210toV210(const void* const planes[3], const int32_t planeRowBytes[3],
                                           int32_t width, int32_t height, void* destination,
                                           int32_t destinationRowBytes) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutPlanes(planes, planeRowBytes, width, height, destination))
        return *result;
    const SourcePlanes source = PlanesOf<const uint8_t>(planes, planeRowBytes, width, height, Chroma::k422);
    const DestinationRows rows(destination, destinationRowBytes);
    const V210Row v210(width / 2, 2, destinationRowBytes);
    const PlanesRow convert = Best<W210Kernels>().quarterToV210;
    for (int32_t row = 0; row < height / 2; ++row) v210.Convert(convert, {source, 2 * row}, rows[row]);
    return PK_Success;
}

PK_Result PK_ConvertW210toQuarterResVUYX_8u(const void* const planes[3], const int32_t planeRowBytes[3],
                                            int32_t width, int32_t height, void* destination,
                                            int32_t destinationRowBytes, int32_t field) noexcept {
    using namespace PK;
    if (const auto result = ResultWithoutPlanes(planes, planeRowBytes, width, height, destination))
        return *result;
    const SourcePlanes source = PlanesOf<const uint8_t>(planes, planeRowBytes, width, height, Chroma::k422);
    const DestinationRows rows(destination, destinationRowBytes);
    const int32_t firstRow = field == 2 ? 1 : 0;
    const PlanesRow convert = Best<W210Kernels>().quarterToVUYX;
    for (int32_t row = 0; row < height / 2; ++row)
        convert(RowsOfPlanes(source, firstRow + row).rows, rows[height / 2 - 1 - row], width / 2);
    return PK_Success;
}
