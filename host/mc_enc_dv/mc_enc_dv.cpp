// The bundled encoder of DV25, which is the library's own.

#include "mc_enc_dv/mc_enc_dv.h"

#include "dv/EncodeDV.h"
#include "frame/TransientMemory.h"
#include "mc_enc_dv/DoubledPicture.h"

#include <PixelKiln/Convert.h>

namespace mc_enc_dv {
namespace {

using namespace PK;

/// A picture on its way to one that can be encoded.
struct Picture {
    const uint8_t* pixels;
    int32_t rowBytes;
    int32_t width, height;
    uint32_t fourcc;
    bool hasAlpha;
};

const DVFormat* FormatOf(const Picture& picture, bool isDVCPRO) {
    const DVFormat& format525 = *FindDVFormat(PK_PixelFormat_NTSCDV25);
    const DVFormat& format625 = isDVCPRO ? kDVCPROPAL25 : *FindDVFormat(PK_PixelFormat_PALDV25);
    for (const DVFormat* format : {&format525, &format625})
        for (const int32_t part : {1, 2})
            if (picture.width == format->width / part && picture.height == format->height / part)
                return format;
    return nullptr;
}

/// The format of a kind that goes through a conversion; none of the others.
PK_PixelFormat FormatOfPixels(const Picture& picture) {
    if (picture.fourcc == kBGRA)
        return picture.hasAlpha ? PK_PixelFormat_BGRA_4444_8u : PK_PixelFormat_BGRX_4444_8u;
    if (picture.fourcc == kVUYA)
        return picture.hasAlpha ? PK_PixelFormat_VUYA_4444_8u : PK_PixelFormat_VUYX_4444_8u;
    return PK_PixelFormat_Invalid;
}

constexpr bool IsPairs(uint32_t fourcc) {
    return fourcc == kYUYV || fourcc == kUYVY;
}

/// Rows from the top of the picture, as a conversion from their format takes them.
PK_Result ToYUYV(const Picture& from, const TransientPixelBuffer& buffer) {
    const PK_PixelFormat format = FormatOfPixels(from);
    const uint8_t* first = from.pixels;
    int32_t rowBytes = from.rowBytes;
    if (PK_IsOriginBottomLeft(format)) {
        first += int64_t{from.height - 1} * rowBytes;
        rowBytes = -rowBytes;
    }
    constexpr int32_t kAnyQuality = 0;
    return PK_Convert(first, rowBytes, format, buffer.Pixels(), buffer.RowBytes(), PK_PixelFormat_YUYV_422_8u,
                      from.width, from.height, kAnyQuality);
}

struct Job {
    const DVFormat& format;
    const DVPolicy& policy;
    uint8_t* frame;

    int32_t Run(const Picture& picture) const {
        if (!IsPairs(picture.fourcc)) return RunConverted(picture);
        if (picture.width != format.width) return RunDoubled(picture);
        EncodeDV(format, {picture.pixels, picture.rowBytes, picture.fourcc == kYUYV}, 0, policy, frame);
        return format.FrameBytes();
    }

private:
    int32_t RunConverted(const Picture& picture) const {
        const TransientPixelBuffer buffer(PK_PixelFormat_YUYV_422_8u, picture.width, picture.height);
        if (buffer.Result() != PK_Success) return buffer.Result();
        const PK_Result result = ToYUYV(picture, buffer);
        if (result != PK_Success) return result;
        return Run({buffer.Pixels(), buffer.RowBytes(), picture.width, picture.height, kYUYV, false});
    }

    int32_t RunDoubled(const Picture& picture) const {
        const TransientPixelBuffer buffer(PK_PixelFormat_YUYV_422_8u, format.width, format.height);
        if (buffer.Result() != PK_Success) return buffer.Result();
        DoublePicture({picture.pixels, picture.rowBytes, picture.fourcc == kYUYV}, picture.width,
                      picture.height, buffer.Pixels(), buffer.RowBytes());
        return Run({buffer.Pixels(), buffer.RowBytes(), format.width, format.height, kYUYV, false});
    }
};

} // namespace

// It keeps nothing from frame to frame, and so one handle serves all.
Handle Open() noexcept {
    static constinit char sEncoder = 0;
    return &sEncoder;
}

void Close(Handle) noexcept {}

bool IsReentrant() noexcept {
    return true;
}

int32_t Encode(Handle, const void* pixels, int32_t rowBytes, void* dst, int32_t dstBytes, int32_t width,
               int32_t height, int32_t, int32_t flags, uint32_t fourcc, int32_t, int32_t) noexcept {
    const Picture picture = {
        static_cast<const uint8_t*>(pixels), rowBytes, width, height, fourcc, (flags & kHasAlpha) != 0};
    const bool isKnown = IsPairs(fourcc) || FormatOfPixels(picture) != PK_PixelFormat_Invalid;
    const DVFormat* const format = FormatOf(picture, (flags & kDVCPRO) != 0);
    if (pixels == nullptr || dst == nullptr || !isKnown || format == nullptr) return 0;
    if (dstBytes != format->FrameBytes()) return 0;
    const DVPolicy& policy = (flags & kFast) != 0 ? kPlainDVPolicy : kBestDVPolicy;
    return Job{*format, policy, static_cast<uint8_t*>(dst)}.Run(picture);
}

} // namespace mc_enc_dv
