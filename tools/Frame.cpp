#include "Frame.h"

#include "Failure.h"
#include "Formats.h"

#include <cstring>
#include <string>

namespace tool {

Frame::Frame(PK_PixelFormat format, int32_t width, int32_t height)
    : fFormat(format), fWidth(width), fHeight(height) {
    void* base = nullptr;
    void* pixels = nullptr;
    uint64_t size = 0;
    const PK_Result result = PK_AllocatePixelBuffer(format, width, height, &base, &pixels, &fRowBytes, &size);
    fBlock = std::unique_ptr<void, FreePixels>(base, FreePixels{format, size});
    if (result != PK_Success || base == nullptr)
        throw Failure(kExitFailed, "there is no memory for a frame of " + FormatName(format) + " at " +
                                       SizeText(width, height) + "; a frame may take up to 2 GiB");
    fPixels = static_cast<uint8_t*>(pixels);
    fBytes = static_cast<uint64_t>(PK_PixelFormatSize(format, width, height));
    if (!IsRaster(format) && !IsPlanar(format)) fRowBytes = static_cast<int32_t>(fBytes);
    std::memset(fPixels, 0, fBytes);
}

int64_t Frame::RowOffset(int32_t fromTop) const {
    const int32_t row = PK_IsOriginTopLeft(fFormat) ? fromTop : fHeight - 1 - fromTop;
    return int64_t{row} * fRowBytes;
}

std::vector<Plane> Frame::Planes() const {
    if (IsRaster(fFormat))
        return {{fPixels, fRowBytes, PK_PixelFormatPackedRowBytes(fFormat, fWidth), fHeight}};
    if (!IsPlanar(fFormat)) {
        const auto bytes = static_cast<int32_t>(fBytes);
        return {{fPixels, bytes, bytes, 1}};
    }
    void* planes[3];
    int32_t rowBytes[3];
    PK_GetPlanarBuffers(fPixels, fFormat, fWidth, fHeight, planes, rowBytes);
    std::vector<Plane> result;
    for (int i = 0; i < 3; ++i) {
        const int32_t divisor = i == 0 ? 1 : 2;
        result.push_back(
            {static_cast<uint8_t*>(planes[i]), rowBytes[i], fWidth / divisor, fHeight / divisor});
    }
    return result;
}

std::string SizeText(int32_t width, int32_t height) {
    return std::to_string(width) + "x" + std::to_string(height);
}

void Convert(const Frame& source, Frame& destination, int32_t quality) {
    const PK_Result result =
        PK_Convert(source.Pixels(), source.RowBytes(), source.Format(), destination.Pixels(),
                   destination.RowBytes(), destination.Format(), source.Width(), source.Height(), quality);
    if (result != PK_Success)
        throw Failure(kExitFailed, "cannot convert " + FormatName(source.Format()) + " to " +
                                       FormatName(destination.Format()) + " at " + SizeText(source) + ": " +
                                       ResultText(result) + " (result " + std::to_string(result) + ")");
}

Frame Copied(const Frame& source) {
    return Converted(source, source.Format(), kDefaultQuality);
}

Frame Converted(const Frame& source, PK_PixelFormat format, int32_t quality) {
    Frame destination(format, source.Width(), source.Height());
    Convert(source, destination, quality);
    return destination;
}

void Require(PK_Result result, const std::string& what, const Frame& frame) {
    if (result == PK_Success) return;
    throw Failure(kExitFailed, "cannot " + what + " a frame of " + FormatName(frame.Format()) + " at " +
                                   SizeText(frame) + ": " + ResultText(result) + " (result " +
                                   std::to_string(result) + ")");
}

const char* ResultText(PK_Result result) {
    switch (result) {
    case PK_Success:
        return "success";
    case PK_ErrBadSrcFormat:
        return "the source format is not accepted";
    case PK_ErrBadDstFormat:
        return "the destination format is not accepted";
    case PK_ErrBadWidth:
        return "the width cannot be served";
    case PK_ErrBadHeight:
        return "the height cannot be served";
    case PK_ErrSizeMismatch:
        return "the size is not one that the format has";
    case PK_ErrBadDVSourceSize:
        return "the size is not that of a DV frame";
    case PK_ErrBadDVFormat:
        return "this DV format is not covered";
    case PK_ErrBadDVDestination:
        return "the DV destination is refused";
    case PK_ErrOutOfMemory:
        return "out of memory";
    case PK_ErrFailed:
        return "nothing leads there";
    case PK_ErrNotSupported:
        return "this combination is not offered";
    default:
        return "the library gives an error";
    }
}

} // namespace tool
