// The running sum of the box filter: on a bundle of lines, one line a lane, and on a single line in 64 bits.
//
//   result = (255 x S + weight x E + 128) / divisor, truncated, at most 255
//
// with S the sum of the whole pixels in the window and E that of its edge pixels. Where the weight is 0, S / c with
// c = divisor / 255 has the same whole part, since S is a whole number and 128 less than 255.

#include "filters/BoxBlurKernels.h"
#include "filters/BoxDivisors.h"

namespace PK::PK_TARGET {
namespace {

/// What the box meets at one pixel. What is absent points to zeros.
struct Place {
    const uint8_t* here;
    const uint8_t* entering; // the whole pixel that is new in the window
    const uint8_t* leaving;  // the one that is no longer in it
    const uint8_t* left;     // edge pixels
    const uint8_t* right;
    int64_t divisor;
    uint32_t filtered; // bytes that take the result; the others are those of `here`
    uint8_t* destination;
};

inline constexpr uint8_t kAbsent[kBundleStep] = {};

/// Walks a line. Away from its ends the window of pixel x is x - size + 1 to x + size - 1, with edge pixels before
/// and behind it. Deliberate, and relied on: pixel `size` has no left edge pixel, and the last three pixels of a
/// line are never whole ones, unless the windows up to that of pixel `size` reach them.
template <class Box>
void Run(const BoxPass& pass, const uint8_t* source, uint8_t* destination) {
    constexpr int64_t kStep = Box::kStep;
    const int64_t length = pass.length, size = pass.size;
    const int64_t ofLeftEnd = 2 * size - 1; // the last whole pixel of pixel `size`
    const int64_t lastWhole = length > ofLeftEnd + 3 ? length - 4
                              : length > ofLeftEnd   ? ofLeftEnd
                                                     : length - 1;
    const int64_t unit = Box::kHasEdges ? 255 : 1; // what a whole pixel counts
    Box box(pass);
    for (int64_t x = 0; x < size - 1; ++x) box.Enter(source + x * kStep);

    int64_t count = size - 1;
    for (int64_t x = 0; x < length; ++x) {
        const uint8_t* here = source + x * kStep;
        const bool enters = x + size - 1 <= lastWhole;
        const bool leaves = x >= size && x - size <= lastWhole;
        const bool hasLeft = x > size;
        const bool hasRight = x + size < length;
        count += enters - leaves;
        const int64_t whole = unit * (pass.renormalise ? count : 2 * size - 1);
        const int64_t divisor = whole + (Box::kHasEdges ? pass.weight * (hasLeft + hasRight) : 0);
        const bool staysAsItIs = divisor == 0; // nothing in the window weighs anything
        box.Step({
            here,
            enters ? here + (size - 1) * kStep : kAbsent,
            leaves ? source + (x - size) * kStep : kAbsent,
            hasLeft ? source + (x - size) * kStep : kAbsent,
            hasRight ? here + size * kStep : kAbsent,
            staysAsItIs ? 1 : divisor,
            staysAsItIs ? 0 : pass.bytes,
            destination + x * kStep,
        });
    }
}

template <bool kEdges, class Divisor>
class Bundle {
public:
    static constexpr int64_t kStep = kBundleStep;
    static constexpr bool kHasEdges = kEdges;

    explicit Bundle(const BoxPass& pass) : fWeight(Ints(pass.weight)) {
        for (I32& sum : fSums) sum = Ints(0);
    }

    void Enter(const uint8_t* entering) {
        for (int i = 0; i < kVectors; ++i) fSums[i] = fSums[i] + LoadBytes(entering + i * kLanes);
    }

    void Step(const Place& place) {
        if (place.divisor != fDivisorValue) {
            fDivisorValue = place.divisor;
            fDivisor = Divisor(place.divisor);
        }
        const I32 filtered = Ints(static_cast<int32_t>(place.filtered));
        for (int i = 0; i < kVectors; i += 4) {
            const I32 result =
                PackLanes(Result(place, i), Result(place, i + 1), Result(place, i + 2), Result(place, i + 3));
            const int offset = i * kLanes;
            Store(place.destination + offset, Select(filtered, result, LoadInts(place.here + offset)));
        }
    }

private:
    static constexpr int kVectors = kBundleStep / kLanes;

    I32 Result(const Place& place, int i) {
        const int offset = i * kLanes;
        I32& sum = fSums[i];
        sum = sum + (LoadBytes(place.entering + offset) - LoadBytes(place.leaving + offset));
        if constexpr (!kEdges) return fDivisor.Quotient(sum);
        const I32 edges = LoadBytes(place.left + offset) + LoadBytes(place.right + offset);
        const I32 whole = ShiftLeft<8>(sum) - sum;
        return fDivisor.Quotient(whole + MultiplyAddHalves(edges, fWeight) + Ints(128));
    }

    I32 fWeight;
    I32 fSums[kVectors];
    Divisor fDivisor{1};
    int64_t fDivisorValue = 1;
};

template <bool kEdges>
class Line {
public:
    static constexpr int64_t kStep = 4;
    static constexpr bool kHasEdges = kEdges;

    explicit Line(const BoxPass& pass) : fWeight(pass.weight) {}

    void Enter(const uint8_t* entering) {
        for (int i = 0; i < 4; ++i) fSums[i] += entering[i];
    }

    void Step(const Place& place) {
        for (int i = 0; i < 4; ++i) {
            fSums[i] += place.entering[i] - place.leaving[i];
            const bool isFiltered = (place.filtered >> (8 * i) & 1) != 0;
            place.destination[i] = isFiltered ? Result(place, i) : place.here[i];
        }
    }

private:
    uint8_t Result(const Place& place, int i) const {
        const int64_t edges = place.left[i] + place.right[i];
        const int64_t numerator = kEdges ? 255 * fSums[i] + fWeight * edges + 128 : fSums[i];
        const int64_t quotient = numerator / place.divisor;
        return static_cast<uint8_t>(quotient > 255 ? 255 : quotient);
    }

    int64_t fWeight;
    int64_t fSums[4] = {};
};

template <bool kEdges>
void RunBundle(const BoxPass& pass, const uint8_t* source, uint8_t* destination) {
    const int64_t largest = (kEdges ? 255 : 1) * (2 * int64_t{pass.size} - 1) + 2 * pass.weight;
    if (largest <= SmallDivisor::kLargest)
        Run<Bundle<kEdges, SmallDivisor>>(pass, source, destination);
    else
        Run<Bundle<kEdges, LargeDivisor>>(pass, source, destination);
}

void BlurBundle(const BoxPass& pass, const uint8_t* source, uint8_t* destination) {
    pass.weight == 0 ? RunBundle<false>(pass, source, destination)
                     : RunBundle<true>(pass, source, destination);
}

void BlurLine(const BoxPass& pass, const uint8_t* source, uint8_t* destination) {
    pass.weight == 0 ? Run<Line<false>>(pass, source, destination)
                     : Run<Line<true>>(pass, source, destination);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::BoxBlurKernels& PK::BoxBlurKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr BoxBlurKernels kernels = {BlurBundle, BlurLine};
    return kernels;
}
