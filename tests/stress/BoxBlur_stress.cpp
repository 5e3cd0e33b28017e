// Blurs along rows and columns. Radii are written too, and are each call's own like the scratch.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/BoxBlur.h>

#include <array>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 61;

Call Blur(int32_t flags, PKTest::Random& random) {
    return {random.Bytes(4 * kWidth * kHeight), [flags](uint8_t* image) {
                std::array<double, 3> radii = {3.1, 80.5, 1.7}; // the second is limited
                std::vector<uint8_t> scratch(4 * (kWidth + kHeight + kWidth));
                PK_BoxBlur(3, radii.data(), flags, scratch.data(), image, 4 * kWidth, kWidth, kHeight);
                return radii[1] == kHeight - 3 ? PK_Success : PK_ErrFailed;
            }};
}

std::function<bool()> PrepareBoxBlur() {
    PKTest::Random random(81);
    constexpr int32_t kAllBytes = PK_BoxBlur_Byte0 | PK_BoxBlur_Byte1 | PK_BoxBlur_Byte2 | PK_BoxBlur_Byte3;
    return Repeat({Blur(kAllBytes | PK_BoxBlur_Renormalise, random),
                   Blur(kAllBytes | PK_BoxBlur_Columns, random),
                   Blur(PK_BoxBlur_Byte1 | PK_BoxBlur_Byte3 | PK_BoxBlur_Renormalise, random)});
}

const Operation sBoxBlur("box-blur", PrepareBoxBlur);

} // namespace
