// Samples by the weights of two tables. Where all columns lie in the same rows, these are added up first, once for many
// columns; else each pixel adds up its own.

#include "geometry/MotionWalk.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kPhases = 128, kMostTaps = 20, kPixelFloats = 4, kPixelBytes = 16;
// Taps that are added up side by side, in an order that no vector's width changes.
constexpr int32_t kTogether = 4;
constexpr int32_t kVectors = kTogether * kPixelFloats / kLanes;

/// The weights of an axis as floats, which show all of them.
class Weights {
public:
    explicit Weights(const ResampleTable& table) : fTaps(table.width < 1 ? 0 : table.width) {
        for (int32_t i = 0; i < kPhases * fTaps; i += kLanes)
            Store(fWeights + i, ToFloat(LoadSignedWords(table.weights + i)));
    }

    int32_t Taps() const { return fTaps; }
    const float* Phase(int32_t phase) const { return fWeights + phase * fTaps; }

private:
    int32_t fTaps;
    alignas(64) float fWeights[kPhases * kMostTaps];
};

/// The first pixel that a place takes along an axis, and its row of weights.
struct Reach {
    Reach(float place, int32_t low, int32_t high, int32_t taps) {
        // Beyond these bounds no tap meets the source; not-a-number becomes the upper one.
        const float least = static_cast<float>(low - kMostTaps), most = static_cast<float>(high + kMostTaps);
        float x = place - 0.5f;
        x = x < most ? x : most;
        x = x > least ? x : least;
        const auto whole = static_cast<int32_t>(x);
        const int32_t pixel = whole - (static_cast<float>(whole) > x ? 1 : 0);
        const auto rounded = static_cast<int32_t>((x - static_cast<float>(pixel)) * kPhases);
        phase = rounded < kPhases ? rounded : kPhases - 1; // just below a pixel the difference rounds to 1
        first = pixel + 1 - taps / 2;
    }

    int32_t first, phase;
};

inline F32 Zero() {
    return Floats(0);
}

struct TapSums {
    F32 sums[kVectors];

    TapSums() {
        for (F32& sum : sums) sum = Zero();
    }

    void AddFour(const float* pixels, const float* weights) {
        for (int32_t i = 0; i < kVectors; ++i)
            sums[i] = sums[i] +
                      LoadFloats(pixels + i * kLanes) * LoadOnePerBlock(weights + i * kLanes / kPixelFloats);
    }

    F32 Total() const {
        if constexpr (kVectors == 4)
            return (sums[0] + sums[2]) + (sums[1] + sums[3]);
        else if constexpr (kVectors == 2)
            return SumOfBlocks(sums[0] + sums[1]);
        else
            return SumOfBlocks(sums[0]);
    }
};

/// The sum of pixels side by side by their weights, in the first block.
inline F32 SumOfTaps(const float* pixels, const float* weights, int32_t taps) {
    TapSums sums;
    int32_t tap = 0;
    for (; tap + kTogether <= taps; tap += kTogether)
        sums.AddFour(pixels + tap * kPixelFloats, weights + tap);
    if (tap < taps) {
        alignas(64) float lastPixels[kTogether * kPixelFloats] = {};
        float lastWeights[kTogether] = {};
        const auto left = static_cast<size_t>(taps - tap);
        std::memcpy(lastPixels, pixels + tap * kPixelFloats, left * kPixelBytes);
        std::memcpy(lastWeights, weights + tap, left * sizeof(float));
        sums.AddFour(lastPixels, lastWeights);
    }
    return sums.Total();
}

template <AlphaPlace kAlpha>
struct HighQuality {
    static constexpr int32_t kMargin = 6;

    explicit HighQuality(const MotionRow& from) : row(from), weightsX(from.kernelX), weightsY(from.kernelY) {}

    void Edge(const Places& places, int32_t count, float* out) const { Sample(places, count, out); }
    void Inside(const Places& places, int32_t count, float* out) const { Sample(places, count, out); }

    /// What lies outside the source is left out, at the edges and inside, where a wide table reaches beyond the margin.
    void Sample(const Places& places, int32_t count, float* out) const {
        int32_t first[kBlock], phases[kBlock];
        int32_t least = INT32_MAX, most = INT32_MIN;
        for (int32_t i = 0; i < count; ++i) {
            const Reach reach(places.x[i], row.left, row.right, weightsX.Taps());
            first[i] = reach.first;
            phases[i] = reach.phase;
            least = reach.first < least ? reach.first : least;
            most = reach.first > most ? reach.first : most;
        }
        const int64_t width = int64_t{most} - least + weightsX.Taps();
        // Adding up rows pays as long as the columns between the pixels' own are not too many.
        const bool sharesRows = !row.rotated && width <= int64_t{count} * weightsX.Taps();
        if (!sharesRows) {
            for (int32_t i = 0; i < count; ++i)
                Put(out + 4 * i,
                    SumOfArea(first[i], phases[i], Reach(places.y[i], row.top, row.bottom, weightsY.Taps())));
            return;
        }
        alignas(64) float sums[kBlock * kMostTaps * kPixelFloats];
        AddRows(Reach(places.y[0], row.top, row.bottom, weightsY.Taps()), least, static_cast<int32_t>(width),
                sums);
        for (int32_t i = 0; i < count; ++i)
            Put(out + 4 * i, SumOfTaps(sums + int64_t{first[i] - least} * kPixelFloats,
                                       weightsX.Phase(phases[i]), weightsX.Taps()));
    }

