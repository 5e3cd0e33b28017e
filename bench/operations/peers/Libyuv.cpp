// libyuv. Its "ARGB" is BGRA in memory, and its "RAW" RGB.

#include "operations/OpaqueImages.h"
#include "operations/Operation.h"

#include <libyuv.h>

#include <memory>
#include <vector>

namespace OperationBench {
namespace {

Run FromRGB(const uint8_t* source, uint8_t* destination) {
    return [=] { libyuv::RAWToARGB(source, 3 * kWidth, destination, kBGRARowBytes, kWidth, kHeight); };
}

// A negative height turns the picture over first, by which a quarter turn becomes a transposition.
template <int kMode, int32_t kSignedHeight>
Run Turn(const uint8_t* source, uint8_t* destination) {
    return [=] {
        libyuv::ARGBRotate(source, kBGRARowBytes, destination,
                           kMode == libyuv::kRotate180 ? kBGRARowBytes : kTurnedRowBytes, kWidth,
                           kSignedHeight, static_cast<libyuv::RotationMode>(kMode));
    };
}

Run TransposeBytes(const uint8_t* source, uint8_t* destination) {
    return [=] { libyuv::TransposePlane(source, kWidth, destination, kHeight, kWidth, kHeight); };
}

/// The planes lie one after the other.
Run CopyPlanes(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr int32_t kChromaWidth = kWidth / 2, kChromaHeight = kHeight / 2;
        ptrdiff_t at = 0;
        libyuv::CopyPlane(source, kWidth, destination, kWidth, kWidth, kHeight);
        at += kPixels;
        libyuv::CopyPlane(source + at, kChromaWidth, destination + at, kChromaWidth, kChromaWidth,
                          kChromaHeight);
        at += kPixels / 4;
        libyuv::CopyPlane(source + at, kChromaWidth, destination + at, kChromaWidth, kChromaWidth,
                          kChromaHeight);
    };
}

/// Chroma pairs lie behind luma.
Run PartSurface(const uint8_t* source, uint8_t* destination) {
    return [=] {
        uint8_t* const first = destination + kPixels;
        libyuv::NV12ToI420(source, kWidth, source + kPixels, kWidth, destination, kWidth, first, kWidth / 2,
                           first + kPixels / 4, kWidth / 2, kWidth, kHeight);
    };
}

/// Y, U and V, one after the other.
struct I420 {
    const uint8_t *y, *u, *v;

    explicit I420(const uint8_t* planes)
        : y(planes), u(planes + kPixels), v(planes + kPixels + kPixels / 4) {}
};

/// Chroma interpolated in rows and columns, as if it stood between both.
Run DecodeFiltered(const uint8_t* source, uint8_t* destination) {
    return [=, from = I420(source)] {
        libyuv::I420ToARGBMatrixFilter(from.y, kWidth, from.u, kWidth / 2, from.v, kWidth / 2, destination,
                                       kBGRARowBytes, &libyuv::kYuvI601Constants, kWidth, kHeight,
                                       libyuv::kFilterBilinear);
    };
}

/// A sample of chroma serves four pixels.
Run DecodeRepeated(const uint8_t* source, uint8_t* destination) {
    return [=, from = I420(source)] {
        libyuv::I420ToARGB(from.y, kWidth, from.u, kWidth / 2, from.v, kWidth / 2, destination, kBGRARowBytes,
                           kWidth, kHeight);
    };
}

/// Two rows share their chroma.
Run DecodeToUYVY(const uint8_t* source, uint8_t* destination) {
    return [=, from = I420(source)] {
        libyuv::I420ToUYVY(from.y, kWidth, from.u, kWidth / 2, from.v, kWidth / 2, destination, 2 * kWidth,
                           kWidth, kHeight);
    };
}

/// Ignores alpha; the mean of four pixels' chroma.
Run Encode(const uint8_t* source, uint8_t* destination) {
    return [=] {
        uint8_t* const u = destination + kPixels;
        libyuv::ARGBToI420(source, kBGRARowBytes, destination, kWidth, u, kWidth / 2, u + kPixels / 4,
                           kWidth / 2, kWidth, kHeight);
    };
}

Run Shade(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr uint32_t kConstants = 0xff3264c8; // alpha, red, green and blue
        libyuv::ARGBShade(source, kBGRARowBytes, destination, kBGRARowBytes, kWidth, kHeight, kConstants);
    };
}

/// Attenuated colour over whatever stands there, at full opacity: it has none.
Run Blend(const uint8_t* source, uint8_t* back) {
    return [=] {
        libyuv::ARGBBlend(source, kBGRARowBytes, back, kBGRARowBytes, back, kBGRARowBytes, kWidth, kHeight);
    };
}

Run Interpolate(const uint8_t* source, uint8_t* destination) {
    return [images = MakeOpaqueImages(source), destination] {
        constexpr auto kFraction = static_cast<int>(256 * kDissolveRatio);
        libyuv::ARGBInterpolate(images->First(), kBGRARowBytes, images->Second(), kBGRARowBytes, destination,
                                kBGRARowBytes, kWidth, kHeight, kFraction);
    };
}

