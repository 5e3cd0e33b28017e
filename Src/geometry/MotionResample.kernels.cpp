// Samples by the weights of two tables. Where all columns lie in the same rows, these are added up first, once for many
// columns; else each pixel adds up its own.

#include "geometry/MotionWalk.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kPhases = 128, kMostTaps = 20, kPixelFloats = 4, kPixelBytes = 16;
// Taps that are added up side by side, in an order that no vector's width changes.
constexpr int32_t kTogether = 4;
constexpr int32_t kVectors = kTogether / kVectorPixels;

/// The weights of an axis as floats, which show all of them.
class Weights {
public:
    explicit Weights(const ResampleTable& table) : fTaps(table.width < 1 ? 0 : table.width) {
        for (int32_t i = 0; i < kPhases * fTaps; i += kLanes)
            Store(fWeights + i, ToFloat(LoadSignedWords(table.weights + i)));
        std::memset(fWeights + kPhases * fTaps, 0, sizeof(float) * kTogether);
    }

    int32_t Taps() const { return fTaps; }
    /// Behind the weights of a phase, as many as are loaded together may be read.
    const float* Phase(int32_t phase) const { return fWeights + phase * fTaps; }

private:
    int32_t fTaps;
    alignas(64) float fWeights[kPhases * kMostTaps + kTogether];
};

/// The first pixels that places take along an axis, and their rows of weights.
struct Reach {
    Reach(const float* places, int32_t low, int32_t high, int32_t taps) {
        // Beyond these bounds no tap meets the source; not-a-number becomes the upper one.
        const F32 least = Floats(static_cast<float>(low - kMostTaps));
        const F32 most = Floats(static_cast<float>(high + kMostTaps));
        const F32 x = Max(Min(LoadFloats(places) - Floats(0.5f), most), least);
        const I32 pixel = Floor(x);
        // Just below a pixel the difference rounds to 1.
        phase = Min(Truncate((x - ToFloat(pixel)) * Floats(kPhases)), Ints(kPhases - 1));
        first = pixel + Ints(1 - taps / 2);
    }

    I32 first, phase;
};

/// Those of a block of places.
struct Reaches {
    Reaches(const float* places, int32_t count, int32_t low, int32_t high, int32_t taps) {
        for (int32_t i = 0; i < count; i += kLanes) {
            const Reach reach(places + i, low, high, taps);
            Store(first + i, reach.first);
            Store(phase + i, reach.phase);
        }
        FillGroup(first, count);
        FillGroup(phase, count);
    }

    alignas(64) int32_t first[kBlock], phase[kBlock];
};

inline F32 Zero() {
    return Floats(0);
}

/// Pixels by weights, added up by the number of their tap modulo four.
struct TapSums {
    F32 sums[kVectors];

    TapSums() {
        for (F32& sum : sums) sum = Zero();
    }

    /// Taps come in pairs. kTaps is their number where it is known.
    template <int32_t kTaps>
    [[gnu::always_inline]] void Add(const float* pixels, const float* weights, int32_t taps) {
        if constexpr (kTaps > 0) {
            AddFrom<0, kTaps>(pixels, weights);
        } else {
            int32_t tap = 0;
            for (; tap + kTogether <= taps; tap += kTogether) AddGroup(pixels, weights, tap);
            if (tap < taps) AddPair(pixels, weights, tap);
        }
    }

    /// The sums of a row by its weight.
    [[gnu::always_inline]] void Add(const TapSums& row, F32 weight) {
        for (int32_t i = 0; i < kVectors; ++i) sums[i] = sums[i] + row.sums[i] * weight;
    }

    /// A vector whose blocks add up to the total.
    F32 Total() const {
        if constexpr (kVectors == 4)
            return (sums[0] + sums[2]) + (sums[1] + sums[3]);
        else if constexpr (kVectors == 2)
            return sums[0] + sums[1];
        else
            return sums[0];
    }

private:
    template <int32_t kTap, int32_t kTaps>
    [[gnu::always_inline]] void AddFrom(const float* pixels, const float* weights) {
        if constexpr (kTap + kTogether <= kTaps) {
            AddGroup(pixels, weights, kTap);
            AddFrom<kTap + kTogether, kTaps>(pixels, weights);
        } else if constexpr (kTap < kTaps) {
            AddPair(pixels, weights, kTap);
        }
    }

    [[gnu::always_inline]] void AddGroup(const float* pixels, const float* weights, int32_t tap) {
        for (int32_t i = 0; i < kVectors; ++i)
            AddVector(i, LoadFloats(pixels + tap * kPixelFloats + i * kLanes), weights + tap);
    }

    [[gnu::always_inline]] void AddPair(const float* pixels, const float* weights, int32_t tap) {
        constexpr int32_t kPair = 2, kPairVectors = kVectors == 1 ? 1 : kVectors / 2;
        for (int32_t i = 0; i < kPairVectors; ++i)
            AddVector(i, LoadFirstBlocks<kPair>(pixels + tap * kPixelFloats + i * kLanes), weights + tap);
    }

