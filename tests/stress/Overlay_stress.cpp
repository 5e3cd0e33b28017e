// Choices by mask, between images that are converted or not, and numbers burnt in.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Overlay.h>

namespace {

using namespace PKStress;

struct Choice {
    PK_PixelFormat first, second, destination;
    int32_t width = 97, height = 33; // odd: ends of rows take part
};

constexpr Choice kChoices[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_ARGB_4444_15u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_32f},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_BGRP_4444_8u, 17001,
     2}, // scratch rows of the recycler
};

Call Choose(const Choice& choice, PKTest::Random& random) {
    const int32_t maskBytes = choice.width / 8 + 2;
    return {RandomImage(choice.destination, choice.width, choice.height, random),
            [choice, maskBytes, first = RandomImage(choice.first, choice.width, choice.height, random),
             second = RandomImage(choice.second, choice.width, choice.height, random),
             mask = random.Bytes(static_cast<size_t>(maskBytes * choice.height))](uint8_t* image) {
                const auto rowBytes = [&](PK_PixelFormat format) {
                    return PK_PixelFormatRowBytes(format, choice.width);
                };
                return PK_OneBitMaskComposite(first.data(), rowBytes(choice.first), choice.first,
                                              second.data(), rowBytes(choice.second), choice.second,
                                              mask.data(), maskBytes, 5, image, rowBytes(choice.destination),
                                              choice.destination, choice.width, choice.height, 4);
            }};
}

std::function<bool()> PrepareMask() {
    PKTest::Random random(51);
    std::vector<Call> calls;
    for (const Choice& choice : kChoices) calls.push_back(Choose(choice, random));
    return Repeat(calls);
}

std::function<bool()> PrepareNumber() {
    PKTest::Random random(52);
    constexpr int32_t kWidth = 97, kHeight = 33;
    std::vector<Call> calls;
    for (const PK_PixelFormat format : {PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_BGRA_4444_32f,
                                        PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_YUV_420_MPEG2_FIELD})
        for (const bool decimal : {false, true})
            calls.push_back({RandomImage(format, kWidth, kHeight, random), [=](uint8_t* image) {
                                 return PK_PrintNum(image, PK_PixelFormatRowBytes(format, kWidth), format,
                                                    kWidth, kHeight, -406, 0.1f, {0.1f, 0.1f}, decimal);
                             }});
    return Repeat(calls);
}

const Operation sMask("one-bit-mask", PrepareMask);
const Operation sNumber("number", PrepareNumber);

} // namespace
