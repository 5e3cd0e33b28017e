// Images over black, and without the share of a matte.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Matte.h>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 21;

Call ToBlack(PK_PixelFormat from, PK_PixelFormat to, PKTest::Random& random) {
    return {RandomImage(to, kWidth, kHeight, random),
            [from, to, source = RandomImage(from, kWidth, kHeight, random)](uint8_t* image) {
                const int32_t step = PK_PixelFormatRowBytes(from, kWidth),
                              toStep = PK_PixelFormatRowBytes(to, kWidth);
                uint32_t told = 0;
                const PK_Result result = PK_CompositeToBlack(source.data(), step, from, image, toStep, to,
                                                             kWidth, kHeight / 2, 0.6f, 4);
                if (result != PK_Success) return result;
                return PK_CompositeToBlackAndTestSourceAlpha(source.data(), step, from, image, toStep, to,
                                                             kWidth, kHeight, &told, 4);
            }};
}

Call Without(PK_PixelFormat format, PKTest::Random& random) {
    return {RandomImage(format, kWidth, kHeight, random),
            [format, source = RandomImage(format, kWidth, kHeight, random)](uint8_t* image) {
                const int32_t step = PK_PixelFormatRowBytes(format, kWidth);
                const uint8_t matte[4] = {40, 80, 160, 255};
                return PK_UnPremultiplyAgainstMatteColor(source.data(), step, image, step, format, kWidth,
                                                         kHeight, matte, PK_PixelFormat_BGRA_4444_8u, 4);
            }};
}

std::function<bool()> PrepareMatte() {
    PKTest::Random random(55);
    return Repeat({ToBlack(PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, random),
                   ToBlack(PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_UYVY_422_8u, random),
                   ToBlack(PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYA_4444_32f_709, random),
                   Without(PK_PixelFormat_BGRA_4444_8u, random),
                   Without(PK_PixelFormat_PRGB_4444_15u, random)});
}

const Operation sMatte("matte", PrepareMatte);

} // namespace
