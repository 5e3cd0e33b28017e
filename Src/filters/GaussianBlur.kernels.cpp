// The recursive filter along lines: a causal pass, an anticausal one and their sum. With x a line, y and z what the passes
// make of it,
//
//   y[i] = c0 x[i] + c1 x[i - 1] - d1 y[i - 1] - d2 y[i - 2]           upward
//   z[i] = c2 x[i + 1] + c3 x[i + 2] - d1 z[i + 1] - d2 z[i + 2]       downward
//   result[i] = y[i] + z[i]
//
// from left to right, every product, sum and difference rounded. A pass waits for its own last result, so lines run side
// by side: each block of a vector has a pixel of its own line.

#include "filters/GaussianBlurKernels.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kLinesOfVector = kLanes / 4;
// Fewer wait for each other's results, and of more the registers would not hold the state.
constexpr int kVectorsAtATime = kTarget == Target::plain ? 1 : kTarget == Target::avx512 ? 2 : 4;
static_assert(kVectorsAtATime * kLinesOfVector <= kGaussianLines);

/// Where the source begins in the destination; of an odd difference of lengths the greater half.
int32_t MarginOf(const GaussianLines& lines) {
    const int32_t more = lines.length - lines.sourceLength;
    return more / 2 + more % 2;
}

/// One pass over the lines of so many vectors.
template <int kVectors>
class Pass {
public:
    /// \param here, before  what is taken of a pixel, and of the one that came before it
    Pass(float here, float before, const GaussianCoefficients& c)
        : fHere(Floats(here)), fBefore(Floats(before)), fD1(Floats(c.d1)), fD2(Floats(c.d2)) {}

    /// What was before the first pixel: a pixel, the last result and the one before that.
    void Begin(int i, F32 pixel, F32 last, F32 secondLast) {
        fOfPixel[i] = fBefore * pixel;
        fLast[i] = last;
        fOfSecondLast[i] = fD2 * secondLast;
    }

    F32 Next(int i, F32 pixel) {
        const F32 result = fHere * pixel + fOfPixel[i] - fD1 * fLast[i] - fOfSecondLast[i];
        fOfPixel[i] = fBefore * pixel;
        fOfSecondLast[i] = fD2 * fLast[i];
        fLast[i] = result;
        return result;
    }

private:
    F32 fHere, fBefore, fD1, fD2;
    F32 fOfPixel[kVectors], fLast[kVectors], fOfSecondLast[kVectors];
};

/// The lines of so many vectors, through both passes. Where steps are 0 all blocks have the same line.
template <int kVectors>
class Bundle {
public:
    explicit Bundle(const GaussianLines& lines) : fLines(lines), fMargin(MarginOf(lines)) {
        for (int i = 0; i < kVectors; ++i) {
            fFront[i] = lines.repeatEdge ? Source(i, 0) : Floats(0);
            fBack[i] = lines.repeatEdge ? Source(i, lines.sourceLength - 1) : Floats(0);
        }
    }

    /// Leaves its results from the margin on in the scratch.
    void RunCausal(const GaussianCoefficients& c) const {
        Pass<kVectors> pass(c.c0, c.c1, c);
        for (int i = 0; i < kVectors; ++i) pass.Begin(i, fFront[i], Preset(fFront[i]), Preset(fFront[i]));
        for (int64_t at = 0; at < fLines.sourceLength; ++at)
            for (int i = 0; i < kVectors; ++i) Store(Causal(i, at), pass.Next(i, Source(i, at)));
        const int64_t end = int64_t{fLines.length} - fMargin;
        for (int64_t at = fLines.sourceLength; at < end; ++at)
            for (int i = 0; i < kVectors; ++i) Store(Causal(i, at), pass.Next(i, fBack[i]));
    }

