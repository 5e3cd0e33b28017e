// Pixel formats as plain numbers, for the reference: their fields, and the 47 raster formats with their
// names.
#pragma once

#include <array>
#include <cstdint>

namespace reference {

// Masks and values of the fields that a format number is made of.
constexpr uint32_t kYUV = 0x1;
constexpr uint32_t kLinear = 0x2;
constexpr uint32_t kAlphaMask = 0xC;
constexpr uint32_t kStraight = 0x4;
constexpr uint32_t kPremultiplied = 0x8;
constexpr uint32_t kMeaningless = 0xC;
constexpr uint32_t kStructureMask = 0x30;
constexpr uint32_t k422 = 0x10;
constexpr uint32_t kDepthMask = 0x1C0;
constexpr uint32_t k8u = 0x0;
constexpr uint32_t k10u = 0x40;
constexpr uint32_t k15u = 0x80;
constexpr uint32_t k32f = 0x100;
constexpr uint32_t kMatrixMask = 0x600;
constexpr uint32_t k709 = 0x200;
constexpr uint32_t kVideoRange = 0x800;
constexpr uint32_t kOrder = 0x1000;
constexpr uint32_t kStreamMask = 0xFF000000;

constexpr uint32_t Alpha(uint32_t format) {
    return format & kAlphaMask;
}
constexpr uint32_t Depth(uint32_t format) {
    return format & kDepthMask;
}
constexpr uint32_t Structure(uint32_t format) {
    return format & kStructureMask;
}
constexpr uint32_t WithAlpha(uint32_t format, uint32_t alpha) {
    return (format & ~kAlphaMask) | alpha;
}
constexpr uint32_t WithDepth(uint32_t format, uint32_t depth) {
    return (format & ~kDepthMask) | depth;
}

constexpr bool IsYUV(uint32_t format) {
    return (format & kYUV) != 0;
}
constexpr bool IsRGB(uint32_t format) {
    return !IsYUV(format);
}
constexpr bool IsLinear(uint32_t format) {
    return (format & kLinear) != 0;
}
constexpr bool Is601(uint32_t format) {
    return (format & kMatrixMask) == 0;
}
constexpr bool IsStream(uint32_t format) {
    return (format & kStreamMask) != 0;
}
constexpr bool Is422(uint32_t format) {
    return Structure(format) == k422;
}
constexpr bool IsV210(uint32_t format) {
    return (format & ~k709) == 0x851;
}
constexpr bool IsPacked4444(uint32_t format) {
    return Structure(format) == 0 && Alpha(format) != 0;
}
constexpr bool HasOrderBit(uint32_t format) {
    return (format & kOrder) != 0;
}
constexpr bool HasNoAlphaMeaning(uint32_t format) {
    return Alpha(format) == 0 || Alpha(format) == kMeaningless;
}
constexpr bool SameButForAlpha(uint32_t one, uint32_t other) {
    return WithAlpha(one, 0) == WithAlpha(other, 0);
}

constexpr uint32_t kVUYA_4444_8u = 0x805;
constexpr uint32_t kVUYP_4444_8u = 0x809;
constexpr uint32_t kVUYX_4444_8u = 0x80D;
constexpr uint32_t kVUYA_4444_8u_709 = 0xA05;
constexpr uint32_t kVUYP_4444_8u_709 = 0xA09;
constexpr uint32_t kVUYX_4444_8u_709 = 0xA0D;
constexpr uint32_t kVUYA_4444_32f = 0x905;
constexpr uint32_t kVUYP_4444_32f = 0x909;
constexpr uint32_t kVUYX_4444_32f = 0x90D;
constexpr uint32_t kVUYA_4444_32f_709 = 0xB05;
constexpr uint32_t kVUYP_4444_32f_709 = 0xB09;
constexpr uint32_t kVUYX_4444_32f_709 = 0xB0D;
constexpr uint32_t kBGRA_4444_8u = 0x4;
constexpr uint32_t kBGRP_4444_8u = 0x8;
constexpr uint32_t kBGRX_4444_8u = 0xC;
constexpr uint32_t kBGRA_4444_32f = 0x104;
constexpr uint32_t kBGRP_4444_32f = 0x108;
constexpr uint32_t kBGRX_4444_32f = 0x10C;
constexpr uint32_t kARGB_4444_8u = 0x1004;
constexpr uint32_t kPRGB_4444_8u = 0x1008;
constexpr uint32_t kXRGB_4444_8u = 0x100C;
constexpr uint32_t kARGB_4444_32f = 0x1104;
constexpr uint32_t kPRGB_4444_32f = 0x1108;
constexpr uint32_t kXRGB_4444_32f = 0x110C;
constexpr uint32_t kUYVY_422_8u = 0x811;
constexpr uint32_t kUYVY_422_8u_709 = 0xA11;
constexpr uint32_t kYUYV_422_8u = 0x1811;
constexpr uint32_t kYUYV_422_8u_709 = 0x1A11;
constexpr uint32_t kUYVY_422_32f = 0x911;
constexpr uint32_t kUYVY_422_32f_709 = 0xB11;
constexpr uint32_t kYUYV_422_32f = 0x1911;
constexpr uint32_t kYUYV_422_32f_709 = 0x1B11;
constexpr uint32_t kV210_422_10u = 0x851;
constexpr uint32_t kV210_422_10u_709 = 0xA51;
constexpr uint32_t kBGRA_4444_15u = 0x84;
constexpr uint32_t kBGRP_4444_15u = 0x88;
constexpr uint32_t kBGRX_4444_15u = 0x8C;
constexpr uint32_t kARGB_4444_15u = 0x1084;
constexpr uint32_t kPRGB_4444_15u = 0x1088;
constexpr uint32_t kXRGB_4444_15u = 0x108C;
constexpr uint32_t kBGRA_4444_32f_Linear = 0x106;
constexpr uint32_t kBGRP_4444_32f_Linear = 0x10A;
constexpr uint32_t kBGRX_4444_32f_Linear = 0x10E;
constexpr uint32_t kARGB_4444_32f_Linear = 0x1106;
constexpr uint32_t kPRGB_4444_32f_Linear = 0x110A;
constexpr uint32_t kXRGB_4444_32f_Linear = 0x110E;
constexpr uint32_t kRGB_444_10u = 0x40;

constexpr std::array<uint32_t, 47> kRasterFormats = {
    kVUYA_4444_8u,         kVUYP_4444_8u,         kVUYX_4444_8u,         kVUYA_4444_8u_709,
    kVUYP_4444_8u_709,     kVUYX_4444_8u_709,     kVUYA_4444_32f,        kVUYP_4444_32f,
    kVUYX_4444_32f,        kVUYA_4444_32f_709,    kVUYP_4444_32f_709,    kVUYX_4444_32f_709,
    kBGRA_4444_8u,         kBGRP_4444_8u,         kBGRX_4444_8u,         kBGRA_4444_32f,
    kBGRP_4444_32f,        kBGRX_4444_32f,        kARGB_4444_8u,         kPRGB_4444_8u,
    kXRGB_4444_8u,         kARGB_4444_32f,        kPRGB_4444_32f,        kXRGB_4444_32f,
    kUYVY_422_8u,          kUYVY_422_8u_709,      kYUYV_422_8u,          kYUYV_422_8u_709,
    kUYVY_422_32f,         kUYVY_422_32f_709,     kYUYV_422_32f,         kYUYV_422_32f_709,
    kV210_422_10u,         kV210_422_10u_709,     kBGRA_4444_15u,        kBGRP_4444_15u,
    kBGRX_4444_15u,        kARGB_4444_15u,        kPRGB_4444_15u,        kXRGB_4444_15u,
    kBGRA_4444_32f_Linear, kBGRP_4444_32f_Linear, kBGRX_4444_32f_Linear, kARGB_4444_32f_Linear,
    kPRGB_4444_32f_Linear, kXRGB_4444_32f_Linear, kRGB_444_10u,
};

} // namespace reference
