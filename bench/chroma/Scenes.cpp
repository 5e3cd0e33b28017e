#include "Scenes.h"

#include <cmath>
#include <numbers>

namespace ChromaBench {
namespace {

constexpr double kMiddle = (kSide - 1) / 2.0, kGrey = 128, kAmplitude = 100;

/// From 0 on one side of an edge to 1 on the other.
double Step(double distance, double sigma) {
    return 0.5 + 0.5 * std::erf(distance / (sigma * std::numbers::sqrt2));
}

double Between(double a, double b, double share) {
    return a + (b - a) * share;
}

Codes Mixed(const Codes& a, const Codes& b, double share) {
    return {Between(a.y, b.y, share), Between(a.u, b.u, share), Between(a.v, b.v, share)};
}

} // namespace

Scene ZonePlate(const Kind& kind) {
    const double rows = kind.areFields ? 0.5 : 1;
    return [rows](double x, double y, int32_t) {
        const double dx = x - kMiddle, dy = y - kMiddle;
        const double phase = std::numbers::pi * 0.4 * (dx * dx + rows * dy * dy) / kSide;
        return Codes{kGrey, kGrey + kAmplitude * std::cos(phase), kGrey - kAmplitude * std::cos(phase)};
    };
}

Scene Disc() {
    return [](double x, double y, int32_t) {
        const double distance = kSide / 3.0 - std::hypot(x - kMiddle, y - kMiddle);
        const double code = kAmplitude * (2 * Step(distance, 1.5) - 1);
        return Codes{kGrey, kGrey + code, kGrey - code};
    };
}

Codes MovingDisc(double x, double y, int32_t time) {
    constexpr Codes kBack = {150, 128, 128}, kRed = {81, 90, 240}, kBlue = {90, 220, 110},
                    kYellow = {180, 50, 150};
    constexpr double kRadius = 20, kMove = 12, kSoftness = 1.5;
    constexpr double kStripes = 30, kPeriod = 24;
    constexpr double kBars = 104, kBarsPeriod = 11, kHardness = 0.8;
    if (x < kStripes) {
        const double wave = std::fmod(y + 0.15 * x + kPeriod, kPeriod) - kPeriod / 2;
        return Mixed(kBlue, kYellow, Step(kPeriod / 4 - std::abs(wave), kSoftness));
    }
    if (x >= kBars) {
        const double wave = std::fmod(x - kBars, kBarsPeriod) - kBarsPeriod / 2;
        return Mixed(kBack, kRed, Step(kBarsPeriod / 4 - std::abs(wave), kHardness));
    }
    const double left = 55 + kMove * time;
    return Mixed(kBack, kRed, Step(kRadius - std::hypot(x - left, y - kMovingHeight / 2.0), kSoftness));
}

} // namespace ChromaBench
