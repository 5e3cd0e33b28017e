// Interpolates a row between the row above and the row below, pixel by pixel along the direction in which they differ
// least: from top left to bottom right, straight down, or from top right to bottom left.

#include "filters/DeinterlaceKernels.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

// A depth tells what kLanes pixels are, and of two such vectors
//
//   Distance   the sum of the squared differences of the three channels beside alpha, in float and in their order
//   Average    of all four channels, rounded up at the half; of floats, exact but for the last bit
//   Median     of three vectors, sample by sample
//
// Channels stay in the order of memory, which only Distance looks at.

/// min(max(a, min(b, v)), max(b, v)). With v as the first operand b stands for a v that is no number.
template <class Samples>
Samples MedianOf(Samples a, Samples b, Samples v) {
    return Min(Max(a, Min(v, b)), Max(v, b));
}

/// Whole pixels in the lanes, four bytes each.
template <AlphaPlace kAlpha>
struct Bytes {
    using Pixels = I32;
    static constexpr int32_t kPixelBytes = 4;

    static I32 Load(const uint8_t* source) { return LoadInts(source); }
    static void Put(uint8_t* destination, I32 pixels) { Store(destination, pixels); }

    /// Exact as the sum in float is: three squares are below 2^18.
    static F32 Distance(I32 p, I32 q) {
        constexpr int32_t kEven = kAlpha == AlphaPlace::last ? 0x00ff00ff : 0x00ff0000;
        constexpr int32_t kOdd = kAlpha == AlphaPlace::last ? 0x000000ff : 0x00ff00ff;
        const I32 difference = MaxBytes(p, q) - MinBytes(p, q); // of no byte below 0: nothing is borrowed
        const I32 even = difference & Ints(kEven), odd = ShiftRight<8>(difference) & Ints(kOdd);
        return ToFloat(MultiplyAddHalves(even, even) + MultiplyAddHalves(odd, odd));
    }

    /// (p + q + 1) >> 1 of each byte.
    static I32 Average(I32 p, I32 q) { return (p | q) - (ShiftRight<1>(p ^ q) & Ints(0x7f7f7f7f)); }

    static I32 Median(I32 a, I32 b, I32 v) { return MinBytes(MaxBytes(a, MinBytes(b, v)), MaxBytes(b, v)); }
};

/// One vector a channel.
template <class Depth, class FourChannels, AlphaPlace kAlpha>
struct Planes {
    using Pixels = FourChannels;

    static F32 Distance(const Pixels& p, const Pixels& q) {
        if constexpr (kAlpha == AlphaPlace::last)
            return Square(p.c0, q.c0) + Square(p.c1, q.c1) + Square(p.c2, q.c2);
        else
            return Square(p.c1, q.c1) + Square(p.c2, q.c2) + Square(p.c3, q.c3);
    }

    static Pixels Average(const Pixels& p, const Pixels& q) {
        return {Depth::Mean(p.c0, q.c0), Depth::Mean(p.c1, q.c1), Depth::Mean(p.c2, q.c2),
                Depth::Mean(p.c3, q.c3)};
    }

    static Pixels Median(const Pixels& a, const Pixels& b, const Pixels& v) {
        return {MedianOf(a.c0, b.c0, v.c0), MedianOf(a.c1, b.c1, v.c1), MedianOf(a.c2, b.c2, v.c2),
                MedianOf(a.c3, b.c3, v.c3)};
    }

private:
    Planes() = default;
    friend Depth;

    template <class Sample>
    static F32 Square(Sample p, Sample q) {
        const F32 difference = Depth::Value(p) - Depth::Value(q);
        return difference * difference;
    }
};

template <AlphaPlace kAlpha>
struct Words : Planes<Words<kAlpha>, IntChannels, kAlpha> {
    using Layout = Pixels15<>;
    static constexpr int32_t kPixelBytes = Layout::kPixelBytes;

    static IntChannels Load(const uint8_t* source) { return Layout::LoadCodes(source); }
    static void Put(uint8_t* destination, const IntChannels& pixels) {
        Layout::StoreCodes(destination, pixels);
    }
    static F32 Value(I32 code) { return ToFloat(code); }
    static I32 Mean(I32 p, I32 q) { return ShiftRight<1>(p + q + Ints(1)); }
};

