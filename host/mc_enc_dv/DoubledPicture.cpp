#include "mc_enc_dv/DoubledPicture.h"

#include <algorithm>

namespace mc_enc_dv {
namespace {

constexpr int32_t kBytesOfPair = 4;

/// A row between two: three parts of the nearer one, and one of the other.
class BlendedRow {
public:
    BlendedRow(const uint8_t* near, const uint8_t* far) : fNear(near), fFar(far) {}

    int32_t Sum(int32_t byte) const { return 3 * fNear[byte] + fFar[byte]; } // four times the value

private:
    const uint8_t *fNear, *fFar;
};

void DoubleRow(const BlendedRow& row, bool isLumaFirst, int32_t width, uint8_t* result) {
    const int32_t lumaAt = isLumaFirst ? 0 : 1, chromaAt = 1 - lumaAt;
    const auto luma = [&](int32_t x) { return row.Sum(2 * std::clamp(x, 0, width - 1) + lumaAt); };
    for (int32_t x = 0; x < width; ++x)
        for (const int32_t side : {-1, 1})
            result[4 * x + 1 + side] = static_cast<uint8_t>((3 * luma(x) + luma(x + side) + 8) >> 4);
    const int32_t pairs = width / 2;
    for (int32_t pair = 0; pair < pairs; ++pair)
        for (const int32_t byte : {0, 2}) {
            const int32_t here = row.Sum(kBytesOfPair * pair + byte + chromaAt);
            const int32_t next = row.Sum(kBytesOfPair * std::min(pair + 1, pairs - 1) + byte + chromaAt);
            uint8_t* const to = result + 2 * kBytesOfPair * pair + byte + 1;
            to[0] = static_cast<uint8_t>((here + 2) >> 2);
            to[kBytesOfPair] = static_cast<uint8_t>((here + next + 4) >> 3);
        }
}

} // namespace

void DoublePicture(const PK::DVPicture& picture, int32_t width, int32_t height, uint8_t* result,
                   int32_t resultRowBytes) noexcept {
    for (int32_t y = 0; y < 2 * height; ++y) {
        const int32_t near = y / 2, far = std::clamp(near + (y % 2 == 0 ? -1 : 1), 0, height - 1);
        const BlendedRow row(picture.pixels + near * picture.rowBytes,
                             picture.pixels + far * picture.rowBytes);
        DoubleRow(row, picture.isLumaFirst, width, result + int64_t{y} * resultRowBytes);
    }
}

} // namespace mc_enc_dv
