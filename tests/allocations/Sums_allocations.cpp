// Images scaled by a gain and added up.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

#include <array>

namespace {

using namespace PKAllocations;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kFloats = PK_PixelFormat_BGRP_4444_32f;

Call Gain(PK_PixelFormat from, PK_PixelFormat to, float gain, Memory memory) {
    return {{"PK_AlphaGain"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [source = Image(from), to, gain](uint8_t* block) {
                return PK_AlphaGain(source.bytes.data(), source.rowBytes, source.format, block,
                                    PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, gain, 4);
            }};
}

void AddGains(Calls& calls) {
    calls.push_back(Gain(kBGRA, kBGRA, 0.7f, TakesNone("works in the format of both images")));
    calls.push_back(
        Gain(PK_PixelFormat_V210_422_10u, kBGRA, 0.7f, TakesOrRefuses("rows that are converted")));
    calls.push_back(
        Gain(kBGRA, PK_PixelFormat_ARGB_4444_32f, 0.7f, TakesOrRefuses("rows that are converted")));
    calls.push_back(Gain(kBGRA, PK_PixelFormat_VUYA_4444_8u, 0, TakesNone("fills")));
    calls.push_back({{"PK_IsOpacityNOP"}, TakesNone("compares two numbers"), {0}, [](uint8_t* block) {
                         *block = PK_IsOpacityNOP(PK_BlendMode_Normal, 1.0f);
                         return PK_Success;
                     }});
}

/// Two images by turns.
Call Sum(PK_PixelFormat from, PK_PixelFormat to) {
    return {{"PK_Accumulate"},
            TakesOrRefuses("rows in the format that is summed"),
            std::vector<uint8_t>(Image(to).bytes.size()),
            [a = Image(from), b = Image(kBGRA), to](uint8_t* block) {
                constexpr int32_t kCount = 11;
                std::array<const void*, kCount> images;
                std::array<int32_t, kCount> rowBytes;
                std::array<PK_PixelFormat, kCount> formats;
                std::array<double, kCount> weights;
                for (size_t i = 0; i < kCount; ++i) {
                    const Image& image = i % 2 == 0 ? a : b;
                    images[i] = image.bytes.data();
                    rowBytes[i] = image.rowBytes;
                    formats[i] = image.format;
                    weights[i] = 0.09 * static_cast<double>(i);
                }
                return PK_Accumulate(images.data(), rowBytes.data(), formats.data(), weights.data(), kCount,
                                     block, PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, 4);
            }};
}

void AddSums(Calls& calls) {
    calls.push_back(Sum(PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u));
    calls.push_back(Sum(kFloats, kFloats));
}

const Family sGains(AddGains), sSums(AddSums);

} // namespace
