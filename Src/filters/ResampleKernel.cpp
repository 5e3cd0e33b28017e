#include "filters/ResampleKernel.h"

#include "frame/Contract.h"

#include <algorithm>
#include <cmath>
#include <emmintrin.h>
#include <new>
#include <numbers>

namespace PK {
namespace {

constexpr char kSourcePath[] = "Src/ResampleKernel"; // as hosts know it

constexpr float kLeastScale = 0.25f; // whose table is the widest
constexpr float kSameScale = 0.01f;
constexpr int32_t kMostWeights = 20;

/// What a kind begins with.
struct Cubic {
    float stretch, near, far;
};

constexpr Cubic CubicOf(int32_t kind) {
    switch (kind) {
    case 3:
        return {1.15f, -0.625f, -1.0f};
    case 4:
        return {1.05f, -1.0f, -2.2f};
    case 5:
        return {1.2f, -0.5f, -0.5f};
    default:
        return {1.0f, -0.75f, -0.75f};
    }
}

/// The widest row that a kind ever has.
constexpr int16_t WidthToAllocate(int32_t kind) {
    constexpr int16_t kWidths[] = {0, 2, 20, 20, 20, 20, 6, 16};
    return kind >= 1 && kind <= 7 ? kWidths[kind] : int16_t{0};
}

/// The cubic convolution of Keys.
double KeysCubic(double argument, double a) {
    const double x = std::abs(argument);
    if (x >= 2) return 0;
    if (x >= 1) return ((a * x - 5 * a) * x + 8 * a) * x - 4 * a;
    return ((a + 2) * x - (a + 3)) * x * x + 1;
}

/// A cubic spline through six points.
double Spline36(double argument) {
    const double x = std::abs(argument);
    if (x >= 3) return 0;
    if (x >= 2) {
        const double u = x - 2;
        return ((1.0 / 11 * u - 45.0 / 209) * u + 26.0 / 209) * u;
    }
    if (x >= 1) {
        const double u = x - 1;
        return ((-6.0 / 11 * u + 270.0 / 209) * u - 156.0 / 209) * u;
    }
    return ((13.0 / 11 * x - 453.0 / 209) * x - 3.0 / 209) * x + 1;
}

/// A sinc in a window that is a wider one.
double Lanczos8(double argument) {
    const double x = std::abs(argument);
    if (x == 0) return 1;
    if (x >= 8) return 0;
    const double angle = std::numbers::pi * x;
    return std::sin(angle) / angle * (8 * std::sin(angle / 8) / angle);
}

/// Towards zero, as the processor does it: what fits no integer becomes 0.
int16_t TruncateWeight(double weight) {
    return static_cast<int16_t>(_mm_cvttsd_si32(_mm_set_sd(weight)));
}

/// The phase of a row.
double PhaseOf(int32_t row) {
    return row / static_cast<double>(ResampleKernel::kPhases);
}

} // namespace

ResampleKernel::ResampleKernel(int32_t kind) noexcept
    : fKind(kind), fStretch(CubicOf(kind).stretch), fCubicNear(CubicOf(kind).near),
      fCubicFar(CubicOf(kind).far) {}

void ResampleKernel::ScaleForDownSample(float decimatedScale, float scale) {
    if (!(1.0f >= decimatedScale))
        ReportContractViolation("decimatedScale <= 1.0", kSourcePath,
                                "PK::ResampleKernel::ScaleForDownSample", 476);
    if (!IsSized()) return;
    if (std::abs(fCurrentScale - scale) < kSameScale) return;
    fCurrentScale = scale;
    // The bound comes first: not-a-number becomes it.
    float s = std::max(kLeastScale, decimatedScale);
    if (s != 1.0f) s /= fStretch;
    float a = fCubicNear;
    if (fCubicFar != fCubicNear)
        a += (1.0f - (std::max(kLeastScale, scale) - kLeastScale) / 0.75f) * (fCubicFar - fCubicNear);
    ScaleCubicKernel(s, a);
}

void ResampleKernel::ScaleForUpSample(float scaleFactor) {
    if (!(scaleFactor >= 1.0f))
        ReportContractViolation("scaleFactor >= 1.0", kSourcePath, "PK::ResampleKernel::ScaleForUpSample",
                                440);
    if (!IsSized()) return;
    if (std::abs(fCurrentScale - 1.0f) < kSameScale) return;
    fCurrentScale = 1.0f;
    CalculateDefaultKernel();
}

/// Takes memory for the widest table of the kind, at the first request.
/// \return false if there is none to be had; all is as it was then, and the next request tries again.
bool ResampleKernel::IsSized() {
    if (fAllocatedWidth != 0) return true;
    const int16_t width = WidthToAllocate(fKind);
    try {
        fKernel.resize(static_cast<size_t>(width) * kPhases);
    } catch (const std::bad_alloc&) {
        return false;
    }
    fAllocatedWidth = width;
    return true;
}

/// Makes every row of a shape, which tells the raw value of a weight by its place in the row and the row's phase. Weights
/// are cut, not rounded, and a row is not corrected afterwards.
template <class Shape>
void ResampleKernel::FillRows(int32_t width, Shape shape) {
    fWidth = static_cast<int16_t>(width);
    int16_t* row = fKernel.data();
    for (int32_t i = 0; i < kPhases; ++i, row += width) {
        double raw[kMostWeights], sum = 0;
        for (int32_t k = 0; k < width; ++k) sum += raw[k] = shape(k, PhaseOf(i));
        const double factor = kOne / sum;
        for (int32_t k = 0; k < width; ++k) row[k] = TruncateWeight(raw[k] * factor);
    }
}

void ResampleKernel::CalculateDefaultKernel() {
    const double stretch = fStretch, near = fCubicNear;
    switch (fKind) {
    case 1:
        return CalculateLinearKernel();
    case 2:
        return FillRows(4, [](int32_t k, double phase) { return KeysCubic(k - 1 - phase, -0.75); });
    case 3:
    case 4:
    case 5:
        return FillRows(6, [stretch, near](int32_t k, double phase) {
            return KeysCubic((k - 2 - phase) / stretch, near);
        });
    case 6:
        return FillRows(6, [](int32_t k, double phase) { return Spline36(k - 2 - phase); });
    case 7:
        return FillRows(16, [](int32_t k, double phase) { return Lanczos8(k - 7 - phase); });
    default:
        // Hosts know this check by no line.
        ReportContractViolation("false", kSourcePath, "PK::ResampleKernel::CalculateDefaultKernel", 0);
    }
}

/// In integers, so that every row adds up.
void ResampleKernel::CalculateLinearKernel() {
    fWidth = 2;
    int16_t* weight = fKernel.data();
    for (int32_t i = 0; i < kPhases; ++i) {
        const int32_t second = kOne / kPhases * i;
        *weight++ = static_cast<int16_t>(kOne - second);
        *weight++ = static_cast<int16_t>(second);
    }
}

/// \param scale  what the argument of the shape is multiplied by.
void ResampleKernel::ScaleCubicKernel(float scale, float a) {
    const bool isNarrow = std::ceil(4.0 / scale) <= 10;
    const int32_t width = isNarrow ? 10 : 20;
    if (fAllocatedWidth < width) {
        ReportContractViolation(isNarrow ? "fAllocatedWidth >= 10" : "fAllocatedWidth >= 20", kSourcePath,
                                "PK::ResampleKernel::ScaleCubicKernel", isNarrow ? 541 : 599);
        return; // the rows would reach past the array
    }
    const int32_t centre = width / 2 - 1;
    FillRows(width, [scale, a, centre](int32_t k, double phase) {
        return KeysCubic((k - centre - phase) * scale, a);
    });
    int32_t low = 1000, high = -1000;
    for (int32_t i = 0; i < kPhases * width; ++i) {
        if (fKernel[static_cast<size_t>(i)] == 0) continue;
        low = std::min(low, i % width);
        high = std::max(high, i % width);
    }
    if (scale == 1.0f) {
        // A whole pixel is itself, untouched by what cutting does to weights.
        std::fill_n(fKernel.begin(), width, int16_t{0});
        fKernel[static_cast<size_t>(centre)] = kOne;
        return;
    }
    Trim(low, high);
}

/// Leaves out the columns before `low` and behind `high`, in which no row has a weight, but for one that makes the width
/// even: the pixel of the sample stays at half the width less one.
void ResampleKernel::Trim(int32_t low, int32_t high) {
    if ((high - low + 1) % 2 != 0) {
        if (high < fWidth - 1)
            ++high;
        else if (low > 0)
            --low;
    }
    const int32_t width = high - low + 1;
    if (width >= fWidth) return;
    if (low <= high) {
        int16_t* packed = fKernel.data(); // never ahead of the weight that it takes
        for (int32_t i = 0; i < kPhases; ++i) {
            const int16_t* const row = fKernel.data() + int64_t{i} * fWidth;
            for (int32_t k = low; k <= high; ++k) *packed++ = row[k];
        }
    }
    fWidth = static_cast<int16_t>(width);
}

} // namespace PK
