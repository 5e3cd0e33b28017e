// Images placed by motion: turned, and scaled from and to half of each side.

#include "operations/Operation.h"

#include <PixelKiln/Motion.h>

namespace OperationBench {
namespace {

constexpr size_t kBytes8 = 4 * static_cast<size_t>(kPixels), kBytes32 = 4 * kBytes8;
constexpr int32_t kHalfWidth = kWidth / 2, kHalfHeight = kHeight / 2;
constexpr PK_Point kMiddle = {0.5f, 0.5f};

struct Size {
    int32_t width, height;
};

constexpr Size kWhole = {kWidth, kHeight}, kHalf = {kHalfWidth, kHalfHeight};

PK_Result Place(const uint8_t* source, Size from, PK_PixelFormat fromFormat, uint8_t* destination, Size to,
                PK_PixelFormat toFormat, float scale, double degrees, int32_t quality) {
    return PK_Motion(source, PK_PixelFormatPackedRowBytes(fromFormat, from.width), from.width, from.height,
                     fromFormat, 0, nullptr, destination, PK_PixelFormatPackedRowBytes(toFormat, to.width),
                     to.width, to.height, toFormat, 0, 1, 1, kMiddle, kMiddle, {scale, scale}, degrees, 1,
                     false, 0, false, 0, quality, false);
}

/// At 0.8 of the size, by 15 degrees.
template <PK_PixelFormat kFormat, int32_t kQuality = 2>
Run Turn(const uint8_t* source, uint8_t* destination) {
    return [=] { Place(source, kWhole, kFormat, destination, kWhole, kFormat, 0.8f, 15, kQuality); };
}

template <PK_PixelFormat kFrom, PK_PixelFormat kTo, int32_t kQuality>
Run Enlarge(const uint8_t* source, uint8_t* destination) {
    return [=] { Place(source, kHalf, kFrom, destination, kWhole, kTo, 2, 0, kQuality); };
}

template <PK_PixelFormat kFormat, int32_t kQuality>
Run Reduce(const uint8_t* source, uint8_t* destination) {
    return [=] { Place(source, kWhole, kFormat, destination, kHalf, kFormat, 0.5f, 0, kQuality); };
}

constexpr PK_PixelFormat k8 = PK_PixelFormat_BGRP_4444_8u, k32 = PK_PixelFormat_BGRP_4444_32f,
                         kLinear = PK_PixelFormat_BGRP_4444_32f_Linear;

// clang-format off: one row an operation
const AddOperations add = {
    {"Placing of BGRP 8u turned, bilinear", kBytes8, kBytes8, Samples::Bytes, Against::Peer, 1, Turn<k8>},
    {"Placing of BGRP 32f turned, bilinear", kBytes32, kBytes32, Samples::Floats, Against::Peer, 1,
     Turn<k32>},
    {"Placing of BGRP 8u at twice the size, bilinear", kBytes8 / 4, kBytes8, Samples::Bytes, Against::Peer,
     0.6, Enlarge<k8, k8, 2>},
    {"Placing of BGRP 8u at twice the size to 32f, bilinear", kBytes8 / 4, kBytes32, Samples::Bytes,
     Against::Peer, 1, Enlarge<k8, k32, 2>},
    {"Placing of BGRP 32f at twice the size, bilinear", kBytes32 / 4, kBytes32, Samples::Floats,
     Against::Peer, 1, Enlarge<k32, k32, 2>},
    {"Placing of BGRP 8u at half the size, blurred", kBytes8, kBytes8 / 4, Samples::Bytes, Against::Nothing,
     0, Reduce<k8, 4>},
    {"Placing of BGRP 32f at twice the size, cubic", kBytes32 / 4, kBytes32, Samples::Floats, Against::Peer,
     1, Enlarge<kLinear, kLinear, 5>},
    {"Placing of BGRP 32f at half the size, cubic", kBytes32, kBytes32 / 4, Samples::Floats, Against::Peer, 1,
     Reduce<kLinear, 5>},
    {"Placing of BGRP 32f turned, cubic", kBytes32, kBytes32, Samples::Floats, Against::Peer, 1,
     Turn<kLinear, 5>},
};
// clang-format on

} // namespace
} // namespace OperationBench
