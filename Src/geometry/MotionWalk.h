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

/// Goes along a row in blocks, which are given to use(columns) one after the other, their places in `places`.
class RowWalk {
public:
    RowWalk(const MotionRow& row, int32_t first)
        : fX{row.x, row.stepX}, fY{row.y, row.rotated ? row.stepY : 0}, fIsTurned(row.rotated) {
        Skip(first);
    }

    void Skip(int32_t columns) {
        fX.Skip(columns);
        fY.Skip(columns);
    }

    template <class Use>
    void OneByOne(int32_t columns, Use use) {
        InBlocks(columns, [&](int32_t count) {
            fX.OneByOne(places.x, count);
            fY.OneByOne(places.y, count);
            use(count);
        });
    }

    template <class Use>
    void ByFours(int32_t columns, Use use) {
        PK_TARGET::ByFours x(fX), y(fY);
        InBlocks(columns, [&](int32_t count) {
            x.Take(places.x, count);
            if (fIsTurned) y.Take(places.y, count);
            use(count);
        });
        Skip(columns);
    }

    Places places;

private:
    template <class Use>
    static void InBlocks(int32_t count, Use use) {
        for (; count > 0; count -= kBlock) use(count < kBlock ? count : kBlock);
    }

    Axis fX, fY;
    bool fIsTurned;
};

/// Less than a group of pixels, or than a vector of interleaved ones; to a line of any alignment.
inline void StoreSome(void* out, const Channels& pixels, int32_t count) {
    alignas(64) float scratch[4 * kLanes];
    StoreFloatChannels(scratch, pixels);
    std::memcpy(out, scratch, sizeof(float) * 4 * static_cast<size_t>(count));
}
inline void StoreSome(void* out, F32 pixels, int32_t count) {
    alignas(64) float scratch[kLanes];
    Store(scratch, pixels);
    std::memcpy(out, scratch, sizeof(float) * 4 * static_cast<size_t>(count));
}

/// As many as there are.
[[gnu::always_inline]] inline void StorePixels(float* out, const Channels& pixels, int32_t count) {
    if (count >= kLanes)
        StoreFloatChannels(out, pixels);
    else
        StoreSome(out, pixels, count);
}
[[gnu::always_inline]] inline void StorePixels(float* out, F32 pixels, int32_t count) {
    if (count >= kVectorPixels)
        Store(out, pixels);
    else
        StoreSome(out, pixels, count);
}

inline I32 Floor(F32 x) {
    const I32 whole = Truncate(x);
    return whole + Less(x, ToFloat(whole));
}

/// The last of so many numbers once more up to the end of the group.
inline void FillGroup(int32_t* numbers, int32_t count) {
    for (int32_t i = count; i % kLanes != 0; ++i) numbers[i] = numbers[count - 1];
}

/// Whether, of so many numbers in whole groups, those for the pixels of each vector are at least the first and no more
/// than its width above it.
inline bool AreNear(const int32_t* numbers, int32_t count) {
    I32 far = Ints(0);
    for (int32_t n = 0; n < count; n += kVectorPixels)
        far = far | (LoadOneIntPerBlock(numbers + n) - Ints(numbers[n]));
    return !AnyNegative(Ints(kVectorPixels - 1) - far) && !AnyNegative(far);
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

inline bool AreEqual(const MotionParts& a, const MotionParts& b) {
    return a.first == b.first && a.inner == b.inner && a.right == b.right && a.end == b.end;
}

/// A sampler has kMargin and makes pixels of places: Edge(places, count, out), Inside(places, count, out). Of a row that is
/// not turned it finds the columns, Locate(places, pixels, weights, count), and makes pixels of them: Level(columns from
/// the first that were found, count, out); of those inside, or at the edges too if it kFindsEdges.
template <class Sampler>
class RowSampler {
public:
    RowSampler(const MotionRow& row, const MotionParts& parts, float* line)
        : fRow(row), fParts(parts), fSampler(row), fWalk(row, parts.first),
          fOut(line + 4 * int64_t{parts.first}) {}

    void Run() {
        const int32_t left = fParts.inner - fParts.first, inside = fParts.right - fParts.inner,
                      right = fParts.end - fParts.right;
        if (fRow.rotated) {
            Edge(left);
            fWalk.ByFours(inside, [&](int32_t count) {
                fSampler.Inside(fWalk.places, count, fOut);
                fOut += 4 * count;
            });
            Edge(right);
        } else if constexpr (Sampler::kFindsEdges) {
            if (!AreEqual(fRow.shared->parts, fParts)) Locate(left, inside, right);
            fSampler.Level(left + inside + right, fOut);
        } else {
            Edge(left);
            if (!AreEqual(fRow.shared->parts, fParts)) Locate(0, inside, 0);
            fSampler.Level(inside, fOut);
            fOut += int64_t{4} * inside;
            fWalk.Skip(inside);
            Edge(right);
        }
    }

private:
    void Edge(int32_t columns) {
        fWalk.OneByOne(columns, [&](int32_t count) {
            fSampler.Edge(fWalk.places, count, fOut);
            fOut += 4 * count;
        });
    }

    void Locate(int32_t left, int32_t inside, int32_t right) {
        MotionColumns& shared = *fRow.shared;
        RowWalk walk = fWalk;
        int32_t found = 0;
        const auto locate = [&](int32_t count) {
            fSampler.Locate(walk.places.x, shared.pixels + found, shared.weights + found, count);
            found += count;
        };
        walk.OneByOne(left, locate);
        walk.ByFours(inside, locate);
        walk.OneByOne(right, locate);
        FillGroup(shared.pixels, found);
        FillGroup(shared.weights, found);
        shared.areNear = AreNear(shared.pixels, found);
        shared.parts = fParts;
    }

    const MotionRow& fRow;
    const MotionParts& fParts;
    const Sampler fSampler;
    RowWalk fWalk;
    float* fOut;
};

template <class Sampler>
MotionSpan SampleRow(const MotionRow& row, float* line) {
    const MotionParts parts = PartsOfRow(row, Sampler::kMargin);
    const MotionSpan span = {parts.first, parts.end - parts.first};
    if (span.count > 0) RowSampler<Sampler>(row, parts, line).Run();
    return span;
}

} // namespace PK::PK_TARGET
