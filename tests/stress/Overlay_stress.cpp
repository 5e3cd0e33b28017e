// A choice by mask between images that are both converted, and a number on it, against what one thread made.

#include "stress/Operation.h"

#include "support/Random.h"

#include <PixelKiln/Overlay.h>

#include <vector>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 33;
constexpr PK_PixelFormat kFirst = PK_PixelFormat_UYVY_422_8u, kSecond = PK_PixelFormat_VUYA_4444_8u,
                         kDestination = PK_PixelFormat_BGRA_4444_32f;

size_t ImageBytes(PK_PixelFormat format) {
    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, kWidth) * kHeight);
}

struct Overlay {
    std::vector<uint8_t> first, second, mask;

    /// Empty if a call failed.
    std::vector<uint8_t> Draw() const {
        std::vector<uint8_t> image(ImageBytes(kDestination));
        const int32_t rowBytes = PK_PixelFormatPackedRowBytes(kDestination, kWidth);
        const PK_Result picked = PK_OneBitMaskComposite(
            first.data(), PK_PixelFormatPackedRowBytes(kFirst, kWidth), kFirst, second.data(),
            PK_PixelFormatPackedRowBytes(kSecond, kWidth), kSecond, mask.data(), 13, 5, image.data(),
            rowBytes, kDestination, kWidth, kHeight, 4);
        const PK_Result printed = PK_PrintNum(image.data(), rowBytes, kDestination, kWidth, kHeight, -406,
                                              0.15f, {0.1f, 0.1f}, true);
        if (picked != PK_Success || printed != PK_Success) image.clear();
        return image;
    }
};

std::function<bool()> PrepareOverlay() {
    PKTest::Random random(465);
    const Overlay overlay = {random.Bytes(ImageBytes(kFirst)), random.Bytes(ImageBytes(kSecond)),
                             random.Bytes(13 * kHeight)};
    const std::vector<uint8_t> expected = overlay.Draw();
    return [overlay, expected] { return !expected.empty() && overlay.Draw() == expected; };
}

const Operation sOverlay("overlay", PrepareOverlay);

} // namespace
