#pragma once

// The planes of an image whose Y, U and V lie apart.

#include <PixelKiln/Buffers.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <type_traits>

namespace PK {

/// How many samples the planes of U and V have.
enum class Chroma {
    k420, ///< Half the width and half the height, both rounded down: a last odd column or row has none of its own.
    k422, ///< Half the width, rounded up: a last odd column has its own. The height is that of Y.
};

/// Whether the planes of a 4:2:0 image in one block have offsets in 32 bits.
constexpr bool HavePlanesOffsets(int64_t width, int64_t height) {
    return ((width + 127) & ~int64_t{127}) * ((height + 31) & ~int64_t{31}) <= INT32_MAX;
}

/// Rows of samples; row bytes of either sign.
template <class Byte>
struct Plane {
    Byte* pixels;
    ptrdiff_t rowBytes;
    int32_t width; // samples
    int32_t height;

    Byte* Row(int32_t row) const { return pixels + row * rowBytes; }
    bool IsEmpty() const { return width == 0 || height == 0; }
};

/// Whether there are samples that cannot be told apart: without memory, or in rows that begin within each other.
template <class Byte>
bool IsUnreadable(const Plane<Byte>& plane) {
    if (plane.IsEmpty()) return false;
    return plane.pixels == nullptr || (plane.height > 1 && std::abs(plane.rowBytes) < plane.width);
}

/// In the order Y, U, V.
template <class Byte>
using Planes = std::array<Plane<Byte>, 3>;

using SourcePlanes = Planes<const uint8_t>;
using DestinationPlanes = Planes<uint8_t>;

/// The planes that a caller hands over for an image of width x height pixels, neither negative.
template <class Byte, class Pointer>
Planes<Byte> PlanesOf(Pointer* const pointers[3], const int32_t rowBytes[3], int32_t width, int32_t height,
                      Chroma chroma) {
    const int32_t chromaWidth = width / 2 + (chroma == Chroma::k422 ? width % 2 : 0);
    const int32_t chromaHeight = chroma == Chroma::k420 ? height / 2 : height;
    return {{{static_cast<Byte*>(pointers[0]), rowBytes[0], width, height},
             {static_cast<Byte*>(pointers[1]), rowBytes[1], chromaWidth, chromaHeight},
             {static_cast<Byte*>(pointers[2]), rowBytes[2], chromaWidth, chromaHeight}}};
}

/// The planes of a 4:2:0 image that lies in one block, as PK_GetPlanarBuffers tells them.
template <class Byte>
Planes<Byte> PlanesInBlock(Byte* block, PK_PixelFormat format, int32_t width, int32_t height) {
    void* pointers[3] = {};
    int32_t rowBytes[3] = {};
    PK_GetPlanarBuffers(const_cast<std::remove_const_t<Byte>*>(block), format, width, height, pointers,
                        rowBytes);
    return PlanesOf<Byte>(pointers, rowBytes, width, height, Chroma::k420);
}

} // namespace PK
