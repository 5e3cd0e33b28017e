// Alpha of whole images, and conversions of plain arrays.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Utilities.h>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 21; // odd: ends of rows take part

void AddAlphaCalls(std::vector<Call>& calls, PK_PixelFormat format, PKTest::Random& random) {
    const int32_t rowBytes = PK_PixelFormatRowBytes(format, kWidth);
    const std::vector<uint8_t> source = RandomImage(format, kWidth, kHeight, random);
    for (const bool opaque : {false, true})
        calls.push_back({source, [=](uint8_t* image) {
                             return PK_SetAlphaChannel(kWidth, kHeight, image, rowBytes, format, opaque);
                         }});
    calls.push_back({random.Bytes(source.size()), [=](uint8_t* image) {
                         return PK_InvertAlpha(source.data(), rowBytes, image, rowBytes, format, kWidth,
                                               kHeight);
                     }});
}

Call CopyAndSetAlpha(PK_PixelFormat format, PKTest::Random& random) {
    return {RandomImage(format, kWidth, kHeight, random),
            [format, source = RandomImage(format, kWidth, kHeight, random)](uint8_t* image) {
                const int32_t rowBytes = PK_PixelFormatRowBytes(format, kWidth);
                return PK_CopyAndSetAlpha(source.data(), rowBytes, image, rowBytes, format, kWidth, kHeight,
                                          0.3f);
            }};
}

std::function<bool()> PrepareAlpha() {
    PKTest::Random random(21);
    std::vector<Call> calls;
    for (const PK_PixelFormat format :
         {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_ARGB_4444_32f})
        AddAlphaCalls(calls, format, random);
    for (const PK_PixelFormat format :
         {PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_VUYA_4444_32f})
        calls.push_back(CopyAndSetAlpha(format, random));
    return Repeat(calls);
}

std::vector<float> RandomFloats(size_t count, PKTest::Random& random) {
    std::vector<float> floats;
    for (size_t i = 0; i < count; ++i) floats.push_back(static_cast<float>(random.Next()) / 1000 - 2e6f);
    return floats;
}

std::function<bool()> PrepareArrays() {
    PKTest::Random random(22);
    constexpr int32_t kLength = 997, kRowBytes = 4 * kWidth;
    const std::vector<float> floats = RandomFloats(kLength, random);
    const std::vector<uint8_t> codes = random.Bytes(kLength);
    return Repeat({
        {random.Bytes(kRowBytes * kHeight),
         [](uint8_t* image) {
             constexpr uint8_t kConstants[4] = {3, 90, 255, 131};
             return PK_MultiplyByConstant(kWidth, kHeight, image, kRowBytes, image, kRowBytes, kConstants, 6);
         }},
        {random.Bytes(4 * kLength),
         [=](uint8_t* integers) {
             return PK_Convert_32f32sSfs(floats.data(), reinterpret_cast<int32_t*>(integers), kLength, 1, -3);
         }},
        {random.Bytes(2 * kLength),
         [=](uint8_t* integers) {
             return PK_Convert_32f16sSfs(floats.data(), reinterpret_cast<int16_t*>(integers), kLength, 0, 5);
         }},
        {random.Bytes(2 * kLength),
         [=](uint8_t* samples) {
             return PK_DecodeALawTo16Bit(codes.data(), kLength, reinterpret_cast<int16_t*>(samples));
         }},
    });
}

const Operation sAlpha("alpha", PrepareAlpha);
const Operation sArrays("arrays", PrepareArrays);

} // namespace
