// Planes of 4:2:0, the composite by a mask, and alpha.

#include "operations/Operation.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Overlay.h>
#include <PixelKiln/Planar.h>
#include <PixelKiln/QuarterScale.h>
#include <PixelKiln/Utilities.h>

#include <algorithm>
#include <memory>
#include <vector>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;
constexpr size_t kPlanar = kCount * 3 / 2; // bytes of 4:2:0

/// Luma and two chroma planes of 4:2:0, one after the other without padding.
template <class Byte>
struct Planar420 {
    Byte* planes[3];
    int32_t rowBytes[3];

    Planar420(Byte* memory, int32_t width, int32_t height) {
        const ptrdiff_t luma = static_cast<ptrdiff_t>(width) * height;
        planes[0] = memory;
        planes[1] = memory + luma;
        planes[2] = memory + luma + luma / 4;
        rowBytes[0] = width;
        rowBytes[1] = rowBytes[2] = width / 2;
    }
};

template <class Byte>
void* const* Writable(const Planar420<Byte>& image) {
    return reinterpret_cast<void* const*>(image.planes);
}
template <class Byte>
const void* const* Readable(const Planar420<Byte>& image) {
    return reinterpret_cast<const void* const*>(image.planes);
}

Run QuarterScale(const uint8_t* source, uint8_t* destination) {
    const Planar420 from(source, kWidth, kHeight);
    const Planar420 to(destination, kWidth / 2, kHeight / 2);
    return [=] {
        PK_QuarterScalePlanar420_8u(Readable(from), from.rowBytes, Writable(to), to.rowBytes, kWidth / 2,
                                    kHeight, 1);
    };
}

Run QuarterScaleTo422(const uint8_t* source, uint8_t* destination) {
    const Planar420 from(source, kWidth, kHeight);
    return [=] {
        PK_QuarterScalePlanar_8uAndConvertTo422_8u(Readable(from), from.rowBytes, destination, 2 * kWidth,
                                                   kWidth, kHeight, false, 1);
    };
}

Run CopyPlanar(const uint8_t* source, uint8_t* destination) {
    const Planar420 from(source, kWidth, kHeight);
    const Planar420 to(destination, kWidth, kHeight);
    return
        [=] { PK_CopyPlanar_8u(Readable(from), from.rowBytes, Writable(to), to.rowBytes, kWidth, kHeight); };
}

/// Chroma pairs lie behind luma.
Run PartSurface(const uint8_t* source, uint8_t* destination) {
    const Planar420 to(destination, kWidth, kHeight);
    return [=] {
        PK_ConvertNV12toYV12_SSE4<0>(source, kWidth, source + kCount, kWidth, Writable(to), to.rowBytes,
                                     kWidth, kHeight);
    };
}

template <PK_PixelFormat kFormat, int32_t kPixelBytes>
Run Decode(const uint8_t* source, uint8_t* destination) {
    const Planar420 from(source, kWidth, kHeight);
    return [=] {
        PK::DecompressYUV_420_8u(Readable(from), from.rowBytes, kWidth, kHeight,
                                 PK_PixelFormat_YUV_420_MPEG2_FRAME, destination, kPixelBytes * kWidth,
                                 kWidth, kHeight, kFormat, 0, 2);
    };
}

/// The planes of a block, whose rows and heights are rounded up.
std::shared_ptr<std::vector<uint8_t>> Block() {
    const int64_t bytes = PK_PixelFormatSize(PK_PixelFormat_YUV_420_MPEG2_FRAME, kWidth, kHeight);
    return std::make_shared<std::vector<uint8_t>>(static_cast<size_t>(bytes));
}

template <PK_PixelFormat kFormat>
Run Encode(const uint8_t* source, uint8_t*) {
    return [=, block = Block()] {
        PK_Convert(source, kBGRARowBytes, kFormat, block->data(), 0, PK_PixelFormat_YUV_420_MPEG2_FRAME,
                   kWidth, kHeight, 2);
    };
}

/// As if alpha were ignored: other libraries do so.
Run EncodeOpaque(const uint8_t* source, uint8_t* destination) {
    const auto image = std::make_shared<std::vector<uint8_t>>(source, source + 4 * kCount);
    for (size_t alpha = 3; alpha < image->size(); alpha += 4) (*image)[alpha] = 255;
    return [image, encode = Encode<PK_PixelFormat_BGRA_4444_8u>(image->data(), destination)] { encode(); };
}

