// Fills the spans of the quad warp: a walk along the span, a way of sampling and a rule of writing.

#include "geometry/WarpSpan.h"

#include "primitives/lanes/ByteScale.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

// The walk.

/// Source place and edge alpha of kLanes pixels.
struct Coordinates {
    F32 u, v, a;
};

/// u, v and a of one pixel, and their slopes.
struct Walk {
    explicit Walk(const WarpSpan& span)
        : place(PixelFloats(span.u, span.v, span.a, 0)), step(PixelFloats(span.du, span.dv, span.da, 0)) {}

    /// \param pixels  those left of the span, at least 1. The last one stands for lanes without a pixel, so
    ///                that nothing is read for them that the span does not ask for.
    Coordinates Next(int64_t pixels) {
        return pixels > kLanes ? Take(kLanes + 1) : Take(static_cast<int32_t>(pixels));
    }

    /// Adds the slopes once for each pixel: start + k x slope would round otherwise.
    Coordinates Take(int32_t pixels) {
        // Every store but the last reaches beyond its pixel where lanes are more than four; the next one
        // mends that.
        alignas(64) float places[5 * kLanes - 4];
        for (int32_t i = 0; i < kLanes; ++i) {
            Store(places + 4 * i, place);
            if (i + 1 < pixels) place = place + step;
        }
        const Channels channels = LoadFloatChannels(places);
        return {channels.c0, channels.c1, channels.c2};
    }

    F32 place, step;
};

// Sampling.

/// Source pixels and the edge alpha, from 0 to 255.
struct Texels {
    I32 pixels, edge;
};

inline I32 Limit(I32 x, int32_t low, int32_t high) {
    return Max(Min(x, Ints(high)), Ints(low));
}

/// Not-a-number becomes the upper limit.
inline F32 Limit(F32 x, int32_t low, int32_t high) {
    return Max(Min(x, Floats(static_cast<float>(high))), Floats(static_cast<float>(low)));
}

/// The pixel at one row and column, which are within the bounds.
inline uint32_t PixelAt(const WarpSource& source, int32_t row, int32_t column) {
    uint32_t pixel;
    std::memcpy(&pixel, source.pixels + 4 * (int64_t{row} * source.stride + column), sizeof pixel);
    return pixel;
}

// Sampling has two steps: the places of a group of kLanes pixels are found while the group before is read.

/// The pixel at nearest(u), nearest(v), without a half-pixel shift: callers count on the ties to even of a
/// copy pixel by pixel. The edge is hard.
struct NearestSampling {
    struct Places {
        I32 rows, columns;
    };

    [[gnu::always_inline]] static void Find(const WarpSource& source, const Coordinates& at, Places& places) {
        const I32 column = Nearest(Limit(at.u, source.left, source.right));
        const I32 row = Nearest(Limit(at.v, source.top, source.bottom));
        // Limited once more: bounds beyond 2^24 have no exact float.
        places.columns = Limit(column, source.left, source.right);
        places.rows = Limit(row, source.top, source.bottom);
    }

    [[gnu::always_inline]] static Texels Read(const WarpSource& source, const Places& places) {
        if constexpr (kLanes > 4) { // wide vectors gather, from any alignment
            if (source.offsetsFit)
                return {Lookup(reinterpret_cast<const uint32_t*>(source.pixels),
                               places.rows * Ints(source.stride) + places.columns),
                        Ints(255)};
        }
        int32_t rows[kLanes], columns[kLanes];
        uint32_t pixels[kLanes];
        Store(rows, places.rows);
        Store(columns, places.columns);
        for (int32_t i = 0; i < kLanes; ++i) pixels[i] = PixelAt(source, rows[i], columns[i]);
        return {LoadInts(pixels), Ints(255)};
    }
};

/// nearest(p0 + (p1 - p0) fx), with p0 and p1 each top + (bottom - top) fy
inline I32 Interpolate(I32 topLeft, I32 topRight, I32 bottomLeft, I32 bottomRight, F32 fx, F32 fy) {
    const F32 left = ToFloat(topLeft) + ToFloat(bottomLeft - topLeft) * fy;
    const F32 right = ToFloat(topRight) + ToFloat(bottomRight - topRight) * fy;
    return Nearest(left + (right - left) * fx);
}

/// Fractions are signed: a place that rounds up is extrapolated from the pixel it rounds to and the one
/// behind. This is deliberate; callers compare against it.
struct BilinearSampling {
    struct Places {
        // In `pixels`, the offsets of the left neighbours; the right ones stand behind them.
        const uint8_t* pixels;
        alignas(64) int32_t top[kLanes], bottom[kLanes];
        F32 fx, fy;
        I32 edge;
        uint32_t copies[4 * kLanes]; // of the neighbours, where they cannot be read as pairs
    };

