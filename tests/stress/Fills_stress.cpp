// Named fills and fills with a colour, which is converted, of all ways in which pixels are laid out.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Fills.h>

#include <span>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 21; // odd: ends of rows take part

constexpr PK_PixelFormat kAlphaFormats[] = {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_15u,
                                            PK_PixelFormat_VUYA_4444_32f_709};
constexpr PK_PixelFormat kOtherFormats[] = {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_YUYV_422_32f,
                                            PK_PixelFormat_V210_422_10u, PK_PixelFormat_YUV_420_MPEG4_FRAME};

using Fill = decltype(&PK_FillWithOpaqueBlack);

PK_Result FillWithColor(void* image, int32_t rowBytes, int32_t width, int32_t height,
                        PK_PixelFormat format) noexcept {
    constexpr uint8_t kColour[4] = {200, 31, 7, 119};
    const PK_Result result =
        PK_FillWithColor(image, rowBytes, width, height, format, kColour, PK_PixelFormat_BGRA_4444_8u);
    if (format != PK_PixelFormat_V210_422_10u) return result;
    return result == PK_ErrBadDstFormat ? PK_Success : PK_ErrFailed; // filled all the same
}

void AddFills(std::vector<Call>& calls, Fill fill, std::span<const PK_PixelFormat> formats) {
    PKTest::Random random(12);
    for (const PK_PixelFormat format : formats)
        calls.push_back({RandomImage(format, kWidth, kHeight, random), [=](uint8_t* image) {
                             return fill(image, PK_PixelFormatRowBytes(format, kWidth), kWidth, kHeight,
                                         format);
                         }});
}

std::function<bool()> PrepareFills() {
    std::vector<Call> calls;
    for (const Fill fill : {PK_FillWithOpaqueBlack, PK_FillWithOpaqueWhite, FillWithColor}) {
        AddFills(calls, fill, kAlphaFormats);
        AddFills(calls, fill, kOtherFormats);
    }
    for (const Fill fill : {PK_FillWithTransparentBlack, PK_FillWithTransparentWhite})
        AddFills(calls, fill, kAlphaFormats);
    return Repeat(calls);
}

const Operation sFills("fills", PrepareFills);

} // namespace
