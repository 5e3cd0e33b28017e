// PK_GaussianBlur: rows, then columns, each by a recursive filter whose cost does not depend on sigma.

#include <PixelKiln/GaussianBlur.h>

#include <PixelKiln/Convert.h>
#include <PixelKiln/Fills.h>

#include "convert/RasterFormats.h"
#include "filters/GaussianBlur.h"
#include "filters/GaussianPass.h"
#include "frame/Arguments.h"
#include "frame/FloatMode.h"

#include <algorithm>
#include <optional>

namespace PK {
namespace {

constexpr int32_t kLargestAlone = 32; // sides up to this are not worth a task

struct Images {
    SourceImage source;
    DestinationImage destination;
};

struct Blur {
    double sigmaX, sigmaY;
    bool repeatEdge, linear, reuseDestination;
    int32_t direction, quality;

    bool IsNone() const { return !(sigmaX > 0) && !(sigmaY > 0); }
    bool IsAlongRows() const { return (direction == 1 || direction == 3) && sigmaX > 0; }
    bool IsAlongColumns() const { return (direction == 2 || direction == 3) && sigmaY > 0; }
};

bool CanBeBlurred(PK_PixelFormat format) {
    return IsRasterFormat(format) && IsPacked4444(format);
}

bool Is8u(PK_PixelFormat format) {
    return DepthOf(format) == kDepth8u;
}

PK_Result CheckFormats(const SourceImage& source, const DestinationImage& destination) {
    if (source.width > destination.width) return PK_ErrBadWidth;
    if (source.height > destination.height) return PK_ErrBadHeight;
    if (!CanBeBlurred(source.format)) return PK_ErrBadSrcFormat;
    if (!CanBeBlurred(destination.format)) return PK_ErrBadDstFormat;
    return Is8u(source.format) == Is8u(destination.format) ? PK_Success : PK_ErrBadSrcFormat;
}

/// No source is greater than its destination here. One without pixels has any pointer.
std::optional<PK_Result> ResultOfImages(const Images& images) {
    const auto& [source, destination] = images;
    if (source.width < 0 || source.height < 0) return PK_ErrFailed;
    if (destination.height > kMaximumWidth) return PK_ErrFailed; // columns are lines too
    if (const auto result = ResultWithoutWork(destination.width, destination.height, {destination.pixels},
                                              BelowZero::Refused))
        return result;
    const bool hasPixels = source.width > 0 && source.height > 0;
    return hasPixels && source.pixels == nullptr ? std::optional<PK_Result>(PK_ErrFailed) : std::nullopt;
}

/// The source amid transparent black. Whether there is such a fill for the format does not count.
PK_Result CopyToCentre(const Images& images, int32_t quality) {
    const auto& [source, destination] = images;
    const auto rowBytes = static_cast<int32_t>(destination.rowBytes);
    if (source.width != destination.width || source.height != destination.height)
        PK_FillWithTransparentBlack(destination.pixels, rowBytes, destination.width, destination.height,
                                    destination.format);
    const int32_t row = (destination.height - source.height) / 2;
    const int32_t column = (destination.width - source.width) / 2;
    return PK_Convert(source.pixels, static_cast<int32_t>(source.rowBytes), source.format,
                      destination.Row(row) + int64_t{column} * BytesPerPixel(destination.format), rowBytes,
                      destination.format, source.width, source.height, quality);
}

PK_PixelFormat WorkingFormat(PK_PixelFormat source, bool linear) {
    if (linear) return PK_PixelFormat_BGRP_4444_32f_Linear;
    if (!IsYUV(source)) return PK_PixelFormat_BGRP_4444_32f;
    return IsMatrix601(source) ? PK_PixelFormat_VUYP_4444_32f : PK_PixelFormat_VUYP_4444_32f_709;
}

/// What rows are in that wait for their columns.
PK_PixelFormat FormatBetween(PK_PixelFormat source) {
    return WithAlpha(WithOrder(source, kOrderBGRA), kAlphaPremultiplied);
}

/// The directions of one call, with the ways between the formats of both.
class Passes {
public:
    Passes(const Images& images, const Blur& blur)
        : fImages(images), fBlur(blur), fWorking(WorkingFormat(images.source.format, blur.linear)),
          fIsTask(images.source.width > kLargestAlone && images.source.height > kLargestAlone) {}

    PK_Result AlongRows() const {
        const auto& [source, destination] = fImages;
        GaussianPass pass;
        if (!BuildRows(pass, destination.format)) return PK_ErrFailed;
        BandMemory memory(pass.BytesOfRows(destination));
        if (const PK_Result result = memory.Result()) return result;
        return pass.AlongRows(source, destination, memory, fIsTask);
    }

