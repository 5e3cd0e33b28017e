// Fills the spans of the quad warp: a walk along the span, a way of sampling and a rule of writing.

#include "geometry/WarpSpan.h"

#include "convert/ByteScale.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

// The walk.

/// Source place and edge alpha of kLanes pixels.
struct Places {
    F32 u, v, a;
};

/// u, v and a of one pixel, and their slopes.
struct Walk {
    explicit Walk(const WarpSpan& span)
        : place(PixelFloats(span.u, span.v, span.a, 0)), step(PixelFloats(span.du, span.dv, span.da, 0)) {}

    /// Adds the slopes once for each pixel: start + k x slope would round otherwise.
    Places Next() {
        // Every store but the last reaches beyond its pixel where lanes are more than four; the next one
        // mends that.
        alignas(64) float places[5 * kLanes - 4];
        for (int32_t i = 0; i < kLanes; ++i) {
            Store(places + 4 * i, place);
            place = place + step;
        }
        const Channels channels = LoadFloatChannels(places);
        return {channels.c0, channels.c1, channels.c2};
    }

    F32 place, step;
};

// Sampling.

/// Source pixels, their alpha in c3, and the edge alpha, all from 0 to 255.
struct Texels {
    IntChannels channels;
    I32 edge;
};

inline I32 Limit(I32 x, int32_t low, int32_t high) {
    return Max(Min(x, Ints(high)), Ints(low));
}

/// Not-a-number becomes the upper limit.
inline F32 Limit(F32 x, int32_t low, int32_t high) {
    return Max(Min(x, Floats(static_cast<float>(high))), Floats(static_cast<float>(low)));
}

/// The pixels at rows and columns, which are within the bounds.
inline I32 Fetch(const WarpSource& source, I32 row, I32 column) {
    if constexpr (kLanes > 4) { // wide vectors gather, from any alignment
        if (source.offsetsFit)
            return Lookup(reinterpret_cast<const uint32_t*>(source.pixels),
                          row * Ints(source.stride) + column);
    }
    int32_t rows[kLanes], columns[kLanes], pixels[kLanes];
    Store(rows, row);
    Store(columns, column);
    for (int32_t i = 0; i < kLanes; ++i) {
        const int64_t offset = int64_t{rows[i]} * source.stride + columns[i];
        std::memcpy(&pixels[i], source.pixels + 4 * offset, sizeof pixels[i]);
    }
    return LoadInts(pixels);
}

/// The pixel at nearest(u), nearest(v), without a half-pixel shift: callers count on the ties to even of a copy
/// pixel by pixel. The edge is hard.
struct NearestSampling {
    static Texels At(const WarpSource& source, const Places& at) {
        const I32 column = Nearest(Limit(at.u, source.left, source.right));
        const I32 row = Nearest(Limit(at.v, source.top, source.bottom));
        // Limited once more: bounds beyond 2^24 have no exact float.
        const I32 pixels =
            Fetch(source, Limit(row, source.top, source.bottom), Limit(column, source.left, source.right));
        return {ByteChannels(pixels), Ints(255)};
    }
};

/// (a + (c - a) fy) + ((b + (d - b) fy) - (a + (c - a) fy)) fx, to the nearest, from 0 to 255.
inline I32 Interpolate(I32 topLeft, I32 topRight, I32 bottomLeft, I32 bottomRight, F32 fx, F32 fy) {
    const F32 upperLeft = ToFloat(topLeft), upperRight = ToFloat(topRight);
    const F32 left = upperLeft + (ToFloat(bottomLeft) - upperLeft) * fy;
    const F32 right = upperRight + (ToFloat(bottomRight) - upperRight) * fy;
    return Limit(Nearest(left + (right - left) * fx), 0, 255);
}

/// Fractions are signed: a place that rounds up is extrapolated from the pixel it rounds to and the one
/// behind. This is deliberate; callers compare against it.
struct BilinearSampling {
    static Texels At(const WarpSource& source, const Places& at) {
        const F32 half = Floats(0.5f);
        const F32 x = Limit(at.u - half, source.left, source.right);
        const F32 y = Limit(at.v - half, source.top, source.bottom) * Floats(source.rowScale) +
                      Floats(source.rowOffset);
        const I32 i = Nearest(x), j = Nearest(y);
        const F32 fx = x - ToFloat(i), fy = y - ToFloat(j);

        const I32 left = Limit(i, source.left, source.right);
        const I32 right = Min(left + Ints(1), Ints(source.right));
        const I32 upper = Min(j * Ints(source.rowStep) - Ints(source.rowShift), Ints(source.lastRow));
        const I32 lower = Min(upper + Ints(source.rowStep), Ints(source.lastRow));
        const I32 top = Max(upper, Ints(source.top)), bottom = Max(lower, Ints(source.top));

        const IntChannels a = ByteChannels(Fetch(source, top, left));
        const IntChannels b = ByteChannels(Fetch(source, top, right));
        const IntChannels c = ByteChannels(Fetch(source, bottom, left));
        const IntChannels d = ByteChannels(Fetch(source, bottom, right));
        return {{Interpolate(a.c0, b.c0, c.c0, d.c0, fx, fy), Interpolate(a.c1, b.c1, c.c1, d.c1, fx, fy),
                 Interpolate(a.c2, b.c2, c.c2, d.c2, fx, fy), Interpolate(a.c3, b.c3, c.c3, d.c3, fx, fy)},
                Limit(Nearest(at.a), 0, 255)};
    }
};

