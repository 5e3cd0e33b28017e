#include <PixelKiln/ColorSpace.h>

#include <cmath>

namespace PK {

CSMatrix::CSMatrix() : m{1, 0, 0, 0, 1, 0, 0, 0, 1} {}

CSMatrix CSMatrix::operator*(const CSMatrix& other) const {
    CSMatrix product;
    for (int row = 0; row < 3; ++row)
        for (int column = 0; column < 3; ++column) {
            float sum = 0;
            for (int k = 0; k < 3; ++k) sum += m[3 * row + k] * other.m[3 * k + column];
            product.m[3 * row + column] = sum;
        }
    return product;
}

CSMatrix CSMatrix::Transposed() const {
    CSMatrix transposed;
    for (int row = 0; row < 3; ++row)
        for (int column = 0; column < 3; ++column) transposed.m[3 * column + row] = m[3 * row + column];
    return transposed;
}

CSMatrix CSMatrix::Inverted(bool* ok) const {
    constexpr float kLeastDeterminant = 1e-6f;
    const float cofactors[3] = {m[4] * m[8] - m[7] * m[5], m[5] * m[6] - m[8] * m[3],
                                m[7] * m[3] - m[4] * m[6]};
    const float determinant = m[0] * cofactors[0] + m[1] * cofactors[1] + m[2] * cofactors[2];
    const bool isSingular = kLeastDeterminant > std::abs(determinant);
    if (ok != nullptr) *ok = !isSingular;
    CSMatrix inverse;
    if (isSingular) return inverse;
    const float r = 1 / determinant;
    inverse.m[0] = cofactors[0] * r;
    inverse.m[1] = (m[7] * m[2] - m[8] * m[1]) * r;
    inverse.m[2] = (m[5] * m[1] - m[4] * m[2]) * r;
    inverse.m[3] = cofactors[1] * r;
    inverse.m[4] = (m[8] * m[0] - m[6] * m[2]) * r;
    inverse.m[5] = (m[2] * m[3] - m[5] * m[0]) * r;
    inverse.m[6] = cofactors[2] * r;
    inverse.m[7] = (m[6] * m[1] - m[7] * m[0]) * r;
    inverse.m[8] = (m[0] * m[4] - m[1] * m[3]) * r;
    return inverse;
}

} // namespace PK
