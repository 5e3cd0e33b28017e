#pragma once

// Colour science in double precision, from the standards' own formulas and figures, to hold the library against. It
// includes nothing of the library.

#include "colour/ReferenceColorimetry.h"

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

using Matrix = PKTest::Matrix3<double>;

inline Triple Apply(const Matrix& m, const Triple& v) {
    return PKTest::Times(m, v);
}

/// x and y of red, green, blue and white.
struct Gamut {
    double primaries[6], white[2];
};

/// ITU-R BT.709, ITU-R BT.2020, and the primaries of SMPTE RP 431-2 with the white of the others.
inline constexpr Gamut kRec709 = {{0.640, 0.330, 0.300, 0.600, 0.150, 0.060}, {0.3127, 0.3290}};
inline constexpr Gamut kRec2020 = {{0.708, 0.292, 0.170, 0.797, 0.131, 0.046}, {0.3127, 0.3290}};
inline constexpr Gamut kP3D65 = {{0.680, 0.320, 0.265, 0.690, 0.150, 0.060}, {0.3127, 0.3290}};

/// Linear RGB to XYZ, so that (1, 1, 1) is white of luminance 1 (SMPTE RP 177).
inline Matrix ToXYZ(const Gamut& gamut) {
    return PKTest::RGBToXYZOf<double>(gamut.primaries, gamut.white);
}

/// Linear RGB of one gamut to that of another of the same white.
inline Matrix Between(const Gamut& from, const Gamut& to) {
    return PKTest::Times(PKTest::Inverse(ToXYZ(to)), ToXYZ(from));
}

} // namespace exact
