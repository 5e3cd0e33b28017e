// Two frames of DV joined field by field: both are decoded, and what is joined is encoded.

#include "dv/DVFormat.h"
#include "dvcalls/CDVFrame.h"
#include "frame/Arguments.h"
#include "frame/TransientMemory.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/DV.h>

namespace PK {
namespace {

constexpr PK_PixelFormat kPictures = PK_PixelFormat_YUYV_422_8u;

/// The two decoded pictures, one below the other.
class Pictures {
public:
    explicit Pictures(const DVFormat& format)
        : fFormat(format), fBuffer(kPictures, format.width, 2 * format.height) {}

    PK_Result Result() const { return fBuffer.Result(); }

    PK_Result Decode(int32_t which, const uint8_t* frame, int32_t quality) const {
        return PK_Convert(frame, fFormat.FrameBytes(), fFormat.stream, Row(which, 0), fBuffer.RowBytes(),
                          kPictures, fFormat.width, fFormat.height, quality);
    }

    /// Gives one field of the first picture to the second. \param field  0 for the rows 0, 2, 4 ..., else 1.
    PK_Result JoinFields(int32_t field, int32_t quality) const {
        const int32_t step = 2 * fBuffer.RowBytes();
        return PK_Convert(Row(0, field), step, kPictures, Row(1, field), step, kPictures, fFormat.width,
                          fFormat.height / 2, quality);
    }

    PK_Result EncodeSecond(uint8_t* frame, int32_t quality) const {
        return PK_Convert(Row(1, 0), fBuffer.RowBytes(), kPictures, frame, fFormat.FrameBytes(),
                          fFormat.stream, fFormat.width, fFormat.height, quality);
    }

private:
    uint8_t* Row(int32_t which, int32_t row) const {
        return fBuffer.Pixels() + ptrdiff_t{which * fFormat.height + row} * fBuffer.RowBytes();
    }

    const DVFormat& fFormat;
    TransientPixelBuffer fBuffer;
};

/// All that is read of the frames is read before the first byte is written, so that the result may lie over them.
PK_Result Merge(const DVFormat& format, const uint8_t* frameA, const uint8_t* frameB, uint8_t* dst,
                int32_t quality) {
    if (HasNull({frameA, frameB, dst})) return PK_ErrFailed;
    const Pictures pictures(format);
    if (const PK_Result result = pictures.Result(); result != PK_Success) return result;
    if (const PK_Result result = pictures.Decode(0, frameA, quality); result != PK_Success) return result;
    if (const PK_Result result = pictures.Decode(1, frameB, quality); result != PK_Success) return result;
    constexpr int32_t kBehindHeader = 8;
    const DVAspect aspect = CDVFrame(frameA, format.FrameBytes()).VoteOnAspect();
    const uint8_t kept = frameB[kBehindHeader];

    const int32_t field = format.IsHD() ? 0 : 1;
    if (const PK_Result result = pictures.JoinFields(field, quality); result != PK_Success) return result;
    if (const PK_Result result = pictures.EncodeSecond(dst, quality); result != PK_Success) return result;
    if (format.isProgressive) dst[kBehindHeader] = kept;
    CDVFrame::WriteAspect(dst, format.FrameBytes(), aspect);
    return PK_Success;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_MergeDV(const void* frameA, const void* frameB, void* dst, int32_t frameBytes,
                     int32_t quality) noexcept {
    constexpr int32_t kNTSCBytes = 120000; // whatever else is told counts as PAL, and callers rely on it
    return PK_MergeDVCPRO(frameA, frameB, dst,
                          frameBytes == kNTSCBytes ? PK_PixelFormat_NTSCDV25 : PK_PixelFormat_PALDV25,
                          quality);
}

PK_Result PK_MergeDVCPRO(const void* frameA, const void* frameB, void* dst, PK_PixelFormat format,
                         int32_t quality) noexcept {
    const DVFormat* const found = FindDVFormat(format);
    if (found == nullptr) return PK_ErrBadSrcFormat;
    return Merge(*found, static_cast<const uint8_t*>(frameA), static_cast<const uint8_t*>(frameB),
                 static_cast<uint8_t*>(dst), quality);
}
