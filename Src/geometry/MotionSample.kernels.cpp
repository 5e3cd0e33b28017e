// Samples between four pixels: a layout, the zeros of its colours, and a way to weigh by alpha.

#include "geometry/MotionMixedRows.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

/// What four pixels add up to, and the share of each in alpha.
struct Weighed {
    Channels sum;
    F32 shares[4];
};

/// Upper left, upper right, lower left, lower right; colours are differences from their zeros.
using Four = Channels[4];

template <class Layout, class Zero, MotionAlpha kAlpha>
struct Bilinear {
    using Rows = MixedRows<Layout, Zero, kAlpha>;
    static constexpr int32_t kMargin = 2;
    static constexpr bool kIsFloat = Layout::kFull == 1;

    explicit Bilinear(const MotionRow& from) : row(from), opaque(Ints(from.isOpaque ? -1 : 0)) {}

    /// As differences, and with full alpha where that of the source means nothing.
    Channels Prepare(Channels c) const {
        if constexpr (!Zero::kIsZero) {
            const Channels zero = Zero::Value();
            c = {c.c0 - zero.c0, c.c1 - zero.c1, c.c2 - zero.c2, c.c3};
        }
        if constexpr (kAlpha == MotionAlpha::premultiplied)
            c.c3 = Select(opaque, Floats(Layout::kFull), c.c3);
        return c;
    }

    [[gnu::always_inline]] static Weighed Weigh(const Four& pixels, F32 fx, F32 fy) {
        const F32 gx = Floats(1) - fx, gy = Floats(1) - fy;
        const F32 weights[4] = {gx * gy, fx * gy, gx * fy, fx * fy};
        Weighed result;
        for (int i = 0; i < 4; ++i) {
            const Channels& c = pixels[i];
            const F32 share = weights[i] * c.c3;
            result.shares[i] = share;
            F32 factor = weights[i];
            if constexpr (kAlpha == MotionAlpha::straight)
                factor = kIsFloat ? share : share * Floats(1 / Layout::kFull);
            const Channels part = {c.c0 * factor, c.c1 * factor, c.c2 * factor, share};
            Channels& sum = result.sum;
            sum = i == 0 ? part
                         : Channels{sum.c0 + part.c0, sum.c1 + part.c1, sum.c2 + part.c2, sum.c3 + part.c3};
        }
        return result;
    }

    static Channels Finish(const Channels& sum, I32 isVisible) {
        Channels c = And(isVisible, sum);
        if constexpr (!Zero::kIsZero) {
            const Channels zero = Zero::Value();
            c = {c.c0 + zero.c0, c.c1 + zero.c1, c.c2 + zero.c2, c.c3};
        }
        return c;
    }

    /// One pixel of the cell for each lane.
    Channels LoadEdge(const EdgeCell& x, const EdgeCell& y, int32_t right, int32_t lower) const {
        uint8_t copies[kLanes * Layout::kPixelBytes];
        for (int32_t i = 0; i < kLanes; ++i)
            std::memcpy(copies + i * Layout::kPixelBytes,
                        row.pixels + y.index[lower][i] * row.rowBytes +
                            int64_t{x.index[right][i]} * Layout::kPixelBytes,
                        Layout::kPixelBytes);
        return Prepare(Layout::Load(copies));
    }

    [[gnu::noinline]] void Edge(const Places& places, int32_t count, float* out) const {
        if (row.left >= row.right || row.top >= row.bottom) return Clear(count, out);
        for (int32_t n = 0; n < count; n += kLanes) {
            const EdgeCell x(places.x + n, row.left, row.right), y(places.y + n, row.top, row.bottom);
            // Where the edge is hard, one pixel inside is enough, and the nearest ones stand for the others.
            const I32 isNear = (x.isInside[0] | x.isInside[1]) & (y.isInside[0] | y.isInside[1]);
            Four pixels;
            for (int32_t i = 0; i < 4; ++i) {
                const I32 isInside = row.smoothEdges ? x.isInside[i % 2] & y.isInside[i / 2] : isNear;
                pixels[i] = And(isInside, LoadEdge(x, y, i % 2, i / 2));
            }
            const Channels sum = Weigh(pixels, x.fraction, y.fraction).sum;
            const I32 isVisible = Less(Floats(0), sum.c3 - Floats(kNegligible));
            StorePixels(out + 4 * n, Finish(sum, isVisible), count - n);
        }
    }

    /// Nothing of the source is there to be read.
    static void Clear(int32_t count, float* out) {
        for (int32_t n = 0; n < count; n += kLanes) StorePixels(out + 4 * n, Zero::Value(), count - n);
    }