    PK_Result AlongColumns() const {
        const auto& [source, destination] = fImages;
        GaussianPass pass;
        if (!BuildColumns(pass, source.format)) return PK_ErrFailed;
        BandMemory memory(pass.BytesOfColumns(destination));
        if (const PK_Result result = memory.Result()) return result;
        return pass.AlongColumns(source, destination, memory, fIsTask);
    }

    PK_Result AlongBoth() const {
        const auto& [source, destination] = fImages;
        const PK_PixelFormat between = FormatBetween(source.format);
        if (fBlur.reuseDestination && DepthOf(between) == DepthOf(destination.format))
            return AlongBoth(
                {destination.pixels, destination.rowBytes, between, destination.width, source.height});
        const TransientPixelBuffer buffer(between, destination.width, source.height);
        if (const PK_Result result = buffer.Result()) return result;
        return AlongBoth({buffer.Pixels(), buffer.RowBytes(), between, destination.width, source.height});
    }

private:
    bool BuildRows(GaussianPass& pass, PK_PixelFormat destination) const {
        return pass.Build(fImages.source.format, fWorking, destination, fBlur.sigmaX, fBlur.repeatEdge,
                          fBlur.quality);
    }
    bool BuildColumns(GaussianPass& pass, PK_PixelFormat source) const {
        return pass.Build(source, fWorking, fImages.destination.format, fBlur.sigmaY, fBlur.repeatEdge,
                          fBlur.quality);
    }

    /// Memory for both directions is there before the first writes.
    PK_Result AlongBoth(const DestinationImage& between) const {
        const auto& [source, destination] = fImages;
        GaussianPass rows, columns;
        if (!BuildRows(rows, between.format) || !BuildColumns(columns, between.format)) return PK_ErrFailed;
        BandMemory memory(std::max(rows.BytesOfRows(between), columns.BytesOfColumns(destination)));
        if (const PK_Result result = memory.Result()) return result;
        if (const PK_Result result = rows.AlongRows(source, between, memory, fIsTask)) return result;
        return columns.AlongColumns(
            {between.pixels, between.rowBytes, between.format, between.width, between.height}, destination,
            memory, fIsTask);
    }

    const Images& fImages;
    const Blur& fBlur;
    PK_PixelFormat fWorking;
    bool fIsTask;
};

PK_Result BlurImage(const Images& images, const Blur& blur) {
    const FloatMode mode;
    const auto& [source, destination] = images;
    if (const PK_Result result = CheckFormats(source, destination)) return result;
    if (const auto result = ResultOfImages(images)) return *result;
    if (blur.IsNone()) return CopyToCentre(images, blur.quality);
    if (source.width == 0 || source.height == 0) return PK_Success;

    const Passes passes(images, blur);
    if (blur.IsAlongRows()) return blur.IsAlongColumns() ? passes.AlongBoth() : passes.AlongRows();
    return blur.IsAlongColumns() ? passes.AlongColumns() : PK_Success;
}

} // namespace

PK_Result BlurForMotion(const void* source, ptrdiff_t sourceRowBytes, int32_t sourceWidth,
                        int32_t sourceHeight, PK_PixelFormat sourceFormat, void* dest, int32_t destRowBytes,
                        int32_t destWidth, int32_t destHeight, PK_PixelFormat destFormat, double sigmaX,
                        double sigmaY, bool repeatEdge, bool linear, bool reuseDestination, int32_t direction,
                        int32_t quality) noexcept {
    return BlurImage(
        {{static_cast<const uint8_t*>(source), sourceRowBytes, sourceFormat, sourceWidth, sourceHeight},
         {static_cast<uint8_t*>(dest), destRowBytes, destFormat, destWidth, destHeight}},
        {sigmaX, sigmaY, repeatEdge, linear, reuseDestination, direction, quality});
}

} // namespace PK

PK_Result PK_GaussianBlur(const void* source, int32_t sourceRowBytes, int32_t sourceWidth,
                          int32_t sourceHeight, PK_PixelFormat sourceFormat, void* dest, int32_t destRowBytes,
                          int32_t destWidth, int32_t destHeight, PK_PixelFormat destFormat, double sigmaX,
                          double sigmaY, bool repeatEdge, bool linear, int32_t direction,
                          int32_t quality) noexcept {
    return PK::BlurForMotion(source, sourceRowBytes, sourceWidth, sourceHeight, sourceFormat, dest,
                             destRowBytes, destWidth, destHeight, destFormat, sigmaX, sigmaY, repeatEdge,
                             linear, false, direction, quality);
}