    [[gnu::always_inline]] static void Find(const WarpSource& source, const Coordinates& at, Places& places) {
        const F32 half = Floats(0.5f);
        const F32 x = Limit(at.u - half, source.left, source.right);
        const F32 y = Limit(at.v - half, source.top, source.bottom) * Floats(source.rowScale) +
                      Floats(source.rowOffset);
        const I32 i = Nearest(x), j = Nearest(y);
        places.fx = x - ToFloat(i);
        places.fy = y - ToFloat(j);
        places.edge = Limit(Nearest(at.a), 0, 255);

        const I32 column = Limit(i, source.left, source.right);
        const I32 row = Min(j * Ints(source.rowStep) - Ints(source.rowShift), Ints(source.lastRow));
        const I32 below = Min(row + Ints(source.rowStep), Ints(source.lastRow));
        const I32 top = Max(row, Ints(source.top)), bottom = Max(below, Ints(source.top));
        if (!source.offsetsFit || AnyNegative(Equal(column, Ints(source.right)))) {
            CopyNeighbours(source, column, top, bottom, places);
            return;
        }
        places.pixels = source.pixels;
        Store(places.top, top * Ints(source.stride) + column);
        Store(places.bottom, bottom * Ints(source.stride) + column);
    }

    /// One by one: offsets may be too great, and the last column stands for its neighbour too.
    [[gnu::noinline]] static void CopyNeighbours(const WarpSource& source, I32 column, I32 top, I32 bottom,
                                                 Places& places) {
        int32_t columns[kLanes], rows[2][kLanes];
        Store(columns, column);
        Store(rows[0], top);
        Store(rows[1], bottom);
        places.pixels = reinterpret_cast<const uint8_t*>(places.copies);
        for (int32_t i = 0; i < kLanes; ++i) {
            const int32_t right = columns[i] == source.right ? source.right : columns[i] + 1;
            uint32_t* const copy = places.copies + 4 * i;
            copy[0] = PixelAt(source, rows[0][i], columns[i]);
            copy[1] = PixelAt(source, rows[0][i], right);
            copy[2] = PixelAt(source, rows[1][i], columns[i]);
            copy[3] = PixelAt(source, rows[1][i], right);
            places.top[i] = 4 * i;
            places.bottom[i] = 4 * i + 2;
        }
    }

    /// Pixel kFirst of each block of four, a channel a lane.
    template <int kFirst>
    static I32 ReadOneOfFour(const Places& places) {
        I32 topLeft, topRight, bottomLeft, bottomRight;
        LoadPixelPairs(places.pixels, places.top + kFirst, topLeft, topRight);
        LoadPixelPairs(places.pixels, places.bottom + kFirst, bottomLeft, bottomRight);
        return Interpolate(topLeft, topRight, bottomLeft, bottomRight,
                           ShufflePixel<kFirst, kFirst, kFirst, kFirst>(places.fx),
                           ShufflePixel<kFirst, kFirst, kFirst, kFirst>(places.fy));
    }

    [[gnu::always_inline]] static Texels Read(const WarpSource&, const Places& places) {
        return {PackLanesInBlocks(ReadOneOfFour<0>(places), ReadOneOfFour<1>(places),
                                  ReadOneOfFour<2>(places), ReadOneOfFour<3>(places)),
                places.edge};
    }
};

// Rules of writing: each gives the new pixels, from the texels and the pixels that stand at the destination.

inline I32 Alpha(I32 pixels) {
    return ShiftRight<24>(pixels);
}

inline I32 WithAlpha(I32 pixels, I32 alpha) {
    return (pixels & Ints(0x00ffffff)) | ShiftLeft<24>(alpha);
}

inline I32 EdgeTimesAlpha(const WarpPaint& paint, const Texels& texels) {
    return MultiplyBytes(Ints(paint.opacity), MultiplyBytes(texels.edge, Alpha(texels.pixels)));
}

/// nearest((back x (255 - edge) + top x edge) / 255)
inline I32 Fade(I32 top, I32 back, I32 edge) {
    return DivideHalvesBy255(MultiplyHalves(back, Ints(255) - edge) + MultiplyHalves(top, edge));
}

struct FeatherOver {
    static I32 Apply(const WarpPaint&, const Texels& texels, const uint8_t* destination) {
        const IntChannels top = ByteChannels(texels.pixels), back = LoadByteChannels(destination);
        return PackByteChannels(Fade(top.c0, back.c0, texels.edge), Fade(top.c1, back.c1, texels.edge),
                                Fade(top.c2, back.c2, texels.edge), top.c3);
    }
};

