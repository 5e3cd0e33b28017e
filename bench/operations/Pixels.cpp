// Fills, samples of audio, turns, box blur and warp.

#include "operations/Operation.h"
#include "operations/WarpQuad.h"

#include <PixelKiln/BoxBlur.h>
#include <PixelKiln/Fills.h>
#include <PixelKiln/QuadWarp.h>
#include <PixelKiln/Rotate.h>
#include <PixelKiln/Utilities.h>

#include <cstring>
#include <memory>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;
constexpr size_t kRows = kHeight;
constexpr int32_t kPadding = 64; // bytes between padded rows

template <PK_PixelFormat kFormat, int32_t kRowBytes>
Run FillBlack(const uint8_t*, uint8_t* image) {
    return [=] { PK_FillWithOpaqueBlack(image, kRowBytes, kWidth, kHeight, kFormat); };
}

template <int32_t kRowBytes>
Run MemsetRows(const uint8_t*, uint8_t* image) {
    return [=] {
        for (int32_t row = 0; row < kHeight; ++row)
            std::memset(image + static_cast<ptrdiff_t>(row) * (kRowBytes + kPadding), 128, kRowBytes);
    };
}

/// Frames of so many times the width and height.
Run FillColour(const uint8_t*, uint8_t* image) {
    return [=] {
        constexpr uint8_t kOrange[] = {0, 128, 255, 255};
        PK_FillWithColor(image, kBGRARowBytes, kWidth, kHeight, PK_PixelFormat_BGRA_4444_8u, kOrange,
                         PK_PixelFormat_BGRA_4444_8u);
    };
}

Run DecodeALaw(const uint8_t* source, uint8_t* destination) {
    return [=] { PK_DecodeALawTo16Bit(source, kPixels, reinterpret_cast<int16_t*>(destination)); };
}

template <int32_t kRounding>
Run ToInt32(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_Convert_32f32sSfs(reinterpret_cast<const float*>(source), reinterpret_cast<int32_t*>(destination),
                             kPixels, kRounding, 0);
    };
}

template <int32_t kRounding>
Run ToInt16(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_Convert_32f16sSfs(reinterpret_cast<const float*>(source), reinterpret_cast<int16_t*>(destination),
                             kPixels, kRounding, 0);
    };
}

template <int32_t kPixelBytes>
Run Transpose(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_Transpose(source, kPixelBytes * kWidth, destination, kPixelBytes * kHeight, kWidth, kHeight,
                     kPixelBytes);
    };
}

template <int32_t kDegrees>
Run Rotate(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_RotateImage(source, kBGRARowBytes, destination, kDegrees == 180 ? kBGRARowBytes : kTurnedRowBytes,
                       kWidth, kHeight, PK_PixelFormat_BGRA_4444_8u, kDegrees);
    };
}

template <int32_t kFlags>
Run Blur(const uint8_t*, uint8_t* image) {
    const auto scratch = std::make_shared<std::vector<uint32_t>>(2 * kWidth + kHeight);
    return [=] {
        constexpr int32_t kAllBytes = 15;
        double radius = 10;
        PK_BoxBlur(1, &radius, kAllBytes | kFlags, scratch->data(), image, kBGRARowBytes, kWidth, kHeight);
    };
}

template <int32_t kQuality>
Run Warp(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr PK_Rect kAll = {0, 0, kWidth, kHeight};
        constexpr double kFrom[] = {0, 0, kWidth, 0, kWidth, kHeight, 0, kHeight};
        const WarpMatrix m;
        double to[8];
        for (int i = 0; i < 8; i += 2) {
            to[i] = m.a * kFrom[i] - m.b * kFrom[i + 1] + m.offsetX;
            to[i + 1] = m.b * kFrom[i] + m.a * kFrom[i + 1] + m.offsetY;
        }
        PK_WarpAffineQuad(nullptr, nullptr, source, kBGRARowBytes, &kAll, kFrom, destination, kBGRARowBytes,
                          &kAll, to, kQuality, 255, /*blend=*/false, /*keepSourceAlpha=*/true,
                          PK_PixelFormat_BGRA_4444_8u, 0, true, false, 0);
    };
}

// clang-format off: one row an operation
const AddOperations add = {
    {"Fill BGRA 8u with a colour", 0, 4 * kCount, Samples::Bytes, Against::Memset, 0.9, FillColour},
    {"Fill UYVY 8u with black", 0, 2 * kCount, Samples::Bytes, Against::Memset, 0.9,
     FillBlack<PK_PixelFormat_UYVY_422_8u, 2 * kWidth>},
    {"Fill BGRA 32f with black", 0, 16 * kCount, Samples::Bytes, Against::Memset, 0.9,
     FillBlack<PK_PixelFormat_BGRA_4444_32f, 16 * kWidth>},
    {"Fill padded rows of BGRA 8u with black", 0, (4 * kWidth + kPadding) * kRows, Samples::Bytes,
     Against::Peer, 0.9, FillBlack<PK_PixelFormat_BGRA_4444_8u, 4 * kWidth + kPadding>},
    {"Fill padded rows of BGRA 32f with black", 0, (16 * kWidth + kPadding) * kRows, Samples::Bytes,
     Against::Peer, 0.9, FillBlack<PK_PixelFormat_BGRA_4444_32f, 16 * kWidth + kPadding>},
    {"A-law to 16 bits", kCount, 2 * kCount, Samples::Bytes, Against::Memcpy, 0.7, DecodeALaw},
    {"Float to 32-bit integer, rounding mode 0", 4 * kCount, 4 * kCount, Samples::Floats, Against::Memcpy,
     0.7, ToInt32<0>},
    {"Float to 32-bit integer, rounding mode 1", 4 * kCount, 4 * kCount, Samples::Floats, Against::Memcpy,
     0.7, ToInt32<1>},
    {"Float to 16-bit integer, rounding mode 0", 4 * kCount, 2 * kCount, Samples::Floats, Against::Memcpy,
     0.7, ToInt16<0>},
    {"Float to 16-bit integer, rounding mode 1", 4 * kCount, 2 * kCount, Samples::Floats, Against::Memcpy,
     0.7, ToInt16<1>},
    {"Transpose BGRA 8u", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 0.95, Transpose<4>},
    {"Transpose pixels of 1 byte", kCount, kCount, Samples::Bytes, Against::Peer, 0.95, Transpose<1>},
    {"Transpose pixels of 2 bytes", 2 * kCount, 2 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Transpose<2>},
    {"Transpose pixels of 8 bytes", 8 * kCount, 8 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Transpose<8>},
    {"Transpose pixels of 16 bytes", 16 * kCount, 16 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Transpose<16>},
    {"Rotate BGRA 8u by 90 degrees", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 0.95, Rotate<90>},
    {"Rotate BGRA 8u by 180 degrees", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Rotate<180>},
    {"Rotate BGRA 8u by 270 degrees", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Rotate<270>},
    {"Box blur of rows, radius 10", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1, Blur<0>},
    {"Box blur of columns, radius 10", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1,
     Blur<PK_BoxBlur_Columns>},
    {"Quad warp, bilinear", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1, Warp<5>},
    {"Quad warp, nearest", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1, Warp<2>},
};
// clang-format on

const AddPeers addPeers = {
    {"Fill padded rows of BGRA 8u with black", "memset row by row", false, MemsetRows<4 * kWidth>},
    {"Fill padded rows of BGRA 32f with black", "memset row by row", false, MemsetRows<16 * kWidth>},
};

} // namespace
} // namespace OperationBench
