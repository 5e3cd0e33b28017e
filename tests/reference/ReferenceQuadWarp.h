#pragma once

// The quad warp restated: one pixel at a time, without vectors. Expects valid arguments; the coordinates may be
// any finite numbers that do not overflow.

#include <PixelKiln/Types.h>

#include <cstdint>

namespace PKReference {

struct QuadWarp {
    const uint8_t* source = nullptr;
    int32_t sourceRowBytes = 0;
    PK_Rect sourceRect{};
    double sourceQuad[8] = {};
    uint8_t* destination = nullptr;
    int32_t destinationRowBytes = 0;
    PK_Rect destinationRect{};
    double destinationQuad[8] = {};
    int32_t quality = 0;
    int32_t opacity = 255;
    bool blend = false;
    bool keepSourceAlpha = false;
    PK_PixelFormat format = 0;
    int32_t field = 0;
    bool ignoreFields = false;
    bool featherOver = false;
    float feather = 0;
};

void DrawQuadWarp(const QuadWarp& warp);

} // namespace PKReference
