#pragma once

// Three planes, each an image of its own.

#include "results/Image.h"

#include <array>

namespace PKResults {

class PlaneImages {
public:
    /// Luma of so many bytes a row, and two planes of chroma.
    PlaneImages(size_t lumaLength, int32_t lumaRows, size_t chromaLength, int32_t chromaRows,
                const Walk& walk, Random& random)
        : fPlanes{Image(lumaLength, lumaRows, walk, random), Image(chromaLength, chromaRows, walk, random),
                  Image(chromaLength, chromaRows, walk, random)} {}

    std::array<const void*, 3> Sources() { return {Plane(0).First(), Plane(1).First(), Plane(2).First()}; }
    std::array<void*, 3> Destinations() { return {Plane(0).First(), Plane(1).First(), Plane(2).First()}; }
    std::array<int32_t, 3> Steps() { return {Plane(0).Step(), Plane(1).Step(), Plane(2).Step()}; }
    Image& Plane(size_t which) { return fPlanes[which]; }

    void AddTo(Digest& results) const {
        for (const Image& plane : fPlanes) plane.AddTo(results);
    }

private:
    std::array<Image, 3> fPlanes;
};

} // namespace PKResults