Run DecodeBlock(const uint8_t* source, uint8_t* destination) {
    const auto block = Block();
    std::copy_n(source, kPlanar, block->data());
    return [=] {
        PK_Convert(block->data(), 0, PK_PixelFormat_YUV_420_MPEG2_FRAME, destination, kBGRARowBytes,
                   PK_PixelFormat_BGRA_4444_8u, kWidth, kHeight, 2);
    };
}

/// The source's second image lies behind the first, and the mask behind both.
Run Mask(const uint8_t* source, uint8_t* destination) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    return [=] {
        PK_OneBitMaskComposite(source, kBGRARowBytes, kFormat, source + 4 * kCount, kBGRARowBytes, kFormat,
                               source + 8 * kCount, kWidth / 8, 0, destination, kBGRARowBytes, kFormat,
                               kWidth, kHeight, 1);
    };
}

Run SetAlpha(const uint8_t*, uint8_t* image) {
    return
        [=] { PK_SetAlphaChannel(kWidth, kHeight, image, kBGRARowBytes, PK_PixelFormat_BGRA_4444_8u, true); };
}

Run InvertAlpha(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_InvertAlpha(source, kBGRARowBytes, destination, kBGRARowBytes, PK_PixelFormat_BGRA_4444_8u, kWidth,
                       kHeight);
    };
}

Run CopyAndSetAlpha(const uint8_t* source, uint8_t* destination) {
    return [=] {
        PK_CopyAndSetAlpha(source, kBGRARowBytes, destination, kBGRARowBytes, PK_PixelFormat_BGRA_4444_8u,
                           kWidth, kHeight, 0.5F);
    };
}

Run MultiplyByConstant(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr uint8_t kConstants[4] = {200, 100, 50, 255};
        PK_MultiplyByConstant(kWidth, kHeight, source, kBGRARowBytes, destination, kBGRARowBytes, kConstants,
                              8);
    };
}

// Bytes are those of whole images, of which a field is a half.
// clang-format off: one row an operation
const AddOperations add = {
    {"Quarter of 4:2:0", kPlanar, kPlanar / 4, Samples::Bytes, Against::Nothing, 0, QuarterScale},
    {"Field of 4:2:0 to UYVY", kPlanar, kCount, Samples::Bytes, Against::Nothing, 0, QuarterScaleTo422},
    {"Copy of 4:2:0 planes", kPlanar, kPlanar, Samples::Bytes, Against::Peer, 0.95, CopyPlanar},
    {"NV12 to planes", kPlanar, kPlanar, Samples::Bytes, Against::Peer, 0.95, PartSurface},
    {"I420 to BGRA", kPlanar, 4 * kCount, Samples::Bytes, Against::Peer, 0.6,
     Decode<PK_PixelFormat_BGRA_4444_8u, 4>},
    {"I420 to BGRA, a block by PK_Convert", kPlanar, 4 * kCount, Samples::Bytes, Against::Peer, 0.6,
     DecodeBlock},
    {"I420 to VUYX", kPlanar, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Decode<PK_PixelFormat_VUYX_4444_8u, 4>},
    {"I420 to UYVY", kPlanar, 2 * kCount, Samples::Bytes, Against::Peer, 0.95,
     Decode<PK_PixelFormat_UYVY_422_8u, 2>},
    {"Opaque BGRA to I420", 4 * kCount, kPlanar, Samples::Bytes, Against::Peer, 0.95, EncodeOpaque},
    {"BGRA to I420", 4 * kCount, kPlanar, Samples::Bytes, Against::Nothing, 0,
     Encode<PK_PixelFormat_BGRA_4444_8u>},
    {"BGRX to I420", 4 * kCount, kPlanar, Samples::Bytes, Against::Peer, 0.95,
     Encode<PK_PixelFormat_BGRX_4444_8u>},
    {"Composite of two BGRA 8u by a one-bit mask", 8 * kCount + kCount / 8, 4 * kCount, Samples::Bytes,
     Against::Peer, 0.95, Mask},
    {"Opaque alpha, in place", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0, SetAlpha},
    {"Inverted alpha", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0, InvertAlpha},
    {"Copy with one alpha", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0, CopyAndSetAlpha},
    {"Product of BGRA 8u by constants", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 0.95,
     MultiplyByConstant},
};
// clang-format on

} // namespace
} // namespace OperationBench
