#pragma once

// The walk of motion's kernels along a row: the places of its columns, block by block. Kernel sources include this header.

#include "geometry/MotionSampleKernels.h"
#include "primitives/lanes/PixelLanes.h"

namespace PK::PK_TARGET {

inline constexpr int32_t kBlock = 128;               // columns; whole groups of any target
inline constexpr int32_t kVectorPixels = kLanes / 4; // of interleaved floats

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
    fourY.Take(places.y, kBlock);
    InBlocks(parts.right - parts.inner, [&](int32_t count) {
        fourX.Take(places.x, count);
        sampler.Inside(places, count, out);
        if (row.rotated) fourY.Take(places.y, kBlock);
        out += 4 * count;
    });
    x.Skip(parts.right - parts.inner);
    y.Skip(parts.right - parts.inner);
    sampleEdge(parts.end - parts.right);
    return span;
}

/// As many pixels of a group as there are.
[[gnu::always_inline]] inline void StorePixels(float* out, const Channels& pixels, int32_t count) {
    if (count >= kLanes) return StoreFloatChannels(out, pixels);
    alignas(64) float scratch[4 * kLanes];
    StoreFloatChannels(scratch, pixels);
    std::memcpy(out, scratch, sizeof(float) * 4 * static_cast<size_t>(count));
}

/// The same of a vector of interleaved pixels.
[[gnu::always_inline]] inline void StorePixels(float* out, F32 pixels, int32_t count) {
    if (count >= kVectorPixels) return Store(out, pixels);
    alignas(64) float scratch[kLanes];
    Store(scratch, pixels);
    std::memcpy(out, scratch, sizeof(float) * 4 * static_cast<size_t>(count));
}

inline I32 Floor(F32 x) {
    const I32 whole = Truncate(x);
    return whole + Less(x, ToFloat(whole));
}

/// The last of so many numbers once more up to the end of the group.
template <class Number>
inline void FillGroup(Number* numbers, int32_t count) {
    for (int32_t i = count; i % kLanes != 0; ++i) numbers[i] = numbers[count - 1];
}

/// From each group of four lanes the one that wins against the other three.
template <class Choose>
inline I32 BestOfGroups(I32 x, Choose choose) {
    const I32 pairs = choose(x, ShufflePixel<1, 0, 3, 2>(x));
    return choose(pairs, ShufflePixel<2, 3, 0, 1>(pairs));
}

struct Range {
    int32_t least, most;
};

/// Of so many numbers, one at least, in whole groups.
inline Range RangeOf(const int32_t* numbers, int32_t count) {
    I32 least = LoadInts(numbers), most = least;
    for (int32_t i = kLanes; i < count; i += kLanes) {
        const I32 group = LoadInts(numbers + i);
        least = Min(least, group);
        most = Max(most, group);
    }
    int32_t leasts[kLanes], mosts[kLanes];
    Store(leasts, BestOfGroups(least, [](I32 a, I32 b) { return Min(a, b); }));
    Store(mosts, BestOfGroups(most, [](I32 a, I32 b) { return Max(a, b); }));
    Range range = {leasts[0], mosts[0]};
    for (int32_t i = 4; i < kLanes; i += 4) {
        if (leasts[i] < range.least) range.least = leasts[i];
        if (mosts[i] > range.most) range.most = mosts[i];
    }
    return range;
}

/// Goes over the floats of interleaved pixels by vectors: use(first float). The last vector may have some of the one
/// before it, so that none goes beyond the end. There is a vector's worth at least.
template <class Use>
inline void ByVectors(int32_t floats, Use use) {
    int32_t at = 0;
    for (; at + kLanes <= floats; at += kLanes) use(at);
    if (at < floats) use(floats - kLanes);
}

} // namespace PK::PK_TARGET
