#pragma once

// Colour science in double precision, from the standards' own formulas and figures, to hold the library against. It
// includes nothing of the library.

#include <array>
#include <cmath>

namespace exact {

/// SMPTE ST 2084: from luminance in cd/m2 to the signal, and back.
inline constexpr double kM1 = 2610.0 / 16384, kM2 = 2523.0 / 4096 * 128;
inline constexpr double kC2 = 2413.0 / 4096 * 32, kC3 = 2392.0 / 4096 * 32, kC1 = kC3 - kC2 + 1;

inline double PQSignal(double luminance) {
    const double power = std::pow(luminance / 10000, kM1);
    return std::pow((kC1 + kC2 * power) / (1 + kC3 * power), kM2);
}

inline double PQLuminance(double signal) {
    const double power = std::pow(signal, 1 / kM2);
    return 10000 * std::pow(std::fmax(power - kC1, 0) / (kC2 - kC3 * power), 1 / kM1);
}

/// ITU-R BT.2100, hybrid log-gamma: from scene light, 0 to 1, to the signal, and back.
inline double HLGSignal(double sceneLight) {
    const double a = 0.17883277, b = 1 - 4 * a, c = 0.5 - a * std::log(4 * a);
    return sceneLight <= 1.0 / 12 ? std::sqrt(3 * sceneLight) : a * std::log(12 * sceneLight - b) + c;
}

inline double HLGSceneLight(double signal) {
    const double a = 0.17883277, b = 1 - 4 * a, c = 0.5 - a * std::log(4 * a);
    return signal <= 0.5 ? signal * signal / 3 : (std::exp((signal - c) / a) + b) / 12;
}

/// R, G, B.
using Triple = std::array<double, 3>;

inline double Luminance2020(const Triple& c) {
    return 0.2627 * c[0] + 0.6780 * c[1] + 0.0593 * c[2];
}

/// The reference display of BT.2100 with a peak of 1000 cd/m2, and its inverse: scene light, 0 to 1, and cd/m2.
inline Triple HLGDisplayLight(const Triple& scene) {
    const double gain = 1000 * std::pow(Luminance2020(scene), 0.2);
    return {gain * scene[0], gain * scene[1], gain * scene[2]};
}

inline Triple HLGSceneLight(const Triple& display) {
    const double Y = Luminance2020(display) / 1000;
    const double gain = Y > 0 ? std::pow(Y, 1 / 1.2 - 1) / 1000 : 0;
    return {gain * display[0], gain * display[1], gain * display[2]};
}

/// Row by row.
using Matrix = std::array<double, 9>;

inline Triple Apply(const Matrix& m, const Triple& v) {
    return {m[0] * v[0] + m[1] * v[1] + m[2] * v[2], m[3] * v[0] + m[4] * v[1] + m[5] * v[2],
            m[6] * v[0] + m[7] * v[1] + m[8] * v[2]};
}

inline Matrix Multiply(const Matrix& a, const Matrix& b) {
    Matrix product{};
    for (size_t i = 0; i < 9; ++i)
        for (size_t k = 0; k < 3; ++k) product[i] += a[i / 3 * 3 + k] * b[3 * k + i % 3];
    return product;
}

inline Matrix Inverse(const Matrix& m) {
    const auto minor = [&](size_t row, size_t column) {
        const size_t r0 = row == 0 ? 1 : 0, r1 = row == 2 ? 1 : 2;
        const size_t c0 = column == 0 ? 1 : 0, c1 = column == 2 ? 1 : 2;
        return m[3 * r0 + c0] * m[3 * r1 + c1] - m[3 * r0 + c1] * m[3 * r1 + c0];
    };
    const double determinant = m[0] * minor(0, 0) - m[1] * minor(0, 1) + m[2] * minor(0, 2);
    Matrix inverse{};
    for (size_t row = 0; row < 3; ++row)
        for (size_t column = 0; column < 3; ++column)
            inverse[3 * row + column] = ((row + column) % 2 == 0 ? 1 : -1) * minor(column, row) / determinant;
    return inverse;
}

/// x and y of red, green, blue and white.
struct Gamut {
    double x[4], y[4];
};

/// ITU-R BT.709, ITU-R BT.2020, and the primaries of SMPTE RP 431-2 with the white of the others.
inline constexpr Gamut kRec709 = {{0.640, 0.300, 0.150, 0.3127}, {0.330, 0.600, 0.060, 0.3290}};
inline constexpr Gamut kRec2020 = {{0.708, 0.170, 0.131, 0.3127}, {0.292, 0.797, 0.046, 0.3290}};
inline constexpr Gamut kP3D65 = {{0.680, 0.265, 0.150, 0.3127}, {0.320, 0.690, 0.060, 0.3290}};

inline Triple XYZ(const Gamut& gamut, size_t i) {
    return {gamut.x[i] / gamut.y[i], 1, (1 - gamut.x[i] - gamut.y[i]) / gamut.y[i]};
}

/// Linear RGB to XYZ, so that (1, 1, 1) is white of luminance 1 (SMPTE RP 177).
inline Matrix ToXYZ(const Gamut& gamut) {
    Matrix m{};
    for (size_t i = 0; i < 3; ++i)
        for (size_t row = 0; row < 3; ++row) m[3 * row + i] = XYZ(gamut, i)[row];
    const Triple scale = Apply(Inverse(m), XYZ(gamut, 3));
    for (size_t i = 0; i < 9; ++i) m[i] *= scale[i % 3];
    return m;
}

/// Linear RGB of one gamut to that of another of the same white.
inline Matrix Between(const Gamut& from, const Gamut& to) {
    return Multiply(Inverse(ToXYZ(to)), ToXYZ(from));
}

} // namespace exact
