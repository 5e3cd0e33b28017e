// Alpha of whole images: set, inverted, or replaced in a copy.

#include "frame/Arguments.h"
#include "primitives/Channels.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/Utilities.h>

#include <optional>
#include <xmmintrin.h>

namespace PK {
namespace {

constexpr uint8_t kFull8 = 255;
constexpr uint16_t kFull15 = 32768;

/// Streams have no pixels, whatever their other bits say.
constexpr bool HasFourChannels(PK_PixelFormat format) {
    return IsPacked4444(format) && !IsStream(format);
}

/// The place of alpha among the samples of a pixel.
constexpr int32_t AlphaChannel(PK_PixelFormat format) {
    return IsOrderReversed(format) ? 0 : 3;
}

/// From rows of the source to rows of the destination.
struct Rows {
    const void* source;
    ptrdiff_t sourceRowBytes;
    void* destination;
    ptrdiff_t destinationRowBytes;
    PK_PixelFormat format;
    int32_t width;
    int32_t height;
};

using ChannelRow = decltype(ChannelKernels::replace);

PK_Result RunRows(const Rows& rows, ChannelRow row, const ChannelPattern& pattern) {
    const auto* source = static_cast<const uint8_t*>(rows.source);
    auto* destination = static_cast<uint8_t*>(rows.destination);
    const int64_t bytes = int64_t{BytesPerPixel(rows.format)} * rows.width;
    for (ptrdiff_t i = 0; i < rows.height; ++i)
        row(source + i * rows.sourceRowBytes, destination + i * rows.destinationRowBytes, bytes, pattern);
    return PK_Success;
}

/// nearest(full x alpha), limited to 0 to full; NaN gives 0.
int32_t AlphaCode(float alpha, int32_t full) {
    const float limit = static_cast<float>(full);
    const float code = limit * alpha;
    if (!(code > 0)) return 0;
    return _mm_cvtss_si32(_mm_set_ss(code < limit ? code : limit));
}

std::optional<ChannelPattern> ConstantAlpha(PK_PixelFormat format, float alpha) {
    const int32_t channel = AlphaChannel(format);
    switch (DepthOf(format)) {
    case kDepth8u:
        return PatternOfChannel(channel, static_cast<uint8_t>(AlphaCode(alpha, kFull8)));
    case kDepth15u:
        if (channel == 0) return std::nullopt;
        return PatternOfChannel(channel, static_cast<uint16_t>(AlphaCode(alpha, kFull15)));
    case kDepth32f:
        if (channel == 0) return std::nullopt;
        return PatternOfChannel(channel, alpha);
    default:
        return std::nullopt;
    }
}

struct Inversion {
    ChannelRow row;
    ChannelPattern pattern;
};

std::optional<Inversion> InversionOf(PK_PixelFormat format) {
    const ChannelKernels& kernels = Best<ChannelKernels>();
    const int32_t channel = AlphaChannel(format);
    switch (DepthOf(format)) {
    case kDepth8u:
        return Inversion{kernels.invertInteger, PatternOfChannel(channel, kFull8)};
    case kDepth15u:
        return Inversion{kernels.invertInteger, PatternOfChannel(channel, kFull15)};
    case kDepth32f:
        return Inversion{kernels.invertFloat, PatternOfChannel(channel, 1.0f)};
    default:
        return std::nullopt;
    }
}

int32_t SetAlpha8u(int32_t width, int32_t height, uint8_t* pixels, int32_t rowBytes, bool opaque) {
    return SetChannel8u(opaque ? kFull8 : uint8_t{0}, pixels + 3, rowBytes, width, height);
}

int32_t SetAlpha15u(int32_t width, int32_t height, uint8_t* pixels, int32_t rowBytes, bool opaque) {
    return SetChannel16u(opaque ? kFull15 : uint16_t{0}, pixels + 6, rowBytes, width, height);
}

template <int kOffset>
int32_t SetAlpha32f(int32_t width, int32_t height, uint8_t* pixels, int32_t rowBytes, bool opaque) {
    return SetChannel32f(opaque ? 1.0f : 0.0f, pixels + kOffset, rowBytes, width, height);
}

using SetAlpha = int32_t (*)(int32_t width, int32_t height, uint8_t* pixels, int32_t rowBytes, bool opaque);

/// Null for a format that is not offered: deliberately few are.
SetAlpha SetAlphaOf(PK_PixelFormat format) {
    switch (format) {
    case PK_PixelFormat_BGRA_4444_8u:
    case PK_PixelFormat_VUYA_4444_8u:
        return SetAlpha8u;
    case PK_PixelFormat_BGRA_4444_15u:
        return SetAlpha15u;
    case PK_PixelFormat_BGRA_4444_32f:
    case PK_PixelFormat_BGRA_4444_32f_Linear:
    case PK_PixelFormat_VUYA_4444_32f:
        return SetAlpha32f<12>;
    case PK_PixelFormat_ARGB_4444_32f:
    case PK_PixelFormat_ARGB_4444_32f_Linear:
        return SetAlpha32f<0>;
    default:
        return nullptr;
    }
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_SetAlphaChannel(int32_t width, int32_t height, void* buffer, int32_t rowBytes,
                             PK_PixelFormat format, bool opaque) noexcept {
    const SetAlpha setAlpha = SetAlphaOf(format);
    if (setAlpha == nullptr) return PK_ErrNotSupported;
    if (const auto result = ResultWithoutWork(width, height, {buffer}, BelowZero::Refused)) return *result;
    const int32_t status = setAlpha(width, height, static_cast<uint8_t*>(buffer), rowBytes, opaque);
    return status == 0 ? PK_Success : PK_ErrFailed;
}

PK_Result PK_InvertAlpha(const void* source, int32_t sourceRowBytes, void* destination,
                         int32_t destinationRowBytes, PK_PixelFormat format, int32_t width,
                         int32_t height) noexcept {
    const auto inversion = InversionOf(format);
    if (!HasFourChannels(format) || !inversion) return PK_ErrBadSrcFormat;
    if (const auto result = ResultWithoutWork(width, height, {source, destination}, BelowZero::Refused))
        return *result;
    return RunRows({source, sourceRowBytes, destination, destinationRowBytes, format, width, height},
                   inversion->row, inversion->pattern);
}

PK_Result PK_CopyAndSetAlpha(const void* source, int32_t sourceRowBytes, void* destination,
                             int32_t destinationRowBytes, PK_PixelFormat format, int32_t width,
                             int32_t height, float alpha) noexcept {
    const auto pattern = ConstantAlpha(format, alpha);
    if (!HasFourChannels(format) || !pattern) return PK_ErrNotSupported;
    if (const auto result = ResultWithoutWork(width, height, {source, destination}, BelowZero::Empty))
        return *result;
    return RunRows({source, sourceRowBytes, destination, destinationRowBytes, format, width, height},
                   Best<ChannelKernels>().replace, *pattern);
}
