// Transposition of all sizes of pixels, and all turns.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Rotate.h>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 61; // odd: blocks that are not full take part

std::function<bool()> PrepareTranspose() {
    PKTest::Random random(71);
    std::vector<Call> calls;
    for (const uint8_t pixelBytes : std::initializer_list<uint8_t>{1, 2, 4, 8, 16}) {
        const size_t bytes = size_t{kWidth} * kHeight * pixelBytes;
        calls.push_back({random.Bytes(bytes), [pixelBytes, source = random.Bytes(bytes)](uint8_t* image) {
                             return PK_Transpose(source.data(), kWidth * pixelBytes, image,
                                                 kHeight * pixelBytes, kWidth, kHeight, pixelBytes);
                         }});
    }
    return Repeat(calls);
}

std::function<bool()> PrepareRotate() {
    PKTest::Random random(72);
    constexpr size_t kBytes = 4 * kWidth * kHeight;
    std::vector<Call> calls;
    for (const int32_t degrees : {90, 180, 270})
        calls.push_back({random.Bytes(kBytes), [degrees, source = random.Bytes(kBytes)](uint8_t* image) {
                             return PK_RotateImage(source.data(), 4 * kWidth, image,
                                                   4 * (degrees == 180 ? kWidth : kHeight), kWidth, kHeight,
                                                   PK_PixelFormat_BGRA_4444_8u, degrees);
                         }});
    return Repeat(calls);
}

const Operation sTranspose("transpose", PrepareTranspose);
const Operation sRotate("rotate", PrepareRotate);

} // namespace
