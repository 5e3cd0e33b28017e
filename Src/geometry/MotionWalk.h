#pragma once

// The walk of motion's kernels along a row: the places of its columns, block by block. Kernel sources include this header.

#include "geometry/MotionSampleKernels.h"
#include "primitives/lanes/PixelLanes.h"

namespace PK::PK_TARGET {

inline constexpr int32_t kBlock = 64; // whole groups of any target

/// Of as many columns as are asked for, and up to the end of their last group some that do no harm.
struct Places {
    alignas(64) float x[kBlock], y[kBlock];
};

/// One coordinate on its way.
struct Axis {
    float at, step;

    /// The step is added column by column.
    void OneByOne(float* places, int32_t count) {
        for (int32_t i = 0; i < count; ++i, at += step) places[i] = at;
        for (int32_t i = count; i % kLanes != 0; ++i) places[i] = places[count - 1];
    }

    void Skip(int32_t columns) { at += step * static_cast<float>(columns); }
};

/// The same with four columns at a time: each of the first four is at + k x step, and every further one four steps from
/// the fourth before it.
class ByFours {
public:
    explicit ByFours(Axis axis) : fFourSteps(Floats(axis.step * 4)) {
        float first[kLanes];
        for (int32_t i = 0; i < kLanes; ++i)
            first[i] = i < 4 ? axis.at + axis.step * static_cast<float>(i) : first[i - 4] + axis.step * 4;
        fGroup = LoadFloats(first);
    }

    void Take(float* places, int32_t count) {
        for (int32_t i = 0; i < count; i += kLanes) {
            Store(places + i, fGroup);
            for (int32_t four = 0; four < kLanes; four += 4) fGroup = fGroup + fFourSteps;
        }
    }

private:
    F32 fGroup, fFourSteps;
};

/// Goes over count columns in blocks: use(columns of the block).
template <class Use>
void InBlocks(int32_t count, Use use) {
    for (; count > 0; count -= kBlock) use(count < kBlock ? count : kBlock);
}

/// A sampler has kMargin, and makes pixels of places: Edge(places, count, out), Inside(places, count, out).
template <class Sampler>
MotionSpan SampleRow(const MotionRow& row, float* line) {
    const MotionParts parts = PartsOfRow(row, Sampler::kMargin);
    const MotionSpan span = {parts.first, parts.end - parts.first};
    if (span.count < 1) return span;
    const Sampler sampler(row);
    Axis x = {row.x, row.stepX}, y = {row.y, row.rotated ? row.stepY : 0};
    x.Skip(parts.first);
    y.Skip(parts.first);
    float* out = line + 4 * int64_t{parts.first};
    Places places;
    const auto sampleEdge = [&](int32_t columns) {
        InBlocks(columns, [&](int32_t count) {
            x.OneByOne(places.x, count);
            y.OneByOne(places.y, count);
            sampler.Edge(places, count, out);
            out += 4 * count;
        });
    };
    sampleEdge(parts.inner - parts.first);
    ByFours fourX(x), fourY(y);
    InBlocks(parts.right - parts.inner, [&](int32_t count) {
        fourX.Take(places.x, count);
        fourY.Take(places.y, count);
        sampler.Inside(places, count, out);
        out += 4 * count;
    });
    x.Skip(parts.right - parts.inner);
    y.Skip(parts.right - parts.inner);
    sampleEdge(parts.end - parts.right);
    return span;
}

/// As many pixels of a group as there are.
inline void StorePixels(float* out, const Channels& pixels, int32_t count) {
    if (count >= kLanes) return StoreFloatChannels(out, pixels);
    alignas(64) float scratch[4 * kLanes];
    StoreFloatChannels(scratch, pixels);
    std::memcpy(out, scratch, sizeof(float) * 4 * static_cast<size_t>(count));
}

} // namespace PK::PK_TARGET