    [[gnu::always_inline]] void AddVector(int32_t i, F32 pixels, const float* weights) {
        sums[i] = sums[i] + pixels * LoadOnePerBlock(weights + i * kVectorPixels);
    }
};

template <AlphaPlace kAlpha>
struct HighQuality {
    static constexpr int32_t kMargin = 6;

    explicit HighQuality(const MotionRow& from) : row(from), weightsX(from.kernelX), weightsY(from.kernelY) {}

    void Edge(const Places& places, int32_t count, float* out) const { Inside(places, count, out); }

    /// What lies outside the source is left out, at the edges and inside, where a wide table reaches beyond the margin.
    void Inside(const Places& places, int32_t count, float* out) const {
        const Reaches x(places.x, count, row.left, row.right, weightsX.Taps());
        const Reaches y(places.y, count, row.top, row.bottom, weightsY.Taps());
        WithTaps([&]<int32_t kTaps>() {
            Put(count, out,
                [&](int32_t i) { return SumOfArea<kTaps>(x.first[i], x.phase[i], y.first[i], y.phase[i]); });
        });
    }

    /// Calls use with the number of taps if it is one of those that tables mostly have, else with 0.
    template <class Use>
    void WithTaps(Use use) const {
        switch (weightsX.Taps()) {
        case 4: // whatever gets larger
            return use.template operator()<4>();
        case 6:
            return use.template operator()<6>();
        case 8: // at half the size
            return use.template operator()<8>();
        default:
            return use.template operator()<0>();
        }
    }

    static constexpr bool kFindsEdges = true;

    void Locate(const float* places, int32_t* pixels, int32_t* phases, int32_t count) const {
        for (int32_t i = 0; i < count; i += kLanes) {
            const Reach reach(places + i, row.left, row.right, weightsX.Taps());
            Store(pixels + i, reach.first);
            Store(phases + i, reach.phase);
        }
    }

    /// Where all places lie in the same rows, these are added up first, once for many columns. That does not pay where
    /// there are too many columns of the source between two of the destination.
    void Level(int32_t columns, float* out) const {
        float y[kLanes];
        Store(y, Floats(row.y));
        const Reaches rows(y, 1, row.top, row.bottom, weightsY.Taps());
        for (int32_t begin = 0; begin < columns; begin += kBlock) {
            const int32_t count = columns - begin < kBlock ? columns - begin : kBlock;
            const int32_t* const pixels = row.shared->pixels + begin;
            const int32_t* const phases = row.shared->weights + begin;
            const Range range = RangeOf(pixels, count);
            float* const to = out + int64_t{kPixelFloats} * begin;
            if (int64_t{range.most} - range.least + kMostTaps <= kMostColumns)
                SumRows(rows.first[0], rows.phase[0], range, pixels, phases, count, to);
            else
                Put(count, to, [&](int32_t i) {
                    return SumOfArea<0>(pixels[i], phases[i], rows.first[0], rows.phase[0]);
                });
        }
    }

    // At a quarter of the size, the least that has a table of its own, it is a little more than four.
    static constexpr int32_t kMostColumns = 5 * kBlock;

    void SumRows(int32_t firstLine, int32_t phase, const Range& range, const int32_t* pixels,
                 const int32_t* phases, int32_t count, float* out) const {
        alignas(64) float sums[kMostColumns * kPixelFloats];
        AddRows(firstLine, phase, range.least, range.most - range.least + weightsX.Taps(), sums);
        WithTaps([&]<int32_t kTaps>() {
            Put(count, out, [&](int32_t i) {
                TapSums taps;
                taps.Add<kTaps>(sums + int64_t{pixels[i] - range.least} * kPixelFloats,
                                weightsX.Phase(phases[i]), weightsX.Taps());
                return taps.Total();
            });
        });
    }

    /// Not aligned for floats.
    const uint8_t* PixelAt(int32_t column, int32_t line) const {
        return row.pixels + line * row.rowBytes + int64_t{column} * kPixelBytes;
    }

    /// Those of the columns from `first` on that lie in the source: some in the middle, or none.
    struct Overlap {
        Overlap(const MotionRow& of, int32_t first, int32_t width)
            : begin(Within(of.left - first, width)), end(Within(of.right - first, width)) {}
        static int32_t Within(int32_t x, int32_t width) { return x < 0 ? 0 : x < width ? x : width; }

        int32_t begin, end;
    };