/// From half of each side.
Run Enlarge(const uint8_t* source, uint8_t* destination) {
    return [=] {
        libyuv::ARGBScale(source, kBGRARowBytes / 2, kWidth / 2, kHeight / 2, destination, kBGRARowBytes,
                          kWidth, kHeight, libyuv::kFilterBilinear);
    };
}

/// To half of each side: between four pixels it has their mean.
template <libyuv::FilterMode kFilter>
Run Reduce(const uint8_t* source, uint8_t* destination) {
    return [=] {
        libyuv::ARGBScale(source, kBGRARowBytes, kWidth, kHeight, destination, kBGRARowBytes / 2, kWidth / 2,
                          kHeight / 2, kFilter);
    };
}

/// Every second row, and then every second pixel.
Run DropFromUYVY(const uint8_t* source, uint8_t* destination) {
    const auto rows = std::make_shared<std::vector<uint8_t>>(2 * static_cast<size_t>(kPixels));
    return [=] {
        libyuv::UYVYToARGB(source + 2 * kWidth, 4 * kWidth, rows->data(), kBGRARowBytes, kWidth, kHeight / 2);
        libyuv::ARGBScale(rows->data(), kBGRARowBytes, kWidth, kHeight / 2, destination, kBGRARowBytes / 2,
                          kWidth / 2, kHeight / 2, libyuv::kFilterNone);
    };
}

/// From half of each side, and then all samples.
Run EnlargeToFloats(const uint8_t* source, uint8_t* destination) {
    const auto scaled = std::make_shared<std::vector<uint8_t>>(4 * static_cast<size_t>(kPixels));
    return [=, enlarge = Enlarge(source, scaled->data())] {
        enlarge();
        for (int32_t row = 0; row < kHeight; ++row) {
            const ptrdiff_t at = ptrdiff_t{row} * kBGRARowBytes;
            libyuv::ByteToFloat(scaled->data() + at, reinterpret_cast<float*>(destination) + at, 1.0F / 255,
                                kBGRARowBytes);
        }
    };
}

const AddPeers add = {
    {"Premultiplied BGRA 8u over opaque at full opacity", "libyuv ARGBBlend", false, Blend},
    {"Premultiplied BGRA 8u over premultiplied at full opacity", "libyuv ARGBBlend", false, Blend},
    {"Dissolve of opaque BGRA 8u", "libyuv ARGBInterpolate", true, Interpolate},
    {"Copy of 4:2:0 planes", "libyuv CopyPlane", true, CopyPlanes},
    {"NV12 to planes", "libyuv NV12ToI420", true, PartSurface},
    {"I420 to BGRA", "libyuv I420ToARGBMatrixFilter, bilinear", false, DecodeFiltered},
    {"I420 to BGRA", "libyuv I420ToARGB, chroma repeated", false, DecodeRepeated, false},
    {"I420 to BGRA, a block by PK_Convert", "libyuv I420ToARGBMatrixFilter, bilinear", false, DecodeFiltered},
    {"I420 to UYVY", "libyuv I420ToUYVY, chroma repeated", false, DecodeToUYVY},
    {"Opaque BGRA to I420", "libyuv ARGBToI420", false, Encode},
    {"BGRA to I420", "libyuv ARGBToI420", false, Encode, false},
    {"BGRX to I420", "libyuv ARGBToI420", false, Encode},
    {"Product of BGRA 8u by constants", "libyuv ARGBShade", true, Shade},
    {"Placing of BGRP 8u at twice the size, bilinear", "libyuv ARGBScale", false, Enlarge},
    {"Placing of BGRP 8u at twice the size to 32f, bilinear", "libyuv ARGBScale, ByteToFloat", false,
     EnlargeToFloats},
    {"Scaling of BGRP 8u to half the size, quality 2", "libyuv ARGBScale", true,
     Reduce<libyuv::kFilterBilinear>},
    {"Scaling of BGRA 8u to half the size, quality 2", "libyuv ARGBScale", false,
     Reduce<libyuv::kFilterBilinear>},
    {"Scaling of BGRA 8u to half the size, quality 3", "libyuv ARGBScale (mean of four)", false,
     Reduce<libyuv::kFilterBox>},
    {"Half size of UYVY 8u to BGRA 8u", "libyuv UYVYToARGB, ARGBScale", false, DropFromUYVY},
    {"RGB 8u to BGRA 8u", "libyuv RAWToARGB", true, FromRGB},
    {"Transpose BGRA 8u", "libyuv ARGBRotate", true, Turn<libyuv::kRotate90, -kHeight>},
    {"Transpose pixels of 1 byte", "libyuv TransposePlane", true, TransposeBytes},
    {"Rotate BGRA 8u by 90 degrees", "libyuv ARGBRotate", true, Turn<libyuv::kRotate90, kHeight>},
    {"Rotate BGRA 8u by 180 degrees", "libyuv ARGBRotate", true, Turn<libyuv::kRotate180, kHeight>},
    {"Rotate BGRA 8u by 270 degrees", "libyuv ARGBRotate", true, Turn<libyuv::kRotate270, kHeight>},
};

} // namespace
} // namespace OperationBench