    /// Adds its results to those of the causal pass. Places are those of the destination, from behind.
    void RunAnticausal(const GaussianCoefficients& c) const {
        Pass<kVectors> pass(c.c2, c.c3, c);
        const int64_t sourceEnd = int64_t{fMargin} + fLines.sourceLength;
        const int64_t first = int64_t{fLines.length} - fMargin;
        // Of an odd difference of lengths the pass begins inside the source. The last pixel's own result is then neither
        // made nor preset, and is 0.
        const bool isOdd = first < sourceEnd;
        for (int i = 0; i < kVectors; ++i) {
            const F32 preset = Preset(fBack[i]), last = isOdd ? Floats(0) : preset;
            pass.Begin(i, fBack[i], last, preset);
            for (int64_t at = int64_t{fLines.length} - 1; at > first; --at)
                Put(i, at, CausalAt(i, at) + preset);
            if (first < fLines.length) Put(i, first, CausalAt(i, first) + last);
            if (!isOdd) Put(i, first - 1, CausalAt(i, first - 1) + pass.Next(i, fBack[i]));
        }

        for (int64_t at = sourceEnd - 2; at >= fMargin; --at)
            for (int i = 0; i < kVectors; ++i)
                Put(i, at, CausalAt(i, at) + pass.Next(i, Source(i, at + 1 - fMargin)));
        if (fMargin == 0) return;
        for (int i = 0; i < kVectors; ++i)
            Put(i, fMargin - 1, Preset(fFront[i]) + pass.Next(i, Source(i, 0)));
        for (int64_t at = int64_t{fMargin} - 2; at >= 0; --at)
            for (int i = 0; i < kVectors; ++i) Put(i, at, Preset(fFront[i]) + pass.Next(i, fFront[i]));
    }

private:
    /// What a pass makes of an edge that goes on for ever: each has half of it.
    static F32 Preset(F32 edge) { return edge * Floats(0.5f); }

    F32 Source(int i, int64_t at) const {
        return LoadFloatBlocks(fLines.source + i * kLinesOfVector * fLines.sourceStep +
                                   at * kGaussianPixelBytes,
                               fLines.sourceStep);
    }

    void Put(int i, int64_t at, F32 pixels) const {
        StoreFloatBlocks(fLines.destination + i * kLinesOfVector * fLines.destinationStep +
                             at * kGaussianPixelBytes,
                         fLines.destinationStep, pixels);
    }

    uint8_t* Causal(int i, int64_t at) const {
        return fLines.scratch + (at * kVectors + i) * static_cast<int64_t>(sizeof(F32));
    }
    F32 CausalAt(int i, int64_t at) const { return LoadFloats(Causal(i, at - fMargin)); }

    const GaussianLines& fLines;
    int32_t fMargin;
    F32 fFront[kVectors], fBack[kVectors]; // what is before and behind the source
};

template <int kVectors>
PK_FLATTEN void FilterBundle(const GaussianLines& lines, const GaussianCoefficients& coefficients) {
    const Bundle<kVectors> bundle(lines);
    bundle.RunCausal(coefficients);
    bundle.RunAnticausal(coefficients);
}

/// The lines from another on.
GaussianLines From(const GaussianLines& lines, int32_t first) {
    GaussianLines rest = lines;
    rest.source += first * lines.sourceStep;
    rest.destination += first * lines.destinationStep;
    return rest;
}

void FilterLines(const GaussianLines& lines, const GaussianCoefficients& coefficients) {
    int32_t line = 0;
    for (; lines.count - line >= kVectorsAtATime * kLinesOfVector; line += kVectorsAtATime * kLinesOfVector)
        FilterBundle<kVectorsAtATime>(From(lines, line), coefficients);
    for (; lines.count - line >= kLinesOfVector; line += kLinesOfVector)
        FilterBundle<1>(From(lines, line), coefficients);
    for (; line < lines.count; ++line) {
        GaussianLines alone = From(lines, line);
        alone.sourceStep = alone.destinationStep = 0;
        FilterBundle<1>(alone, coefficients);
    }
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::GaussianBlurKernels& PK::GaussianBlurKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr GaussianBlurKernels kernels = {FilterLines};
    return kernels;
}
