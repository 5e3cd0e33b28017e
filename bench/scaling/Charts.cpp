#include "Charts.h"

#include "Png.h"

#include <cmath>
#include <numbers>

namespace Scaling {
namespace {

const double kSlope = std::tan(5 * std::numbers::pi / 180);
constexpr double kSigma = 0.8;

template <typename Value>
Grey Chart(int32_t width, Value value) {
    Grey chart(width, kSide);
    for (int32_t y = 0; y < kSide; ++y)
        for (int32_t x = 0; x < width; ++x)
            chart.Row(y)[x] = static_cast<float>(value(x + 0.5, y + 0.5 - kMiddle));
    return chart;
}

} // namespace

double ZonePlateAt(double x, double y) {
    return 0.5 + kAmplitude * std::cos(std::numbers::pi * (x * x + y * y) / kSide);
}

Grey ZonePlate() {
    return Chart(kSide, [](double x, double y) { return ZonePlateAt(x - kMiddle, y); });
}

double SlantedEdgeAt(double y) {
    return -y * kSlope;
}

Grey SlantedEdge(int32_t width, double column) {
    return Chart(width, [column](double x, double y) {
        const double distance = (x - column - SlantedEdgeAt(y)) / std::hypot(1, kSlope);
        return 0.5 + kAmplitude * std::erf(distance / (kSigma * std::numbers::sqrt2));
    });
}

Grey Transposed(const Grey& grey) {
    Grey turned(grey.height, grey.width);
    for (int32_t y = 0; y < grey.height; ++y)
        for (int32_t x = 0; x < grey.width; ++x) turned.Row(x)[y] = grey.Row(y)[x];
    return turned;
}

Grey Photograph(const std::string& name) {
    constexpr int32_t kMultiple = 40;
    const tool::Frame picture =
        tool::Converted(tool::ReadPng(name), PK_PixelFormat_BGRA_4444_8u, tool::kDefaultQuality);
    Grey luma(picture.Width() / kMultiple * kMultiple, picture.Height() / kMultiple * kMultiple);
    const int32_t left = (picture.Width() - luma.width) / 2, top = (picture.Height() - luma.height) / 2;
    for (int32_t y = 0; y < luma.height; ++y)
        for (int32_t x = 0; x < luma.width; ++x) {
            const uint8_t* const pixel = picture.Row(top + y) + 4 * (left + x);
            luma.Row(y)[x] =
                static_cast<float>((0.0722 * pixel[0] + 0.7152 * pixel[1] + 0.2126 * pixel[2]) / 255);
        }
    return luma;
}

} // namespace Scaling
