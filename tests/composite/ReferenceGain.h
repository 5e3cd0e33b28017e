#pragma once

// The gain of an image restated slowly: the table of formats one by one, and a pixel at a time.

#include "support/AlignedPicture.h"

#include <algorithm>
#include <cmath>

namespace PKTest {

enum class Scaled { kAlpha8, kAll8, kAllVUY8, kAlpha32, kAll32 };

struct Method {
    PK_PixelFormat working;
    Scaled scaled;
};

/// Format by format, as tabled.
inline Method MethodOf(PK_PixelFormat destination, int32_t quality) {
    switch (destination) {
    case PK_PixelFormat_BGRA_4444_8u:
    case PK_PixelFormat_VUYA_4444_8u:
    case PK_PixelFormat_VUYA_4444_8u_709:
        return {destination, Scaled::kAlpha8};
    case PK_PixelFormat_BGRP_4444_8u:
    case PK_PixelFormat_BGRX_4444_8u:
        return {destination, Scaled::kAll8};
    case PK_PixelFormat_VUYP_4444_8u:
    case PK_PixelFormat_VUYX_4444_8u:
    case PK_PixelFormat_VUYP_4444_8u_709:
    case PK_PixelFormat_VUYX_4444_8u_709:
        return {destination, Scaled::kAllVUY8};
    case PK_PixelFormat_BGRA_4444_32f:
    case PK_PixelFormat_BGRA_4444_32f_Linear:
    case PK_PixelFormat_VUYA_4444_32f:
    case PK_PixelFormat_VUYA_4444_32f_709:
        return {destination, Scaled::kAlpha32};
    case PK_PixelFormat_BGRP_4444_32f:
    case PK_PixelFormat_BGRX_4444_32f:
    case PK_PixelFormat_BGRP_4444_32f_Linear:
    case PK_PixelFormat_BGRX_4444_32f_Linear:
    case PK_PixelFormat_VUYP_4444_32f:
    case PK_PixelFormat_VUYX_4444_32f:
    case PK_PixelFormat_VUYP_4444_32f_709:
    case PK_PixelFormat_VUYX_4444_32f_709:
        return {destination, Scaled::kAll32};
    case PK_PixelFormat_ARGB_4444_32f:
    case PK_PixelFormat_PRGB_4444_32f:
    case PK_PixelFormat_XRGB_4444_32f:
    case PK_PixelFormat_ARGB_4444_32f_Linear:
    case PK_PixelFormat_PRGB_4444_32f_Linear:
    case PK_PixelFormat_XRGB_4444_32f_Linear:
        return {PK_PixelFormat_BGRA_4444_32f, Scaled::kAll32};
    case PK_PixelFormat_ARGB_4444_8u:
    case PK_PixelFormat_PRGB_4444_8u:
    case PK_PixelFormat_XRGB_4444_8u:
    case PK_PixelFormat_BGRA_4444_15u:
    case PK_PixelFormat_BGRP_4444_15u:
    case PK_PixelFormat_BGRX_4444_15u:
    case PK_PixelFormat_ARGB_4444_15u:
    case PK_PixelFormat_PRGB_4444_15u:
    case PK_PixelFormat_XRGB_4444_15u:
    case PK_PixelFormat_RGB_444_10u:
        return {PK_PixelFormat_BGRA_4444_8u, Scaled::kAlpha8};
    case PK_PixelFormat_UYVY_422_32f:
    case PK_PixelFormat_UYVY_422_32f_709:
    case PK_PixelFormat_YUYV_422_32f:
    case PK_PixelFormat_YUYV_422_32f_709:
    case PK_PixelFormat_V210_422_10u:
    case PK_PixelFormat_V210_422_10u_709:
        if (quality >= 3) return {PK_PixelFormat_VUYP_4444_32f, Scaled::kAlpha32};
        return {PK_PixelFormat_VUYP_4444_8u, Scaled::kAlpha8};
    case PK_PixelFormat_UYVY_422_8u:
    case PK_PixelFormat_UYVY_422_8u_709:
    case PK_PixelFormat_YUYV_422_8u:
    case PK_PixelFormat_YUYV_422_8u_709:
        return {PK_PixelFormat_VUYP_4444_8u, Scaled::kAlpha8};
    default:
        ADD_FAILURE() << "no method for " << std::hex << destination;
        return {destination, Scaled::kAll8};
    }
}

inline uint8_t NearestByte(float value) {
    return static_cast<uint8_t>(std::clamp(std::nearbyint(value), 0.0f, 255.0f));
}

inline void ScaleBytes(uint8_t* pixel, Scaled scaled, float gain) {
    constexpr float kZeros[] = {128, 128, 16};
    for (int channel = 0; channel < 3 && scaled != Scaled::kAlpha8; ++channel) {
        const float zero = scaled == Scaled::kAllVUY8 ? kZeros[channel] : 0;
        pixel[channel] = NearestByte((static_cast<float>(pixel[channel]) - zero) * gain + zero);
    }
    pixel[3] = NearestByte(static_cast<float>(pixel[3]) * gain);
}

inline void ScaleFloats(uint8_t* pixel, Scaled scaled, float gain) {
    float samples[4];
    std::memcpy(samples, pixel, sizeof samples);
    for (int channel = scaled == Scaled::kAlpha32 ? 3 : 0; channel < 4; ++channel) samples[channel] *= gain;
    std::memcpy(pixel, samples, sizeof samples);
}

inline AlignedPicture ReferenceGain(const AlignedPicture& source, PK_PixelFormat destination, float gain,
                                    int32_t quality) {
    const Method method = MethodOf(destination, quality);
    const bool isFloat = method.scaled == Scaled::kAlpha32 || method.scaled == Scaled::kAll32;
    AlignedPicture working = RowsIn(method.working, source, quality);
    for (int32_t row = 0; row < working.height; ++row)
        for (int32_t column = 0; column < working.width; ++column)
            if (isFloat)
                ScaleFloats(working.Row(row) + 16 * column, method.scaled, gain);
            else
                ScaleBytes(working.Row(row) + 4 * column, method.scaled, gain);
    return RowsIn(destination, working, quality);
}

} // namespace PKTest
