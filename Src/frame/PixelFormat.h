#pragma once

// The fields of a pixel format and the questions that the rest of the library asks of them.

#include <PixelKiln/Types.h>

namespace PK {

inline constexpr uint32_t kModelMask = 0x00000001;
inline constexpr uint32_t kModelRGB = 0;
inline constexpr uint32_t kModelYUV = 0x1;

inline constexpr uint32_t kLightMask = 0x00000002;
inline constexpr uint32_t kLightGamma = 0;
inline constexpr uint32_t kLightLinear = 0x2;

inline constexpr uint32_t kAlphaMask = 0x0000000c;
inline constexpr uint32_t kAlphaNone = 0;
inline constexpr uint32_t kAlphaStraight = 0x4;
inline constexpr uint32_t kAlphaPremultiplied = 0x8;
inline constexpr uint32_t kAlphaMeaningless = 0xc;

inline constexpr uint32_t kStructureMask = 0x00000030;
inline constexpr uint32_t kStructure444 = 0;
inline constexpr uint32_t kStructure422 = 0x10;
inline constexpr uint32_t kStructureDV = 0x20;
inline constexpr uint32_t kStructure420 = 0x30;

inline constexpr uint32_t kDepthMask = 0x000001c0;
inline constexpr uint32_t kDepth8u = 0;
inline constexpr uint32_t kDepth10u = 0x40;
inline constexpr uint32_t kDepth15u = 0x80;
inline constexpr uint32_t kDepth32f = 0x100;

inline constexpr uint32_t kMatrixMask = 0x00000600; // Any value but kMatrix601 counts as not 601.
inline constexpr uint32_t kMatrix601 = 0;
inline constexpr uint32_t kMatrix709 = 0x200;

inline constexpr uint32_t kRangeMask = 0x00000800;
inline constexpr uint32_t kRangeFull = 0;
inline constexpr uint32_t kRangeVideo = 0x800;

inline constexpr uint32_t kOrderMask = 0x00001000;
inline constexpr uint32_t kOrderBGRA = 0;      // or UYVY
inline constexpr uint32_t kOrderARGB = 0x1000; // or YUYV

inline constexpr uint32_t kStreamMask = 0xff000000;
inline constexpr uint32_t kStreamShift = 24;
inline constexpr uint32_t kStreamLastDV = 8;
inline constexpr uint32_t kStreamFirst420 = 9;
inline constexpr uint32_t kStreamLast420 = 12;

/// All that tells a colour coding: fields to clear on the way to RGB and to set on the way back.
inline constexpr uint32_t kCodingMask = kModelMask | kMatrixMask | kRangeMask;
inline constexpr uint32_t kCodingRGB = kModelRGB;
inline constexpr uint32_t kCodingYUV601 = kModelYUV | kMatrix601 | kRangeVideo;
inline constexpr uint32_t kCodingYUV709 = kModelYUV | kMatrix709 | kRangeVideo;

constexpr uint32_t StreamKind(PK_PixelFormat format) {
    return format >> kStreamShift;
}
constexpr uint32_t ModelOf(PK_PixelFormat format) {
    return format & kModelMask;
}
constexpr uint32_t AlphaOf(PK_PixelFormat format) {
    return format & kAlphaMask;
}
constexpr uint32_t StructureOf(PK_PixelFormat format) {
    return format & kStructureMask;
}
constexpr uint32_t DepthOf(PK_PixelFormat format) {
    return format & kDepthMask;
}
constexpr uint32_t OrderOf(PK_PixelFormat format) {
    return format & kOrderMask;
}

/// The format with the fields under the mask replaced.
constexpr PK_PixelFormat With(PK_PixelFormat format, uint32_t mask, uint32_t bits) {
    return (format & ~mask) | bits;
}
constexpr PK_PixelFormat WithAlpha(PK_PixelFormat format, uint32_t alpha) {
    return With(format, kAlphaMask, alpha);
}
constexpr PK_PixelFormat WithDepth(PK_PixelFormat format, uint32_t depth) {
    return With(format, kDepthMask, depth);
}
constexpr PK_PixelFormat WithOrder(PK_PixelFormat format, uint32_t order) {
    return With(format, kOrderMask, order);
}

constexpr bool IsYUV(PK_PixelFormat format) {
    return ModelOf(format) == kModelYUV;
}

constexpr bool IsMatrix601(PK_PixelFormat format) {
    return (format & kMatrixMask) == kMatrix601;
}

constexpr bool IsLinear(PK_PixelFormat format) {
    return (format & kLightMask) == kLightLinear;
}

/// In the order of ARGB or YUYV.
constexpr bool IsOrderReversed(PK_PixelFormat format) {
    return OrderOf(format) == kOrderARGB;
}

/// A plain interleaved layout of four channels.
constexpr bool IsPacked4444(PK_PixelFormat format) {
    return StructureOf(format) == kStructure444 && AlphaOf(format) != kAlphaNone;
}

constexpr bool Is422(PK_PixelFormat format) {
    return StructureOf(format) == kStructure422;
}

constexpr bool IsStream(PK_PixelFormat format) {
    return (format & kStreamMask) != 0;
}

constexpr bool Is420Planar(PK_PixelFormat format) {
    return IsYUV(format) && StreamKind(format) >= kStreamFirst420 && StreamKind(format) <= kStreamLast420 &&
           StructureOf(format) == kStructure420;
}

constexpr bool IsV210(PK_PixelFormat format) {
    return (format & ~kMatrix709) == 0x851;
}

/// The alpha channel is missing or tells nothing.
constexpr bool HasNoAlphaMeaning(PK_PixelFormat format) {
    return AlphaOf(format) == kAlphaNone || AlphaOf(format) == kAlphaMeaningless;
}

/// The widest row whose bytes, at 16 a pixel, can be told in 32 bits.
inline constexpr int32_t kMaximumWidth = INT32_MAX / 16;

/// Bytes of a pixel of an interleaved format, 0 for an unknown depth and for 10-bit YUV.
constexpr int32_t BytesPerPixel(PK_PixelFormat format) {
    if (format == 0) return 0; // no format, though its bits are those of 8-bit samples
    const bool fourChannels = IsPacked4444(format);
    switch (DepthOf(format)) {
    case kDepth8u:
        return fourChannels ? 4 : 2;
    case kDepth10u:
        return IsYUV(format) ? 0 : 4;
    case kDepth15u:
        return 8;
    case kDepth32f:
        return fourChannels ? 16 : 8;
    default:
        return 0;
    }
}

/// Pixels that a row cannot be parted between: one, a pair of 4:2:2 or a group of V210.
struct RowUnit {
    int32_t pixels;
    int32_t bytes;
};

inline constexpr RowUnit kV210Unit = {6, 16};

constexpr RowUnit UnitOfRow(PK_PixelFormat format) {
    if (StructureOf(format) == kStructure444) return {1, BytesPerPixel(format)};
    switch (DepthOf(format)) {
    case kDepth8u:
        return {2, 4};
    case kDepth10u:
        return kV210Unit;
    default:
        return {2, 16};
    }
}

/// Bytes of whole units that hold `width` pixels, from 0 up; without padding, and never wrapped.
constexpr uint64_t BytesOfRow(PK_PixelFormat format, int32_t width) {
    const RowUnit unit = UnitOfRow(format);
    return static_cast<uint64_t>((int64_t{width} + unit.pixels - 1) / unit.pixels * unit.bytes);
}

/// How a raster row is laid out: groups of pixels, then padding to a multiple of the alignment.
struct RowLayout {
    int32_t groupPixels;
    int32_t groupBytes;
    int32_t alignment;
};

constexpr RowLayout LayoutOfRow(PK_PixelFormat format) {
    if (IsV210(format)) return {kV210Unit.pixels, kV210Unit.bytes, 128};
    return {1, BytesPerPixel(format), Is422(format) ? 16 : 64};
}

} // namespace PK