    /// Rows by their weights, for `width` columns from `first` on; 0 outside the source.
    void AddRows(int32_t firstLine, int32_t phase, int32_t first, int32_t width, float* sums) const {
        const Overlap inside(row, first, width);
        const uint8_t* sources[kMostTaps];
        F32 weights[kMostTaps];
        int32_t count = 0;
        for (int32_t tap = 0; tap < weightsY.Taps() && inside.begin < inside.end; ++tap) {
            const int32_t line = firstLine + tap;
            if (line < row.top || line >= row.bottom) continue;
            sources[count] = PixelAt(first + inside.begin, line);
            weights[count++] = Floats(weightsY.Phase(phase)[tap]);
        }
        const int32_t begin = inside.begin * kPixelFloats, end = inside.end * kPixelFloats;
        std::memset(sums, 0, sizeof(float) * static_cast<size_t>(begin));
        if (end - begin >= kLanes)
            ByVectors(end - begin, [&](int32_t at) {
                F32 sum = Zero();
                for (int32_t i = 0; i < count; ++i)
                    sum = sum + LoadFloats(sources[i] + sizeof(float) * static_cast<size_t>(at)) * weights[i];
                Store(sums + begin + at, sum);
            });
        else
            AddShortRows(sources, weights, count, sums + begin, end - begin);
        const int32_t behind = inside.end < inside.begin ? inside.begin : inside.end;
        std::memset(sums + behind * kPixelFloats, 0, static_cast<size_t>(width - behind) * kPixelBytes);
    }

    /// Less than a vector of each, if anything.
    static void AddShortRows(const uint8_t* const* sources, const F32* weights, int32_t count, float* sums,
                             int32_t floats) {
        const size_t bytes = floats > 0 ? sizeof(float) * static_cast<size_t>(floats) : 0;
        alignas(64) float last[kLanes] = {};
        F32 sum = Zero();
        for (int32_t i = 0; i < count; ++i) {
            std::memcpy(last, sources[i], bytes);
            sum = sum + LoadFloats(last) * weights[i];
        }
        Store(last, sum);
        std::memcpy(sums, last, bytes);
    }

    /// An area of its own for one pixel: a vector whose blocks add up to it.
    template <int32_t kTaps>
    [[gnu::always_inline]] F32 SumOfArea(int32_t first, int32_t phase, int32_t firstLine,
                                         int32_t phaseOfLines) const {
        const int32_t taps = weightsX.Taps();
        const float* const weights = weightsX.Phase(phase);
        const float* const weightsOfLines = weightsY.Phase(phaseOfLines);
        const int32_t begin = firstLine < row.top ? row.top - firstLine : 0;
        const int32_t end =
            row.bottom - firstLine < weightsY.Taps() ? row.bottom - firstLine : weightsY.Taps();
        if (first < row.left || first + taps > row.right)
            return SumOfPart(first, weights, firstLine, weightsOfLines, begin, end);
        TapSums sum;
        const uint8_t* pixels = PixelAt(first, firstLine + begin);
        for (int32_t tap = begin; tap < end; ++tap, pixels += row.rowBytes) {
            TapSums ofRow;
            ofRow.Add<kTaps>(reinterpret_cast<const float*>(pixels), weights, taps);
            sum.Add(ofRow, Floats(weightsOfLines[tap]));
        }
        return sum.Total();
    }

    /// The same of an area that has columns outside the source, or all.
    [[gnu::noinline]] F32 SumOfPart(int32_t first, const float* weights, int32_t firstLine,
                                    const float* weightsOfLines, int32_t begin, int32_t end) const {
        const Overlap inside(row, first, weightsX.Taps());
        TapSums sum;
        for (int32_t tap = begin; tap < end && inside.begin < inside.end; ++tap) {
            alignas(64) float pixels[kMostTaps * kPixelFloats] = {};
            std::memcpy(pixels + inside.begin * kPixelFloats, PixelAt(first + inside.begin, firstLine + tap),
                        static_cast<size_t>(inside.end - inside.begin) * kPixelBytes);
            TapSums ofRow;
            ofRow.Add<0>(pixels, weights, weightsX.Taps());
            sum.Add(ofRow, Floats(weightsOfLines[tap]));
        }
        return sum.Total();
    }

    /// total(column) is a vector whose blocks add up to its pixel. Alpha is limited to 0 to 1, not-a-number becoming 0;
    /// colours may be negative.
    template <class Total>
    static void Put(int32_t count, float* out, Total total) {
        for (int32_t n = 0; n < count; n += kVectorPixels) {
            F32 totals[kVectorPixels];
            for (int32_t i = 0; i < kVectorPixels; ++i) totals[i] = total(n + i);
            F32 pixels = SumsOfBlocks(totals) * Floats(0x1p-28f); // two weights of 1
            if constexpr (kAlpha == AlphaPlace::first) pixels = ShufflePixel<3, 2, 1, 0>(pixels);
            const F32 limited = Min(Max(pixels, Zero()), Floats(1));
            StorePixels(out + kPixelFloats * n, BlendBlocks<8>(limited, pixels), count - n);
        }
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