struct Copy {
    static I32 Apply(const WarpPaint& paint, const Texels& texels, const uint8_t*) {
        return WithAlpha(texels.pixels, paint.writesEdgeAlpha ? texels.edge : EdgeTimesAlpha(paint, texels));
    }
};

/// Weights of a colour over another, and their common divisor.
struct Weights {
    F32 top, back, divisor;
};

/// truncate(((s - zero) ws + (t - zero) wd) / n) + zero. All terms are whole and below 2^24, where floats are
/// exact, and a quotient of divisors up to 65025 is further from the next whole number than it can round.
inline I32 Mix(I32 top, I32 back, const Weights& weights, int32_t zero) {
    const F32 above = ToFloat(top - Ints(zero)), below = ToFloat(back - Ints(zero));
    return Truncate((above * weights.top + below * weights.back) / weights.divisor) + Ints(zero);
}

struct MixBGRA {
    static I32 Apply(IntChannels top, IntChannels back, I32 alpha, const Weights& weights, I32) {
        return PackByteChannels(Mix(top.c0, back.c0, weights, 0), Mix(top.c1, back.c1, weights, 0),
                                Mix(top.c2, back.c2, weights, 0), alpha);
    }
};

struct MixVUYA {
    static I32 Apply(IntChannels top, IntChannels back, I32 alpha, const Weights& weights, I32) {
        return PackByteChannels(Mix(top.c0, back.c0, weights, 128), Mix(top.c1, back.c1, weights, 128),
                                Mix(top.c2, back.c2, weights, 16), alpha);
    }
};

/// No formula for mixed colours: the pixel stands.
struct MixOther {
    static I32 Apply(IntChannels, IntChannels, I32, const Weights&, I32 before) { return before; }
};

template <class MixColours>
struct Blend {
    static I32 Apply(const WarpPaint& paint, const Texels& texels, const uint8_t* destination) {
        const I32 before = LoadInts(destination);
        const IntChannels top = ByteChannels(texels.pixels), back = ByteChannels(before);
        const I32 a = EdgeTimesAlpha(paint, texels), d = back.c3;
        const I32 result = a + d - MultiplyBytes(a, d);
        // At least 1, since pixels without any alpha come here too, if only to be dropped.
        const I32 divisor = Max(result, Ints(1));
        const F32 full = Floats(255);
        const Weights weights = {ToFloat(a) * full, ToFloat(Ints(255) - a) * ToFloat(d),
                                 ToFloat(divisor) * full};
        const I32 mixed = MixColours::Apply(top, back, result, weights, before);
        const I32 replacing = WithAlpha(texels.pixels, a);
        const I32 replaces = Equal(a, Ints(255)) | Equal(d, Ints(0));
        return Select(Equal(a, Ints(0)), before, Select(replaces, replacing, mixed));
    }
};

template <class Sampling, class Rule>
void FillSpan(const WarpSource& from, const WarpPaint& by, const WarpSpan& span) {
    // Copies, which no store to the destination can change in the compiler's eyes.
    const WarpSource source = from;
    const WarpPaint paint = by;
    Walk walk(span);
    // The last pixels go through scratch, in the same loop: a second copy of its body is not inlined.
    alignas(64) uint8_t scratch[4 * kLanes] = {};
    uint8_t* destination = span.pixels;
    typename Sampling::Places places[2];
    Sampling::Find(source, walk.Next(span.count), places[0]);
    for (int64_t count = span.count, turn = 0; count > 0;
         count -= kLanes, destination += 4 * kLanes, turn ^= 1) {
        const bool isWhole = count >= kLanes;
        if (!isWhole) std::memcpy(scratch, destination, 4 * static_cast<size_t>(count));
        uint8_t* pixels = isWhole ? destination : scratch;
        if (count > kLanes) Sampling::Find(source, walk.Next(count - kLanes), places[turn ^ 1]);
        Store(pixels, Rule::Apply(paint, Sampling::Read(source, places[turn]), pixels));
        if (!isWhole) std::memcpy(destination, scratch, 4 * static_cast<size_t>(count));
    }
}

template <class Kernels, class Sampling>
constexpr Kernels kRules = {FillSpan<Sampling, FeatherOver>, FillSpan<Sampling, Copy>,
                            FillSpan<Sampling, Blend<MixBGRA>>, FillSpan<Sampling, Blend<MixVUYA>>,
                            FillSpan<Sampling, Blend<MixOther>>};

} // namespace
} // namespace PK::PK_TARGET

namespace PK {

template <>
template <>
const WarpNearestKernels& WarpNearestKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kRules<WarpNearestKernels, PK_TARGET::NearestSampling>;
}

template <>
template <>
const WarpBilinearKernels& WarpBilinearKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kRules<WarpBilinearKernels, PK_TARGET::BilinearSampling>;
}

} // namespace PK