    static constexpr bool kFindsEdges = false;

    void Locate(const float* places, int32_t* pixels, int32_t* fractions, int32_t count) const {
        for (int32_t n = 0; n < count; n += kLanes) {
            const InnerCell cell(places + n, row.left, row.right);
            Store(pixels + n, cell.first);
            Store(fractions + n, Bits(cell.fraction));
        }
    }

    /// Where all places lie between the same two rows, these are mixed first, once for many columns. That does not pay
    /// where there are too many columns of the source between two of the destination.
    void Level(int32_t columns, float* out) const {
        if (columns < 1) return;
        const Rows rows(row);
        for (int32_t begin = 0; begin < columns; begin += kBlock) {
            const int32_t count = columns - begin < kBlock ? columns - begin : kBlock;
            const int32_t* const pixels = row.shared->pixels + begin;
            const auto* const fractions = reinterpret_cast<const float*>(row.shared->weights + begin);
            const Range range = RangeOf(pixels, count);
            if (range.most - range.least <= kMostColumns)
                BlendRows(rows, range, pixels, fractions, count, out + int64_t{4} * begin);
            else
                BlendCells(rows, pixels, fractions, count, out + int64_t{4} * begin);
        }
    }

    static constexpr int32_t kMostColumns = 2 * kBlock;

    void BlendRows(const Rows& rows, const Range& range, const int32_t* pixels, const float* fractions,
                   int32_t count, float* out) const {
        // A vector's worth at least, which the source has: its margins are two pixels each.
        const int32_t most = row.right - kVectorPixels, least = range.least < most ? range.least : most;
        const int32_t needed = range.most + 2 - least,
                      width = needed < kVectorPixels ? kVectorPixels : needed;
        constexpr int32_t kFloats = 4 * (kMostColumns + 2 + kVectorPixels);
        alignas(64) float mixed[kFloats], shares[kFloats];
        const bool isPlain = rows.Mix(least, width, mixed);
        if (!isPlain) rows.TakeShares(least, width, shares);
        const Pairs pairs = {mixed, shares, pixels, fractions, least};
        if (isPlain && row.shared->areNear)
            BlendPairs<true>(pairs, isPlain, count, out);
        else
            BlendPairs<false>(pairs, isPlain, count, out);
    }

    struct Pairs {
        const float *mixed, *shares; // from pixel `least` on
        const int32_t* pixels;
        const float* fractions;
        int32_t least;
    };

    template <bool kPlainAndNear>
    void BlendPairs(const Pairs& pairs, bool isPlain, int32_t count, float* out) const {
        const auto& [mixed, shares, pixels, fractions, least] = pairs;
        for (int32_t n = 0; n < count; n += kVectorPixels) {
            const F32 fx = LoadOnePerBlock(fractions + n);
            F32 left, right;
            LoadSideBySide<kPlainAndNear>(mixed, pixels + n, least, left, right);
            F32 sum = left + (right - left) * fx;
            if (!kPlainAndNear && !isPlain) {
                LoadSideBySide<false>(shares, pixels + n, least, left, right);
                sum = FromBits(IsSeen(Max(left * (Floats(1) - fx), right * fx)) & Bits(sum));
            }
            StorePixels(out + 4 * n, Zero::kIsZero ? sum : sum + Zero::Interleaved(), count - n);
        }
    }

    static I32 IsSeen(F32 shares) { return Less(Floats(0x1p-17f), BroadcastAlpha<AlphaPlace::last>(shares)); }

    /// The pixels of some columns, and those right of them, of a row that begins with pixel `least`.
    template <bool kNear>
    [[gnu::always_inline]] static void LoadSideBySide(const float* line, const int32_t* pixels, int32_t least,
                                                      F32& left, F32& right) {
        if constexpr (kNear) {
            const float* const near = line + 4 * int64_t{*pixels - least};
            const I32 lanes =
                ShiftLeft<2>(LoadOneIntPerBlock(pixels) - Ints(*pixels)) + PixelInts(0, 1, 2, 3);
            left = LoadBlocksNear(near, lanes);
            right = LoadBlocksNear(near + 4, lanes);
        } else {
            int32_t index[kVectorPixels];
            for (int32_t i = 0; i < kVectorPixels; ++i) index[i] = pixels[i] - least;
            left = LoadBlocksOf(line, index);
            right = LoadBlocksOf(line + 4, index);
        }
    }

