#include "LargePictures.h"

#include "Charts.h"
#include "Reducer.h"

#include "Png.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <numbers>

namespace Scaling {
namespace {

constexpr double kWhite = 255, kGamma = 2.4;
constexpr int32_t kLobes = 16, kReach = 2 * kLobes; // pixels of the source to each side

size_t IndexOf(int32_t x, int32_t y, int32_t width) {
    return static_cast<size_t>(y) * static_cast<size_t>(width) + static_cast<size_t>(x);
}

/// Of a place in a picture that is repeated in turns with its mirror image.
int32_t Mirrored(int32_t place, int32_t length) {
    const int32_t inBoth = place % (2 * length);
    return std::min(inBoth, 2 * length - 1 - inBoth);
}

double Sinc(double x) {
    return std::sin(std::numbers::pi * x) / (std::numbers::pi * x);
}

/// Of the pixels from kReach left of the middle between two to kReach right of it.
std::array<double, 2 * kReach> SincWeights() {
    std::array<double, 2 * kReach> weights;
    double sum = 0;
    for (int32_t i = 0; i < 2 * kReach; ++i) {
        const double lobe = (i + 0.5 - kReach) / 2;
        sum += weights[static_cast<size_t>(i)] = Sinc(lobe) * Sinc(lobe / kLobes);
    }
    for (double& weight : weights) weight /= sum;
    return weights;
}

/// Halves the rows and turns columns to rows.
std::vector<double> HalvedAndTurned(const std::vector<double>& samples, int32_t width, int32_t height) {
    static const std::array weights = SincWeights();
    const auto half = static_cast<size_t>(width) / 2;
    std::vector<double> turned(samples.size() / 2), sums(half);
    std::vector<double> row(static_cast<size_t>(width + 2 * kReach));
    std::vector<double> phases[2] = {std::vector<double>(row.size() / 2),
                                     std::vector<double>(row.size() / 2)};
    for (int32_t y = 0; y < height; ++y) {
        const auto first = samples.begin() + static_cast<ptrdiff_t>(IndexOf(0, y, width));
        std::fill_n(row.begin(), kReach, *first);
        std::copy_n(first, width, row.begin() + kReach);
        std::fill_n(row.end() - kReach, kReach, first[width - 1]);
        for (size_t i = 0; i < row.size(); ++i) phases[i % 2][i / 2] = row[i];
        std::ranges::fill(sums, 0.0);
        for (size_t i = 0; i < weights.size(); ++i) { // place 2 x + 1 + i of the row
            const double* const places = phases[(i + 1) % 2].data() + (i + 1) / 2;
            for (size_t x = 0; x < half; ++x) sums[x] += weights[i] * places[x];
        }
        for (size_t x = 0; x < half; ++x) turned[IndexOf(y, static_cast<int32_t>(x), height)] = sums[x];
    }
    return turned;
}

} // namespace

tool::Frame LargePlates() {
    const Grey plate = ZonePlate();
    tool::Frame picture(kPixels, kLargeWidth, kLargeHeight);
    for (int32_t y = 0; y < kLargeHeight; ++y)
        for (int32_t x = 0; x < kLargeWidth; ++x) {
            const auto value = static_cast<double>(plate.Row(y % kSide)[x % kSide]);
            std::fill_n(picture.Row(y) + 4 * x, 3, static_cast<uint8_t>(std::lround(value * kWhite)));
            picture.Row(y)[4 * x + 3] = 255;
        }
    return picture;
}

tool::Frame LargePhotographs(const std::vector<std::string>& names) {
    tool::Frame picture(kPixels, kLargeWidth, kLargeHeight);
    const auto count = static_cast<int32_t>(names.size());
    for (int32_t i = 0; i < count; ++i) {
        const tool::Frame photograph =
            tool::Converted(tool::ReadPng(names[static_cast<size_t>(i)]), kPixels, tool::kDefaultQuality);
        const int32_t left = kLargeWidth * i / count, right = kLargeWidth * (i + 1) / count;
        for (int32_t y = 0; y < kLargeHeight; ++y)
            for (int32_t x = left; x < right; ++x)
                std::copy_n(photograph.Row(Mirrored(y, photograph.Height())) +
                                4 * Mirrored(x - left, photograph.Width()),
                            4, picture.Row(y) + 4 * x);
    }
    return picture;
}

Ideal IdealHalf(const tool::Frame& picture, bool isOfLight) {
    const double power = isOfLight ? kGamma : 1;
    std::array<double, 256> values;
    for (size_t code = 0; code < values.size(); ++code)
        values[code] = std::pow(static_cast<double>(code) / kWhite, power);
    Ideal ideal;
    for (int32_t channel = 0; channel < 3; ++channel) {
        std::vector<double> samples(static_cast<size_t>(kLargeWidth) * kLargeHeight);
        for (int32_t y = 0; y < kLargeHeight; ++y)
            for (int32_t x = 0; x < kLargeWidth; ++x)
                samples[IndexOf(x, y, kLargeWidth)] = values[picture.Row(y)[4 * x + channel]];
        samples =
            HalvedAndTurned(HalvedAndTurned(samples, kLargeWidth, kLargeHeight), kLargeHeight, kHalfWidth);
        for (double& sample : samples) sample = kWhite * std::pow(std::clamp(sample, 0.0, 1.0), 1 / power);
        ideal.channels[channel] = std::move(samples);
    }
    return ideal;
}

tool::Frame Rounded(const Ideal& ideal) {
    tool::Frame half(kPixels, kHalfWidth, kHalfHeight);
    for (int32_t y = 0; y < kHalfHeight; ++y)
        for (int32_t x = 0; x < kHalfWidth; ++x) {
            uint8_t* const pixel = half.Row(y) + 4 * x;
            for (int32_t channel = 0; channel < 3; ++channel)
                pixel[channel] =
                    static_cast<uint8_t>(std::lround(ideal.channels[channel][IndexOf(x, y, kHalfWidth)]));
            pixel[3] = 255;
        }
    return half;
}

double SignalToNoise(const tool::Frame& half, const Ideal& ideal) {
    constexpr int32_t kBorder = 32;
    double squares = 0;
    for (int32_t y = kBorder; y < kHalfHeight - kBorder; ++y)
        for (int32_t x = kBorder; x < kHalfWidth - kBorder; ++x)
            for (int32_t channel = 0; channel < 3; ++channel) {
                const double error =
                    half.Row(y)[4 * x + channel] - ideal.channels[channel][IndexOf(x, y, kHalfWidth)];
                squares += error * error;
            }
    const double samples = 3.0 * (kHalfWidth - 2 * kBorder) * (kHalfHeight - 2 * kBorder);
    return 10 * std::log10(kWhite * kWhite * samples / squares);
}

} // namespace Scaling
