#include "colour/Caches.h"
#include "colour/MatrixColumn.h"

#include <cmath>
#include <iterator>

namespace PK {

namespace {

constexpr float kSameWhite = 1e-6f;

// Rows of x and y. White points are compared by three floats, so that one more stands behind the last row.
constexpr float kIlluminants[] = {
    0.34567f, 0.3585f,  // D50
    0.33242f, 0.34743f, // D55
    0.32168f, 0.33767f, // D60
    0.314f,   0.351f,   // DCI
    0.31271f, 0.32902f, // D65
    0.29902f, 0.31485f, // D75
    1e-6f,
};

/// X, Y and Z of white, with luminance 1.
Column WhiteXYZ(const float* white) {
    return {{white[0] / white[1], 1, (1 - white[1] - white[0]) / white[1]}};
}

CSMatrix ScaleColumns(const CSMatrix& matrix, const Column& factors) {
    CSMatrix result;
    for (int i = 0; i < 9; ++i) result.m[i] = matrix.m[i] * factors.c[i % 3];
    return result;
}

CSMatrix BradfordMatrix() {
    return MatrixOf({0.8951f, 0.2664f, -0.1614f, -0.7502f, 1.7135f, 0.0367f, 0.0389f, -0.0685f, 1.0296f});
}

/// Stops at the first that differ, so that nothing is read behind a pair that tells the whites apart.
bool AreClose(const float* a, const float* b, int count) {
    for (int i = 0; i < count; ++i)
        if (!(std::abs(a[i] - b[i]) <= kSameWhite)) return false;
    return true;
}

} // namespace

ColorSpace::ColorSpace() = default;

ColorSpace::ColorSpace(const ColorSpace& other) {
    *this = other;
}

ColorSpace::ColorSpace(ColorSpace&& other) : ColorSpace(other) {}

ColorSpace& ColorSpace::operator=(const ColorSpace& other) {
    const std::scoped_lock lock(FirstUseMutex());
    rgbToXYZ = other.rgbToXYZ;
    xyzToRGB = other.xyzToRGB;
    matricesValid = other.matricesValid;
    return *this;
}

ColorSpace& ColorSpace::operator=(ColorSpace&& other) {
    return *this = other;
}

const CSMatrix& ColorSpace::RGBtoXYZ() const {
    if (!matricesValid) CalculateMatrices();
    return rgbToXYZ;
}

const CSMatrix& ColorSpace::XYZtoRGB() const {
    if (!matricesValid) CalculateMatrices();
    return xyzToRGB;
}

const float* ColorSpace::Illuminant(PK_Illuminant illuminant) {
    return kIlluminants + 2 * static_cast<size_t>(illuminant);
}

void ColorSpace::CalculateLumaCoeffs(float* coeffs) const {
    for (int i = 0; i < 3; ++i) coeffs[i] = RGBtoXYZ().m[3 + i];
}

void ColorSpace::CalculateMatrices() const {
    const float* xy = Primaries();
    CSMatrix primaries;
    for (int i = 0; i < 3; ++i) {
        const float x = xy[2 * i], y = xy[2 * i + 1];
        primaries.m[i] = x / y;
        primaries.m[3 + i] = 1;
        primaries.m[6 + i] = (1 - x - y) / y;
    }
    const CSMatrix toXYZ = ScaleColumns(primaries, primaries.Inverted() * WhiteXYZ(WhitePoint()));
    const CSMatrix toRGB = toXYZ.Inverted();

    const std::scoped_lock lock(FirstUseMutex());
    // A reader that has its reference may be at it: what is right already is not written again.
    if (!AreSameBits(rgbToXYZ.m, toXYZ.m, std::size(toXYZ.m))) rgbToXYZ = toXYZ;
    if (!AreSameBits(xyzToRGB.m, toRGB.m, std::size(toRGB.m))) xyzToRGB = toRGB;
}

CSMatrix ColorSpace::CalculateConversionMatrix(const ColorSpace& from, const ColorSpace& to) {
    const float *fromWhite = from.WhitePoint(), *toWhite = to.WhitePoint();
    if (AreClose(fromWhite, toWhite, 2)) return to.XYZtoRGB() * from.RGBtoXYZ();
    return to.XYZtoRGB() * CalculateAdaptationMatrix(fromWhite, toWhite) * from.RGBtoXYZ();
}

CSMatrix ColorSpace::CalculateAdaptationMatrix(const float* fromWhite, const float* toWhite) {
    if (AreClose(fromWhite, toWhite, 3)) return {};
    const CSMatrix bradford = BradfordMatrix();
    const Column from = bradford * WhiteXYZ(fromWhite), to = bradford * WhiteXYZ(toWhite);
    const Column ratios = {{to.c[0] / from.c[0], to.c[1] / from.c[1], to.c[2] / from.c[2]}};
    return ScaleColumns(bradford.Inverted(), ratios) * bradford;
}

} // namespace PK
