#include "Library.h"

#include "Way.h"

#include "VideoFormats.h"

#include <algorithm>

namespace ChromaBench {
namespace {

constexpr PK_PixelFormat kPixels = PK_PixelFormat_VUYX_4444_8u;

PK_PixelFormat FormatOf(const Kind& kind) {
    return tool::Video420{kind.isCentred, kind.areFields}.Format();
}

void Copy(const Plane& from, const tool::Plane& to) {
    for (int32_t row = 0; row < from.height; ++row)
        std::copy_n(from.Row(row), from.width, to.first + ptrdiff_t{row} * to.rowBytes);
}

tool::Frame FromPixels(const Video& pixels) {
    tool::Frame frame(kPixels, pixels.y.width, pixels.y.height);
    for (int32_t y = 0; y < frame.Height(); ++y)
        for (int32_t x = 0; x < frame.Width(); ++x) {
            uint8_t* const pixel = frame.Row(y) + 4 * x;
            pixel[0] = pixels.v.Row(y)[x];
            pixel[1] = pixels.u.Row(y)[x];
            pixel[2] = pixels.y.Row(y)[x];
            pixel[3] = 255;
        }
    return frame;
}

Video Decode(const Video& planes, const Kind& kind) {
    return ToPixels(Decoded(planes, kind, kPixels));
}

/// The decoder itself, to any format but VUYX: by rows of 4:2:2, whose pairs hold the samples of the plane.
Video DecodeBy422(const Video& planes, const Kind& kind) {
    tool::Frame frame(PK_PixelFormat_VUYA_4444_8u, planes.y.width, planes.y.height);
    const void* const pointers[3] = {planes.y.Row(0), planes.u.Row(0), planes.v.Row(0)};
    const int32_t rowBytes[3] = {planes.y.width, planes.u.width, planes.v.width};
    tool::Require(PK::DecompressYUV_420_8u(pointers, rowBytes, frame.Width(), frame.Height(), FormatOf(kind),
                                           frame.Row(0), -frame.RowBytes(), frame.Width(), frame.Height(),
                                           frame.Format(), 0, tool::kDefaultQuality),
                  "decode to", frame);
    return ToPixels(frame);
}

Video Encode(const Video& pixels, const Kind& kind) {
    const tool::Frame frame = tool::Converted(FromPixels(pixels), FormatOf(kind), tool::kDefaultQuality);
    Video video = EmptyPlanes(frame.Width(), frame.Height());
    Plane* const to[] = {&video.y, &video.u, &video.v};
    const std::vector<tool::Plane> planes = frame.Planes();
    for (size_t i = 0; i < 3; ++i)
        for (int32_t row = 0; row < to[i]->height; ++row)
            std::copy_n(planes[i].first + ptrdiff_t{row} * planes[i].rowBytes, to[i]->width, to[i]->Row(row));
    return video;
}

const AddWays add = {
    {"PixelKiln", Decode, Encode},
    {"PixelKiln, by rows of 4:2:2", DecodeBy422, Encode,
     false}, // draws what the other draws, but for centred chroma
};

} // namespace

tool::Frame Decoded(const Video& planes, const Kind& kind, PK_PixelFormat format) {
    const tool::Frame frame(FormatOf(kind), planes.y.width, planes.y.height);
    const std::vector<tool::Plane> to = frame.Planes();
    Copy(planes.y, to[0]);
    Copy(planes.u, to[1]);
    Copy(planes.v, to[2]);
    return tool::Converted(frame, format, tool::kDefaultQuality);
}

Video ToPixels(const tool::Frame& frame) {
    Video video = EmptyPixels(frame.Width(), frame.Height());
    for (int32_t y = 0; y < frame.Height(); ++y)
        for (int32_t x = 0; x < frame.Width(); ++x) {
            const uint8_t* const pixel = frame.Row(y) + 4 * x;
            video.v.Row(y)[x] = pixel[0];
            video.u.Row(y)[x] = pixel[1];
            video.y.Row(y)[x] = pixel[2];
        }
    return video;
}

tool::Frame ToRGB(const Video& pixels) {
    return tool::Converted(FromPixels(pixels), PK_PixelFormat_BGRA_4444_8u, tool::kDefaultQuality);
}

} // namespace ChromaBench