    /// Places first, all of them, so that no load waits for what has just been stored.
    void Inside(const Places& places, int32_t count, float* out) const {
        alignas(64) float fx[kBlock], fy[kBlock];
        alignas(64) int64_t offsets[kBlock];
        for (int32_t n = 0; n < count; n += kLanes) {
            const InnerCell x(places.x + n, row.left, row.right), y(places.y + n, row.top, row.bottom);
            int32_t columns[kLanes], rows[kLanes];
            Store(columns, x.first);
            Store(rows, y.first);
            Store(fx + n, x.fraction);
            Store(fy + n, y.fraction);
            for (int32_t i = 0; i < kLanes; ++i)
                offsets[n + i] = rows[i] * row.rowBytes + int64_t{columns[i]} * Layout::kPixelBytes;
        }
        BlendCells(row.pixels, offsets, fx, fy, count, out);
    }

    /// The same between two rows.
    void BlendCells(const Rows& rows, const int32_t* pixels, const float* fractions, int32_t count,
                    float* out) const {
        alignas(64) int64_t offsets[kBlock];
        alignas(64) float fy[kBlock];
        for (int32_t n = 0; n < count; n += kLanes) {
            Store(fy + n, Floats(rows.fraction));
            for (int32_t i = 0; i < kLanes; ++i)
                offsets[n + i] = int64_t{pixels[n + i]} * Layout::kPixelBytes;
        }
        BlendCells(rows.upper, offsets, fractions, fy, count, out);
    }

    /// Of four pixels each, the first at an offset in bytes.
    [[gnu::noinline]] void BlendCells(const uint8_t* base, const int64_t* offsets, const float* fx,
                                      const float* fy, int32_t count, float* out) const {
        for (int32_t n = 0; n < count; n += kLanes) {
            Four pixels;
            LoadNeighbours(Layout(), base, offsets + n, pixels[0], pixels[1]);
            LoadNeighbours(Layout(), base + row.rowBytes, offsets + n, pixels[2], pixels[3]);
            for (Channels& pixel : pixels) pixel = Prepare(pixel);
            const Weighed weighed = Weigh(pixels, LoadFloats(fx + n), LoadFloats(fy + n));
            StorePixels(out + 4 * n, Finish(weighed.sum, IsVisible(weighed)), count - n);
        }
    }

    /// Inside the source a pixel is seen as soon as one of the four is.
    static I32 IsVisible(const Weighed& weighed) {
        const F32 least = Floats(0x1p-17f);
        const F32(&shares)[4] = weighed.shares;
        return (Less(least, shares[0]) | Less(least, shares[1])) |
               (Less(least, shares[2]) | Less(least, shares[3]));
    }

    const MotionRow row; // a copy, which no store to the line can change in the compiler's eyes
    const I32 opaque;    // everywhere or nowhere
};

template <MotionAlpha kAlpha>
constexpr void Enter(SampleMotionRow (&samplers)[kMotionLayouts]) {
    samplers[kMotionRGB8] = SampleRow<Bilinear<Pixels8<>, NoZero, kAlpha>>;
    samplers[kMotionRGB8AlphaFirst] = SampleRow<Bilinear<Pixels8<AlphaPlace::first>, NoZero, kAlpha>>;
    samplers[kMotionYUV8] = SampleRow<Bilinear<Pixels8<>, VideoZero, kAlpha>>;
    samplers[kMotion15] = SampleRow<Bilinear<Pixels15<>, NoZero, kAlpha>>;
    samplers[kMotion15AlphaFirst] = SampleRow<Bilinear<Pixels15<AlphaPlace::first>, NoZero, kAlpha>>;
    samplers[kMotionFloats] = SampleRow<Bilinear<Pixels32f<>, NoZero, kAlpha>>;
    samplers[kMotionFloatsAlphaFirst] = SampleRow<Bilinear<Pixels32f<AlphaPlace::first>, NoZero, kAlpha>>;
}

struct ScaleLine : SampleGroup<4, 4> {
    explicit ScaleLine(const LineScale& by)
        : zero(PixelFloats(by.zero[0], by.zero[1], by.zero[2], by.zero[3])),
          scale(PixelFloats(by.scale[0], by.scale[1], by.scale[2], by.scale[3])) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        Store(destination, (LoadFloats(source) - zero) * scale);
    }

    F32 zero, scale;
};

constexpr MotionSampleKernels MakeKernels() {
    MotionSampleKernels kernels{};
    Enter<MotionAlpha::straight>(kernels.straight);
    Enter<MotionAlpha::premultiplied>(kernels.premultiplied);
    kernels.scaleLine = RowWith<ScaleLine, LineScale>;
    return kernels;
}

constexpr MotionSampleKernels kKernels = MakeKernels();

} // namespace
} // namespace PK::PK_TARGET

namespace PK {

template <>
const MotionSampleKernels& MotionSampleKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
