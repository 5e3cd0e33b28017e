#include "DensePlanes.h"

#include <algorithm>
#include <cstring>

namespace tool {
namespace {

constexpr uint8_t kGrey = 128;

int32_t HalfUp(int32_t size) {
    return size / 2 + size % 2;
}

/// The chroma of a dense frame: in a plane of their own, or every second byte.
struct DenseChroma {
    size_t first, step, rowBytes;
};

/// \param which  0 for U, 1 for V.
DenseChroma DenseChromaOf(size_t which, int32_t width, int32_t height, RowPacking packing) {
    const size_t luma = static_cast<size_t>(width) * static_cast<size_t>(height);
    const auto columns = static_cast<size_t>(HalfUp(width)), rows = static_cast<size_t>(HalfUp(height));
    if (packing == RowPacking::Pairs) return {luma + which, 2, 2 * columns};
    return {luma + which * columns * rows, 1, columns};
}

/// NV12, by the library.
void FromPairs(const std::vector<uint8_t>& bytes, const std::vector<Plane>& planes, int32_t width,
               int32_t height) {
    void* const pointers[3] = {planes[0].first, planes[1].first, planes[2].first};
    const int32_t rowBytes[3] = {planes[0].rowBytes, planes[1].rowBytes, planes[2].rowBytes};
    const DenseChroma pairs = DenseChromaOf(0, width, height, RowPacking::Pairs);
    PK_ConvertNV12toYV12_SSE4<0>(bytes.data(), width, bytes.data() + pairs.first,
                                 static_cast<int32_t>(pairs.rowBytes), pointers, rowBytes, width, height);
}

void CopyRows(const uint8_t* from, size_t fromStep, const Plane& to) {
    for (int32_t row = 0; row < to.rows; ++row)
        std::memcpy(to.first + ptrdiff_t{row} * to.rowBytes, from + static_cast<size_t>(row) * fromStep,
                    static_cast<size_t>(to.packedRowBytes));
}

/// The row that stands for a last one that the library does not have: of the same field, if there is one.
int32_t RowFor(int32_t row, const Plane& plane, bool areFields) {
    if (row < plane.rows) return row;
    return areFields && plane.rows >= 2 ? plane.rows - 2 : plane.rows - 1;
}

} // namespace

size_t DenseBytes(int32_t width, int32_t height) {
    return static_cast<size_t>(width) * static_cast<size_t>(height) +
           2 * static_cast<size_t>(HalfUp(width)) * static_cast<size_t>(HalfUp(height));
}

void FromDense(const std::vector<uint8_t>& bytes, RowPacking packing, Frame& frame) {
    const int32_t width = frame.Width(), height = frame.Height();
    const std::vector<Plane> planes = frame.Planes();
    if (packing == RowPacking::Pairs) return FromPairs(bytes, planes, width, height);
    CopyRows(bytes.data(), static_cast<size_t>(width), planes[0]);
    for (size_t which = 0; which < 2; ++which) {
        const DenseChroma chroma = DenseChromaOf(which, width, height, packing);
        CopyRows(bytes.data() + chroma.first, chroma.rowBytes, planes[1 + which]);
    }
}

std::vector<uint8_t> ToDense(const Frame& frame, RowPacking packing) {
    const int32_t width = frame.Width(), height = frame.Height();
    std::vector<uint8_t> bytes(DenseBytes(width, height), kGrey);
    const std::vector<Plane> planes = frame.Planes();
    const std::optional<Video420> video = Video420Of(frame.Format());
    const bool areFields = video && video->areFields;
    for (int32_t row = 0; row < height; ++row)
        std::memcpy(bytes.data() + static_cast<size_t>(row) * static_cast<size_t>(width),
                    planes[0].first + ptrdiff_t{row} * planes[0].rowBytes, static_cast<size_t>(width));
    for (size_t which = 0; which < 2; ++which) {
        const Plane& plane = planes[1 + which];
        if (plane.packedRowBytes == 0 || plane.rows == 0) continue;
        const DenseChroma chroma = DenseChromaOf(which, width, height, packing);
        for (int32_t row = 0; row < HalfUp(height); ++row) {
            const uint8_t* const from =
                plane.first + ptrdiff_t{RowFor(row, plane, areFields)} * plane.rowBytes;
            uint8_t* const to = bytes.data() + chroma.first + static_cast<size_t>(row) * chroma.rowBytes;
            for (int32_t k = 0; k < HalfUp(width); ++k)
                to[static_cast<size_t>(k) * chroma.step] = from[std::min(k, plane.packedRowBytes - 1)];
        }
    }
    return bytes;
}

} // namespace tool
