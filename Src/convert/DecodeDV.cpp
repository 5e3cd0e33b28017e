#include "convert/DecodeDV.h"

#include "convert/ChromaRows.h"
#include "convert/DVRowKernels.h"
#include "convert/DVTarget.h"
#include "convert/WorkingRows.h"
#include "dv/DVDecode.h"

#include <cstring>
#include <optional>

namespace PK {
namespace {

/// The size of a picture that a destination asks for.
std::optional<DecodedPicture> PictureOfSize(const DVFormat& format, int32_t width, int32_t height,
                                            int32_t field) {
    if (width == format.width && height == format.height / 2)
        return DecodedPicture{format, DVSize::Full, field == 2 ? 2 : 1};
    for (const DVSize size : {DVSize::Full, DVSize::Half, DVSize::Quarter, DVSize::Eighth}) {
        const DecodedPicture picture = {format, size, 0};
        if (width == picture.Width() && height == picture.Height()) return picture;
    }
    return std::nullopt;
}

/// Of DV25 by the header of the frame, where all application numbers are 0 or all 1; null where it is none. At 625 lines
/// they tell 4:2:0 and 4:1:1 apart.
const DVFormat* FormatOfFrame(const uint8_t* frame, const DVFormat& format) {
    constexpr uint8_t kNumber = 7;
    const int32_t track = frame[4] & kNumber, areas = frame[5] & kNumber;
    const bool agree = areas == (frame[6] & kNumber) && areas == (frame[7] & kNumber);
    if (!agree || areas > 1 || track > 1) return nullptr;
    return format.is625 && track == 1 ? &kDVCPROPAL25 : &format;
}

/// Which rows of chroma are those of a picture, and how they become as wide as its pixels or pairs.
class DVRowPlan {
public:
    /// \param pixels        what rows are made of: four channels, or pairs.
    /// \param interpolates  chroma between its samples and rows, or repeats it.
    DVRowPlan(const DecodedPicture& picture, PK_PixelFormat pixels, bool interpolates)
        : fPicture(picture), fInterpolates(interpolates), fIsRGB(!IsYUV(pixels)) {
        const auto& rows = Best<DVRowKernels>();
        const auto& planes = Best<PlanarDecodeKernels>();
        const bool is411 = picture.format.sampling == DVSampling::k411;
        const bool isPairs = Is422(pixels);
        if (is411) fWiden = !interpolates ? rows.repeat : isPairs ? rows.spread2 : rows.spread;
        fPixels = isPairs         ? planes.toUYVY
                  : !interpolates ? planes.every1
                  : is411         ? rows.toVUYX
                                  : planes.toVUYXFromEven;
        fWidenedWidth = is411 && interpolates && !isPairs ? picture.Width() : (picture.Width() + 1) / 2;
    }

    /// Makes rows of pixels of the planes, and by the chain of the destination.
    PK_Result Run(const DestinationPlanes& planes, const DestinationImage& destination,
                  const ConversionChain& onward) const {
        RowMemory memory(destination.width);
        memory.AddSink(onward);
        for (int i = 0; i < kTemporaryRows; ++i) memory.AddBytes(TemporaryBytes());
        return memory.With([&](TemporaryRows& rows) {
            const RowSink sink(destination, onward, rows);
            uint8_t* temporary[kTemporaryRows];
            for (uint8_t*& row : temporary) row = rows.Take(TemporaryBytes());
            for (int32_t row = 0; row < destination.height; ++row) {
                const uint8_t* const rowsOfPlanes[] = {planes[0].Row(row), Chroma(planes[1], row, temporary),
                                                       Chroma(planes[2], row, temporary + 2)};
                uint8_t* const pixels = sink.Row(row);
                fPixels(rowsOfPlanes, pixels, destination.width);
                if (fIsRGB) fRows.toBGRX(pixels, pixels, destination.width);
                sink.Finish(row);
            }
            return PK_Success;
        });
    }

private:
    static constexpr int kTemporaryRows = 4; // of U and of V, blended and widened

    size_t TemporaryBytes() const { return static_cast<size_t>(fPicture.Width()); }

    /// 4:2:0 chroma of a frame belongs to fields as its luma does.
    ChromaRows RowsOfChroma(int32_t row, int32_t chromaRows) const {
        const bool hasBothFields = fPicture.size == DVSize::Full && fPicture.field == 0;
        if (!hasBothFields) {
            const ChromaOfRow chroma(false, row, chromaRows);
            return fInterpolates ? chroma.Interpolated() : chroma.Shared();
        }
        ChromaRows inField = ChromaOfRow(false, row / 2, chromaRows / 2).Interpolated();
        inField.first = 2 * inField.first + row % 2;
        inField.second = 2 * inField.second + row % 2;
        return inField;
    }