template <AlphaPlace kAlpha>
struct Singles : Planes<Singles<kAlpha>, Channels, kAlpha> {
    using Layout = Pixels32f<>;
    static constexpr int32_t kPixelBytes = Layout::kPixelBytes;

    static Channels Load(const uint8_t* source) { return Layout::Load(source); }
    static void Put(uint8_t* destination, const Channels& pixels) { Layout::Store(destination, pixels); }
    static F32 Value(F32 sample) { return sample; }
    static F32 Mean(F32 p, F32 q) { return (p + q) * Floats(0.5f); }
};

/// A row that begins one pixel before the destination and ends one pixel behind it.
template <int32_t kPixelBytes>
struct WithBothNeighbours : LoadedPast<Each<kPixelBytes>, 2 * kPixelBytes> {
    static constexpr int64_t BytesOf(int64_t pixels) { return (pixels + 2) * kPixelBytes; }
};

/// The median keeps a pixel between the two that it stands between, whatever direction was chosen.
template <class Depth>
void PutBetween(typename Depth::Pixels above, typename Depth::Pixels below, typename Depth::Pixels average,
                uint8_t* destination) {
    Depth::Put(destination, Depth::Median(above, below, average));
}

/// A column with neighbours on both sides. Of equal distances the left one is taken before the centre, and the centre
/// before the right one. Where the distances to the sides are no numbers it is the centre, so that not-a-number
/// spoils no pixel beside it.
template <class Depth>
struct AlongEdge : Groups<kLanes, Each<Depth::kPixelBytes>, WithBothNeighbours<Depth::kPixelBytes>,
                          WithBothNeighbours<Depth::kPixelBytes>> {
    static void Group(const uint8_t* above, const uint8_t* below, uint8_t* destination) {
        constexpr int32_t kNext = Depth::kPixelBytes;
        const auto aboveLeft = Depth::Load(above), belowLeft = Depth::Load(below);
        const auto a = Depth::Load(above + kNext), b = Depth::Load(below + kNext);
        const auto aboveRight = Depth::Load(above + 2 * kNext), belowRight = Depth::Load(below + 2 * kNext);
        const F32 left = Depth::Distance(aboveLeft, belowRight), centre = Depth::Distance(a, b),
                  right = Depth::Distance(aboveRight, belowLeft);
        const I32 isLeft = NotGreater(left, centre) & NotGreater(left, right);
        const I32 isRight = Less(right, left) & Less(right, centre);
        const auto from = Select(isLeft, aboveLeft, Select(isRight, aboveRight, a));
        const auto to = Select(isLeft, belowRight, Select(isRight, belowLeft, b));
        PutBetween<Depth>(a, b, Depth::Average(from, to), destination);
    }
};

/// A column at an end of its row.
template <class Depth>
struct StraightDown
    : Groups<kLanes, Each<Depth::kPixelBytes>, Each<Depth::kPixelBytes>, Each<Depth::kPixelBytes>> {
    static void Group(const uint8_t* above, const uint8_t* below, uint8_t* destination) {
        const auto a = Depth::Load(above), b = Depth::Load(below);
        PutBetween<Depth>(a, b, Depth::Average(a, b), destination);
    }
};

/// The first column, those between, and the last, which in a row of one is the first.
template <class Depth>
void InterpolateRow(const void* aboveRow, const void* belowRow, void* destinationRow, int32_t width) {
    if (width < 1) return;
    const auto* above = static_cast<const uint8_t*>(aboveRow);
    const auto* below = static_cast<const uint8_t*>(belowRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    const ptrdiff_t last = ptrdiff_t{width - 1} * Depth::kPixelBytes;
    RunRow(StraightDown<Depth>(), 1, destination, above, below);
    RunRow(AlongEdge<Depth>(), width - 2, destination + Depth::kPixelBytes, above, below);
    RunRow(StraightDown<Depth>(), 1, destination + last, above + last, below + last);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::DeinterlaceKernels& PK::DeinterlaceKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    using enum AlphaPlace;
    static constexpr DeinterlaceKernels kernels = {
        .alphaLast8u = InterpolateRow<Bytes<last>>,
        .alphaLast15u = InterpolateRow<Words<last>>,
        .alphaLast32f = InterpolateRow<Singles<last>>,
        .alphaFirst8u = InterpolateRow<Bytes<first>>,
        .alphaFirst15u = InterpolateRow<Words<first>>,
        .alphaFirst32f = InterpolateRow<Singles<first>>,
    };
    return kernels;
}
