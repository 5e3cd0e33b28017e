#pragma once

// The planes of a peer that works on planar pictures.

#include "frames/Image.h"
#include "frames/RandomSamples.h"

#include <memory>
#include <vector>

namespace FrameBench {

/// Planes of the frame's height, of samples that are 0 until they are filled.
class Planes {
public:
    Planes(int count, int32_t rowBytes) {
        for (int i = 0; i < count; ++i) fPlanes.push_back(Allocate(static_cast<size_t>(rowBytes) * kHeight));
    }

    uint8_t* Plane(int index) const { return fPlanes[static_cast<size_t>(index)].get(); }

    /// Random samples in all planes, from `low` up to, but not at, `high`.
    template <class Sample>
    void Fill(int32_t samplesInRow, float low, float high) {
        std::mt19937 random(1);
        for (const Bytes& plane : fPlanes)
            FillRandom(random, reinterpret_cast<Sample*>(plane.get()),
                       static_cast<size_t>(samplesInRow) * kHeight, low, high);
    }

private:
    std::vector<Bytes> fPlanes;
};

} // namespace FrameBench
