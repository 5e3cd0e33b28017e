#pragma once

// The colorimetry of a colour space written out: in single precision with every operation rounded, to be met to the bit,
// and in double precision from the definitions, to be met closely.

#include <array>
#include <cmath>
#include <cstddef>

namespace PKTest {

template <class Number>
using Matrix3 = std::array<std::array<Number, 3>, 3>;
template <class Number>
using Vector3 = std::array<Number, 3>;

template <class Number>
constexpr Vector3<Number> Times(const Matrix3<Number>& m, const Vector3<Number>& v) {
    Vector3<Number> result;
    for (size_t i = 0; i < 3; ++i) result[i] = m[i][0] * v[0] + m[i][1] * v[1] + m[i][2] * v[2];
    return result;
}

template <class Number>
Matrix3<Number> Times(const Matrix3<Number>& a, const Matrix3<Number>& b) {
    Matrix3<Number> result;
    for (size_t i = 0; i < 3; ++i)
        for (size_t j = 0; j < 3; ++j)
            result[i][j] = Number{0} + a[i][0] * b[0][j] + a[i][1] * b[1][j] + a[i][2] * b[2][j];
    return result;
}

/// By cofactors, which are the rows' minors in this order.
template <class Number>
Matrix3<Number> Inverse(const Matrix3<Number>& m) {
    const auto& [a, b, c] = m;
    const Vector3<Number> first = {b[1] * c[2] - c[1] * b[2], b[2] * c[0] - c[2] * b[0],
                                   c[1] * b[0] - b[1] * c[0]};
    const Number r = 1 / (a[0] * first[0] + a[1] * first[1] + a[2] * first[2]);
    return {{{first[0] * r, (c[1] * a[2] - c[2] * a[1]) * r, (b[2] * a[1] - b[1] * a[2]) * r},
             {first[1] * r, (c[2] * a[0] - c[0] * a[2]) * r, (a[2] * b[0] - b[2] * a[0]) * r},
             {first[2] * r, (c[0] * a[1] - c[1] * a[0]) * r, (a[0] * b[1] - a[1] * b[0]) * r}}};
}

template <class Number, class Figure>
Vector3<Number> WhiteOf(const Figure* xy) {
    const Number x = static_cast<Number>(xy[0]), y = static_cast<Number>(xy[1]);
    return {x / y, 1, (1 - y - x) / y};
}

template <class Number, class Figure>
Matrix3<Number> RGBToXYZOf(const Figure* primaries, const Figure* white) {
    Matrix3<Number> chromaticities;
    for (size_t i = 0; i < 3; ++i) {
        const Number x = static_cast<Number>(primaries[2 * i]), y = static_cast<Number>(primaries[2 * i + 1]);
        chromaticities[0][i] = x / y;
        chromaticities[1][i] = 1;
        chromaticities[2][i] = (1 - x - y) / y;
    }
    const Vector3<Number> scales = Times(Inverse(chromaticities), WhiteOf<Number>(white));
    for (auto& row : chromaticities)
        for (size_t j = 0; j < 3; ++j) row[j] = row[j] * scales[j];
    return chromaticities;
}

template <class Number>
Matrix3<Number> AdaptationOf(const float* from, const float* to) {
    // The figures are decimal fractions: those of single precision are rounded to it.
    const auto figure = [](double x) { return static_cast<Number>(x); };
    const Matrix3<Number> bradford = {{{figure(0.8951), figure(0.2664), figure(-0.1614)},
                                       {figure(-0.7502), figure(1.7135), figure(0.0367)},
                                       {figure(0.0389), figure(-0.0685), figure(1.0296)}}};
    const Vector3<Number> fromCones = Times(bradford, WhiteOf<Number>(from));
    const Vector3<Number> toCones = Times(bradford, WhiteOf<Number>(to));
    Matrix3<Number> scaled = Inverse(bradford);
    for (auto& row : scaled)
        for (size_t j = 0; j < 3; ++j) row[j] = row[j] * (toCones[j] / fromCones[j]);
    return Times(scaled, bradford);
}

} // namespace PKTest
