#include "Measures.h"

#include "Charts.h"

#include <algorithm>
#include <cmath>

namespace Scaling {
namespace {

constexpr double kContrast = kAmplitude * kAmplitude / 2; // mean square of the plate's rings

double Square(double x) {
    return x * x;
}

struct EdgeRows {
    double mean, wobble;
};

/// The mean place of the rise in a row, from the left end of it, near where it is looked for.
double PlaceOfRise(const float* row, int32_t width, double near, double reach) {
    double sum = 0, moment = 0;
    const auto first = static_cast<int32_t>(std::max(1.0, std::ceil(near - reach)));
    const auto last = static_cast<int32_t>(std::min(width - 1.0, std::floor(near + reach)));
    for (int32_t x = first; x <= last; ++x) {
        const double rise = static_cast<double>(row[x]) - static_cast<double>(row[x - 1]);
        sum += rise;
        moment += rise * x;
    }
    return moment / sum;
}

/// Where no border is near.
double BrightestOfMiddle(const Grey& grey) {
    float most = 0;
    for (int32_t y = grey.height / 4; y < grey.height * 3 / 4; ++y)
        for (int32_t x = grey.width / 4; x < grey.width * 3 / 4; ++x) most = std::max(most, grey.Row(y)[x]);
    return static_cast<double>(most);
}

/// Over the rows of the middle, where no border is near.
/// \param column  of the edge before it was scaled.
EdgeRows MeasureRows(const Grey& edge, double scale, double column) {
    constexpr double kShare = 0.75, kReach = 10;
    std::vector<double> errors;
    for (int32_t row = 0; row < edge.height; ++row) {
        const double y = (row + 0.5 - edge.height / 2.0) / scale;
        if (std::abs(y) > kShare * kMiddle) continue;
        const double wanted = (column + SlantedEdgeAt(y)) * scale;
        errors.push_back(PlaceOfRise(edge.Row(row), edge.width, wanted, kReach * std::max(1.0, scale)) -
                         wanted);
    }
    EdgeRows rows = {};
    for (const double error : errors) rows.mean += error / static_cast<double>(errors.size());
    for (const double error : errors) rows.wobble = std::max(rows.wobble, std::abs(error - rows.mean));
    return rows;
}

} // namespace

int32_t ScaledSide(int32_t side, double scale) {
    return static_cast<int32_t>(std::lround(side * scale));
}

double ThereAndBack(const Scaler& scaler, const Grey& picture, double scale) {
    constexpr int32_t kBorder = 32;
    const Grey there =
        scaler.scale(picture, ScaledSide(picture.width, scale), ScaledSide(picture.height, scale));
    const Grey back = scaler.scale(there, picture.width, picture.height);
    double squares = 0;
    for (int32_t y = kBorder; y < picture.height - kBorder; ++y)
        for (int32_t x = kBorder; x < picture.width - kBorder; ++x)
            squares += Square(static_cast<double>(back.Row(y)[x]) - static_cast<double>(picture.Row(y)[x]));
    const double pixels = 1.0 * (picture.width - 2 * kBorder) * (picture.height - 2 * kBorder);
    return -10 * std::log10(squares / pixels);
}

PlateFigures MeasurePlate(const Scaler& scaler, double scale) {
    const int32_t side = ScaledSide(kSide, scale);
    const Grey plate = scaler.scale(ZonePlate(), side, side);
    const double limit = std::min(1.0, scale) * kMiddle;
    constexpr double kBorder = 16;
    double error = 0, aliasing = 0;
    int64_t held = 0, tooFine = 0;
    for (int32_t row = 0; row < side; ++row)
        for (int32_t column = 0; column < side; ++column) {
            const double x = (column + 0.5 - side / 2.0) / scale, y = (row + 0.5 - side / 2.0) / scale;
            const double distance = std::max(std::abs(x), std::abs(y));
            const auto value = static_cast<double>(plate.Row(row)[column]);
            if (distance < 0.8 * limit) {
                error += Square(value - ZonePlateAt(x, y));
                ++held;
            } else if (distance > 1.1 * limit && distance < kMiddle - kBorder) {
                aliasing += Square(value - 0.5);
                ++tooFine;
            }
        }
    return {tooFine > 0 ? aliasing / static_cast<double>(tooFine) / kContrast : 0,
            error / static_cast<double>(held) / kContrast};
}

EdgeFigures MeasureEdge(const Scaler& scaler, double scale) {
    const int32_t side = ScaledSide(kSide, scale);
    const Grey edge = SlantedEdge();
    const Grey scaled = scaler.scale(edge, side, side);
    const EdgeRows x = MeasureRows(scaled, scale, kMiddle);
    const EdgeRows y = MeasureRows(Transposed(scaler.scale(Transposed(edge), side, side)), scale, kMiddle);
    return {x.mean, y.mean, std::max(x.wobble, y.wobble),
            std::max(0.0, (BrightestOfMiddle(scaled) - (0.5 + kAmplitude)) / (2 * kAmplitude))};
}

Range MeasureWhite(const Scaler& scaler, double scale) {
    Grey white(kSide, kSide);
    std::ranges::fill(white.samples, 1.0f);
    const int32_t side = ScaledSide(kSide, scale);
    const auto [least, most] = std::ranges::minmax(scaler.scale(white, side, side).samples);
    return {static_cast<double>(least), static_cast<double>(most)};
}

double MeasureEdgeOfRow(const Scaler& scaler, double scale, double part) {
    constexpr int32_t kRow = 1920;
    const int32_t width = ScaledSide(kRow, 1 / scale);
    const double column = part * width;
    const Grey edge = scaler.scale(SlantedEdge(width, column), kRow, ScaledSide(kSide, scale));
    return MeasureRows(edge, scale, column).mean;
}

} // namespace Scaling
