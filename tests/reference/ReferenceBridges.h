#pragma once

// The codec bridges restated, slowly: one row of words or bytes at a time, in plain scalar arithmetic.

#include <array>
#include <cstdint>
#include <vector>

namespace PKTest {

using Bytes = std::vector<uint8_t>;

Bytes ReferenceRGB8ToBGRA(const Bytes& source, int width);
Bytes ReferenceDNxHDToRGB10(const Bytes& source, int width);
/// The fourth word of each pixel is that of \p before.
Bytes ReferenceRGB10ToDNxHD(const Bytes& source, int width, const Bytes& before);
/// The whole row with its last group, or without it.
Bytes ReferenceUYVY10ToV210(const Bytes& source, int width, bool withPartialGroup);
Bytes ReferenceV210ToUYVY10(const Bytes& source, int width);
Bytes ReferenceBGR16ToRGB10(const Bytes& source, int width);
Bytes ReferenceRGB10ToBGR16(const Bytes& source, int width);
Bytes ReferenceOffsetUYVY32f(const Bytes& source, int width);
Bytes ReferenceXRGB15(const Bytes& source, int width, bool rounded);
Bytes ReferenceHalve16(const Bytes& source, int width, bool swap);

/// What a pixel of gamma-coded XYZ is in linear B, G, R, and how large the terms of each sum are together.
struct LinearBGR {
    std::array<long double, 3> values;
    std::array<long double, 3> terms;
};
LinearBGR ReferenceLinearBGR(const float* zyx);

/// Samples of one row of planes.
struct PlanarRow {
    std::vector<uint32_t> y, u, v;
};

PlanarRow ReferenceAverage(const PlanarRow& a, const PlanarRow& b);
PlanarRow ReferenceEverySecond(const PlanarRow& row, int width);
/// Whole groups, the last filled up with the last sample of each plane.
Bytes ReferencePlanarToV210(const PlanarRow& row, int width);
Bytes ReferencePlanarToVUYX(const PlanarRow& row, int width);

} // namespace PKTest
