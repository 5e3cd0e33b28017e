#pragma once

// The planes of a peer that works on planar pictures.

#include "frames/Image.h"
#include "frames/RandomSamples.h"

#include <memory>
#include <vector>

namespace FrameBench {

/// Planes of samples that are 0 until they are filled.
class Planes {
public:
    Planes(int count, int32_t rowBytes, int32_t height) : fHeight(static_cast<size_t>(height)) {
        for (int i = 0; i < count; ++i) fPlanes.push_back(Allocate(static_cast<size_t>(rowBytes) * fHeight));
    }

    uint8_t* Plane(int index) const { return fPlanes[static_cast<size_t>(index)].get(); }

    /// Random samples in all planes, from `low` up to, but not at, `high`.
    template <class Sample>
    void Fill(int32_t samplesInRow, float low, float high) {
        std::mt19937 random(1);
        for (const Bytes& plane : fPlanes)
            FillRandom(random, reinterpret_cast<Sample*>(plane.get()),
                       static_cast<size_t>(samplesInRow) * fHeight, low, high);
    }

private:
    size_t fHeight;
    std::vector<Bytes> fPlanes;
};

} // namespace FrameBench
