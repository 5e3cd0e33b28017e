// Fills of all ways in which pixels are laid out, and what is done to alpha and to arrays.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

namespace {

using namespace PKAllocations;

constexpr Memory kPattern = TakesNone("repeats a few pixels that lie on the stack");
constexpr Memory kSamples = TakesNone("goes from sample to sample");

struct NamedFill {
    const char* name;
    decltype(&PK_FillWithOpaqueBlack) fill;
};

constexpr NamedFill kNamedFills[] = {
    {"PK_FillWithOpaqueBlack", PK_FillWithOpaqueBlack},
    {"PK_FillWithOpaqueWhite", PK_FillWithOpaqueWhite},
    {"PK_FillWithTransparentBlack", PK_FillWithTransparentBlack},
    {"PK_FillWithTransparentWhite", PK_FillWithTransparentWhite},
};

void AddFills(Calls& calls) {
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_32f}) {
        const Image image(format);
        for (const NamedFill& named : kNamedFills)
            calls.push_back(
                {{named.name}, kPattern, image.bytes, [=, rowBytes = image.rowBytes](uint8_t* block) {
                     return named.fill(block, rowBytes, kWidth, kHeight, format);
                 }});
    }
    for (const PK_PixelFormat format : {PK_PixelFormat_ARGB_4444_32f_Linear, PK_PixelFormat_V210_422_10u,
                                        PK_PixelFormat_YUV_420_MPEG2_FRAME}) {
        const Image image(format);
        const bool isV210 = format == PK_PixelFormat_V210_422_10u; // filled and refused
        calls.push_back(
            {{"PK_FillWithColor"}, kPattern, image.bytes, [=, rowBytes = image.rowBytes](uint8_t* block) {
                 constexpr uint8_t kPixel[4] = {10, 20, 30, 128};
                 const PK_Result result = PK_FillWithColor(block, rowBytes, kWidth, kHeight, format, kPixel,
                                                           PK_PixelFormat_BGRA_4444_8u);
                 return isV210 && result == PK_ErrBadDstFormat ? PK_Success : result;
             }});
    }
}

void AddAlpha(Calls& calls) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_32f;
    const Image image(kFormat);
    const int32_t rowBytes = image.rowBytes;
    calls.push_back({{"PK_SetAlphaChannel"}, kSamples, image.bytes, [=](uint8_t* block) {
                         return PK_SetAlphaChannel(kWidth, kHeight, block, rowBytes, kFormat, true);
                     }});
    calls.push_back({{"PK_InvertAlpha"}, kSamples, image.bytes, [=](uint8_t* block) {
                         return PK_InvertAlpha(block, rowBytes, block, rowBytes, kFormat, kWidth, kHeight);
                     }});
    calls.push_back({{"PK_CopyAndSetAlpha"}, kSamples, image.bytes, [=](uint8_t* block) {
                         return PK_CopyAndSetAlpha(block, rowBytes, block, rowBytes, kFormat, kWidth, kHeight,
                                                   0.5f);
                     }});
    const Image bytes(PK_PixelFormat_BGRA_4444_8u);
    calls.push_back(
        {{"PK_MultiplyByConstant"}, kSamples, bytes.bytes, [rowBytes = bytes.rowBytes](uint8_t* block) {
             constexpr uint8_t kConstants[4] = {3, 5, 7, 9};
             return PK_MultiplyByConstant(kWidth, kHeight, block, rowBytes, block, rowBytes, kConstants, 3);
         }});
}

void AddArrays(Calls& calls) {
    constexpr int32_t kLength = 100003;
    const std::vector<float> floats(kLength, 1234.5f);
    calls.push_back({{"PK_Convert_32f32sSfs"}, kSamples, Content(4 * kLength), [floats](uint8_t* block) {
                         return PK_Convert_32f32sSfs(floats.data(), reinterpret_cast<int32_t*>(block),
                                                     kLength, 1, 2);
                     }});
    calls.push_back({{"PK_Convert_32f16sSfs"}, kSamples, Content(2 * kLength), [floats](uint8_t* block) {
                         return PK_Convert_32f16sSfs(floats.data(), reinterpret_cast<int16_t*>(block),
                                                     kLength, 1, 2);
                     }});
    calls.push_back({{"PK_DecodeALawTo16Bit"},
                     kSamples,
                     std::vector<uint8_t>(2 * kLength),
                     [codes = Content(kLength)](uint8_t* block) {
                         return PK_DecodeALawTo16Bit(codes.data(), kLength,
                                                     reinterpret_cast<int16_t*>(block));
                     }});
}

const Family sFills(AddFills), sAlpha(AddAlpha), sArrays(AddArrays);

} // namespace