    const uint8_t* Chroma(const Plane<uint8_t>& plane, int32_t row, uint8_t* const* temporary) const {
        const uint8_t* chroma = nullptr;
        if (fPicture.format.sampling != DVSampling::k420) {
            chroma = plane.Row(row);
        } else {
            const ChromaRows rows = RowsOfChroma(row, plane.height);
            chroma = plane.Row(rows.first);
            if (rows.first != rows.second) {
                fPlanes.blendChroma(chroma, plane.Row(rows.second), temporary[0], plane.width, rows.weights);
                chroma = temporary[0];
            }
        }
        if (fWiden == nullptr) return chroma;
        fWiden(chroma, temporary[1], fWidenedWidth);
        return temporary[1];
    }

    const DecodedPicture& fPicture;
    bool fInterpolates, fIsRGB;
    const DVRowKernels& fRows = Best<DVRowKernels>();
    const PlanarDecodeKernels& fPlanes = Best<PlanarDecodeKernels>();
    RowKernel fWiden = nullptr;
    PlanesRow fPixels;
    int32_t fWidenedWidth;
};

/// Through planes of the picture.
PK_Result DecodeRows(const ConversionChain& onward, const uint8_t* frame, const DecodedPicture& picture,
                     const DestinationImage& destination, bool interpolates) {
    const TransientBlock block(DVPlanesBytes(picture));
    if (block.Bytes() == nullptr) return PK_ErrOutOfMemory;
    const DestinationPlanes planes = DVPlanesIn(block.Bytes(), picture);
    DecodeDVToPlanes(frame, picture, planes);
    return DVRowPlan(picture, onward.source, interpolates).Run(planes, destination, onward);
}

/// DV50 and DV100.
PK_Result DecodePairs(const ConversionChain& onward, const uint8_t* frame, const DVFormat& format,
                      const DestinationImage& destination, int32_t field) {
    const int32_t width = destination.width, height = destination.height;
    const bool isFull = width == format.width, isHalf = width == format.width / 2;
    if (!isFull && !isHalf) return PK_ErrBadWidth;
    const auto picture = PictureOfSize(format, width, height, field);
    if (!picture) return PK_ErrBadHeight;
    if (isHalf) {
        if (!IsPacked4444(onward.source) || !IsYUV(onward.source)) return PK_ErrBadDstFormat;
        return DecodeRows(onward, frame, *picture, destination, true);
    }
    if (!onward.IsCopy() || onward.source != DVPairsFormat(format.stream)) return PK_ErrBadDstFormat;
    DecodeDVToYUYV(frame, *picture, destination.pixels, destination.rowBytes);
    return PK_Success;
}

} // namespace

PK_Result DecodeDV25(const ConversionChain& onward, const uint8_t* frame, PK_PixelFormat stream,
                     const DestinationImage& destination, int32_t field, int32_t quality) {
    const DVFormat* const format = FindDVFormat(stream);
    if (format == nullptr || format->channels != 1) return PK_ErrBadSrcFormat;
    const auto size = PictureOfSize(*format, destination.width, destination.height, field);
    if (!size) return PK_ErrSizeMismatch;
    const DVFormat* const ofFrame = FormatOfFrame(frame, *format);
    if (ofFrame == nullptr) return PK_ErrBadDVFormat;
    const PK_PixelFormat pixels = onward.source;
    const bool isKnown = pixels == PK_PixelFormat_UYVY_422_8u ||
                         WithAlpha(pixels, kAlphaMeaningless) == PK_PixelFormat_BGRX_4444_8u ||
                         WithAlpha(pixels, kAlphaMeaningless) == PK_PixelFormat_VUYX_4444_8u;
    if (!isKnown) return PK_ErrBadDstFormat;
    const DecodedPicture picture = {*ofFrame, size->size, size->field};
    const bool interpolates = picture.size == DVSize::Full || quality >= kExactSizeQuality;
    return DecodeRows(onward, frame, picture, destination, interpolates);
}

PK_Result DecodeDV50(const ConversionChain& onward, const uint8_t* frame, PK_PixelFormat stream,
                     const DestinationImage& destination, int32_t field) {
    const DVFormat* const format = FindDVFormat(stream);
    if (format == nullptr || format->sampling != DVSampling::k422) return PK_ErrBadSrcFormat;
    return DecodePairs(onward, frame, *format, destination, field);
}

PK_Result DecodeDV100(const ConversionChain& onward, const uint8_t* frame, PK_PixelFormat stream,
                      const DestinationImage& destination, int32_t field) {
    const DVFormat* const format = FindDVFormat(stream);
    if (format == nullptr || !format->IsHD()) return PK_ErrBadSrcFormat;
    return DecodePairs(onward, frame, *format, destination, field);
}

} // namespace PK
