#include "Difference.h"

#include "Numbers.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <limits>

namespace tool {
namespace {

constexpr double kWhite = 255.0;
constexpr int kAlpha = 3; // channels are B, G, R, A

template <typename Sample>
Difference Measure(const Frame& a, const Frame& b, double stepsPerUnit) {
    Difference difference;
    double squares = 0;
    for (int32_t y = 0; y < a.Height(); ++y) {
        const auto* rowA = reinterpret_cast<const Sample*>(a.Row(y));
        const auto* rowB = reinterpret_cast<const Sample*>(b.Row(y));
        for (int32_t x = 0; x < a.Width(); ++x) {
            bool differs = false;
            for (int channel = 0; channel < 4; ++channel) {
                const double apart = std::fabs(static_cast<double>(rowA[4 * x + channel]) -
                                               static_cast<double>(rowB[4 * x + channel]));
                const double steps =
                    std::isnan(apart) ? std::numeric_limits<double>::infinity() : apart * stepsPerUnit;
                differs = differs || steps > 0;
                double& largest = channel == kAlpha ? difference.largestAlpha : difference.largestColour;
                largest = std::max(largest, steps);
                if (channel != kAlpha) squares += steps * steps;
            }
            difference.differingPixels += differs;
        }
    }
    const double samples = 3.0 * a.Width() * a.Height();
    difference.psnr = 10 * std::log10(kWhite * kWhite * samples / squares);
    return difference;
}

} // namespace

Difference MeasureDifference(const Frame& a, const Frame& b) {
    if (a.Format() == PK_PixelFormat_BGRA_4444_32f) return Measure<float>(a, b, kWhite);
    return Measure<uint8_t>(a, b, 1.0);
}

Frame DifferencePicture(const Frame& a, const Frame& b, int factor) {
    Frame picture(a.Format(), a.Width(), a.Height());
    for (int32_t y = 0; y < a.Height(); ++y) {
        const uint8_t* rowA = a.Row(y);
        const uint8_t* rowB = b.Row(y);
        uint8_t* row = picture.Row(y);
        for (int32_t i = 0; i < 4 * a.Width(); ++i)
            row[i] = static_cast<uint8_t>(
                i % 4 == kAlpha ? 255 : std::min(255, factor * std::abs(int{rowA[i]} - int{rowB[i]})));
    }
    return picture;
}

std::string PsnrText(double psnr) {
    if (std::isinf(psnr)) return psnr > 0 ? "infinite" : "not a number";
    return Formatted("%.1f dB", psnr);
}

} // namespace tool