    const float* PixelAt(int32_t column, int32_t line) const {
        return reinterpret_cast<const float*>(row.pixels + line * row.rowBytes +
                                              int64_t{column} * kPixelBytes);
    }

    /// Those of the columns from `first` on that lie in the source: some in the middle, or none.
    struct Overlap {
        Overlap(const MotionRow& of, int32_t first, int32_t width)
            : begin(Within(of.left - first, width)), end(Within(of.right - first, width)) {}
        static int32_t Within(int32_t x, int32_t width) { return x < 0 ? 0 : x < width ? x : width; }

        int32_t begin, end;
    };

    /// Rows by their weights, for `width` columns from `first` on; 0 outside the source.
    void AddRows(const Reach& rows, int32_t first, int32_t width, float* sums) const {
        const Overlap inside(row, first, width);
        const float* sources[kMostTaps];
        F32 weights[kMostTaps];
        int32_t count = 0;
        for (int32_t tap = 0; tap < weightsY.Taps() && inside.begin < inside.end; ++tap) {
            const int32_t line = rows.first + tap;
            if (line < row.top || line >= row.bottom) continue;
            sources[count] = PixelAt(first + inside.begin, line);
            weights[count++] = Floats(weightsY.Phase(rows.phase)[tap]);
        }
        const int32_t begin = inside.begin * kPixelFloats, end = inside.end * kPixelFloats;
        std::memset(sums, 0, sizeof(float) * static_cast<size_t>(begin));
        int32_t at = begin;
        for (; at + kLanes <= end; at += kLanes) {
            F32 sum = Zero();
            for (int32_t i = 0; i < count; ++i)
                sum = sum + LoadFloats(sources[i] + (at - begin)) * weights[i];
            Store(sums + at, sum);
        }
        if (at < end) { // less than a vector is left of each row
            const auto bytes = sizeof(float) * static_cast<size_t>(end - at);
            alignas(64) float last[kLanes] = {};
            F32 sum = Zero();
            for (int32_t i = 0; i < count; ++i) {
                std::memcpy(last, sources[i] + (at - begin), bytes);
                sum = sum + LoadFloats(last) * weights[i];
            }
            Store(last, sum);
            std::memcpy(sums + at, last, bytes);
        }
        const int32_t behind = inside.end < inside.begin ? inside.begin : inside.end;
        std::memset(sums + behind * kPixelFloats, 0, static_cast<size_t>(width - behind) * kPixelBytes);
    }

    /// An area of its own for one pixel.
    F32 SumOfArea(int32_t first, int32_t phase, const Reach& rows) const {
        const int32_t taps = weightsX.Taps();
        const Overlap inside(row, first, taps);
        const float* const weights = weightsX.Phase(phase);
        F32 sum = Zero();
        for (int32_t tap = 0; tap < weightsY.Taps() && inside.begin < inside.end; ++tap) {
            const int32_t line = rows.first + tap;
            if (line < row.top || line >= row.bottom) continue;
            F32 ofRow;
            if (inside.end - inside.begin == taps) {
                ofRow = SumOfTaps(PixelAt(first, line), weights, taps);
            } else {
                alignas(64) float pixels[kMostTaps * kPixelFloats] = {};
                std::memcpy(pixels + inside.begin * kPixelFloats, PixelAt(first + inside.begin, line),
                            static_cast<size_t>(inside.end - inside.begin) * kPixelBytes);
                ofRow = SumOfTaps(pixels, weights, taps);
            }
            sum = sum + ofRow * Floats(weightsY.Phase(rows.phase)[tap]);
        }
        return sum;
    }

    /// Alpha is limited to 0 to 1, not-a-number becoming 0; colours may be negative.
    static void Put(float* out, F32 sum) {
        F32 pixel = sum * Floats(0x1p-28f); // two weights of 1
        if constexpr (kAlpha == AlphaPlace::first) pixel = ShufflePixel<3, 2, 1, 0>(pixel);
        const F32 limited = Min(Max(pixel, Zero()), Floats(1));
        StoreFirstBlock(out, BlendBlocks<8>(limited, pixel));
    }

    const MotionRow row;
    const Weights weightsX, weightsY;
};

constexpr MotionResampleKernels kKernels = {SampleRow<HighQuality<AlphaPlace::last>>,
                                            SampleRow<HighQuality<AlphaPlace::first>>};

} // namespace
} // namespace PK::PK_TARGET

namespace PK {

template <>
const MotionResampleKernels& MotionResampleKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