// Rules of writing: each gives the new pixels, from the texels and the pixels that stand at the destination.

/// nearest(a x b / 255) of two bytes.
inline I32 MultiplyBytes(I32 a, I32 b) {
    return DivideHalvesBy255(MultiplyHalves(a, b));
}

inline I32 EdgeTimesAlpha(const WarpPaint& paint, const Texels& texels) {
    return MultiplyBytes(Ints(paint.opacity), MultiplyBytes(texels.edge, texels.channels.c3));
}

/// nearest((back x (255 - edge) + top x edge) / 255)
inline I32 Fade(I32 top, I32 back, I32 edge) {
    return DivideHalvesBy255(MultiplyHalves(back, Ints(255) - edge) + MultiplyHalves(top, edge));
}

struct FeatherOver {
    static I32 Apply(const WarpPaint&, const Texels& texels, const uint8_t* destination) {
        const IntChannels top = texels.channels, back = LoadByteChannels(destination);
        return PackByteChannels(Fade(top.c0, back.c0, texels.edge), Fade(top.c1, back.c1, texels.edge),
                                Fade(top.c2, back.c2, texels.edge), top.c3);
    }
};

struct Copy {
    static I32 Apply(const WarpPaint& paint, const Texels& texels, const uint8_t*) {
        const IntChannels above = texels.channels;
        const I32 alpha = paint.writesEdgeAlpha ? texels.edge : EdgeTimesAlpha(paint, texels);
        return PackByteChannels(above.c0, above.c1, above.c2, alpha);
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
        const IntChannels top = texels.channels, back = ByteChannels(before);
        const I32 a = EdgeTimesAlpha(paint, texels), d = back.c3;
        const I32 result = a + d - MultiplyBytes(a, d);
        // At least 1, since pixels without any alpha come here too, if only to be dropped.
        const I32 divisor = Max(result, Ints(1));
        const F32 full = Floats(255);
        const Weights weights = {ToFloat(a) * full, ToFloat(Ints(255) - a) * ToFloat(d),
                                 ToFloat(divisor) * full};
        const I32 mixed = MixColours::Apply(top, back, result, weights, before);
        const I32 replacing = PackByteChannels(top.c0, top.c1, top.c2, a);
        const I32 replaces = Equal(a, Ints(255)) | Equal(d, Ints(0));
        return Select(Equal(a, Ints(0)), before, Select(replaces, replacing, mixed));
    }
};

template <class Sampling, class Rule>
void FillSpan(const WarpSource& source, const WarpPaint& paint, const WarpSpan& span) {
    Walk walk(span);
    uint8_t* destination = span.pixels;
    int64_t count = span.count;
    for (; count >= kLanes; count -= kLanes, destination += 4 * kLanes)
        Store(destination, Rule::Apply(paint, Sampling::At(source, walk.Next()), destination));
    if (count == 0) return;
    alignas(64) uint8_t scratch[4 * kLanes] = {};
    const size_t bytes = 4 * static_cast<size_t>(count);
    std::memcpy(scratch, destination, bytes);
    Store(scratch, Rule::Apply(paint, Sampling::At(source, walk.Next()), scratch));
    std::memcpy(destination, scratch, bytes);
}

template <class Sampling>
constexpr WarpRules kRules = {FillSpan<Sampling, FeatherOver>, FillSpan<Sampling, Copy>,
                              FillSpan<Sampling, Blend<MixBGRA>>, FillSpan<Sampling, Blend<MixVUYA>>,
                              FillSpan<Sampling, Blend<MixOther>>};

} // namespace
} // namespace PK::PK_TARGET

namespace PK {

template <>
const WarpKernels& WarpKernels::For<Target::PK_TARGET>() {
    static constexpr WarpKernels kernels = {PK_TARGET::kRules<PK_TARGET::NearestSampling>,
                                            PK_TARGET::kRules<PK_TARGET::BilinearSampling>};
    return kernels;
}

} // namespace PK
