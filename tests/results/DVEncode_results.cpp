// Frames of DV from the pixels that their encoders take, and from others.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/DV.h>

#include <string>

namespace {

using namespace PKResults;

struct Stream {
    PK_PixelFormat format, pixels;
    int32_t width, height;
};

constexpr Stream kFrames[] = {
    {PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUYV_422_8u, 720, 480},
    {PK_PixelFormat_PALDV25, PK_PixelFormat_UYVY_422_8u, 720, 576},
    {PK_PixelFormat_NTSCDV25, PK_PixelFormat_VUYA_4444_8u, 360, 240},
    {PK_PixelFormat_PALDV25, PK_PixelFormat_BGRA_4444_8u, 360, 288},
    {PK_PixelFormat_NTSCDV50, PK_PixelFormat_YUYV_422_8u, 720, 480},
    {PK_PixelFormat_PALDV50, PK_PixelFormat_YUYV_422_8u, 720, 576},
    {PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_YUYV_422_8u_709, 960, 720},
    {PK_PixelFormat_PAL_DV100_720p, PK_PixelFormat_YUYV_422_8u_709, 960, 720},
    {PK_PixelFormat_NTSC_DV100_1080i, PK_PixelFormat_YUYV_422_8u_709, 1280, 1080},
    {PK_PixelFormat_PAL_DV100_1080i, PK_PixelFormat_YUYV_422_8u_709, 1440, 1080},
};

/// Slopes and a little noise, with more of it further down, so that quantisers of all kinds are used.
Image PictureOf(const Stream& stream, const Walk& walk, Random& random) {
    Image picture(stream.pixels, stream.width, stream.height, walk, random);
    for (int32_t y = 0; y < stream.height; ++y) {
        uint8_t* const row = picture.Row(y);
        const size_t noise = 1 + 8 * static_cast<size_t>(y) / static_cast<size_t>(stream.height) * 9;
        for (size_t i = 0; i < picture.RowLength(); ++i)
            row[i] = static_cast<uint8_t>(60 + 120 * i / picture.RowLength() + row[i] % noise);
    }
    return picture;
}

Image FrameOf(PK_PixelFormat format, Random& random) {
    return {static_cast<size_t>(PK_PixelFormatSize(format, 0, 0)), 1, kSpread, random};
}

void AddFrames(Lines& lines) {
    for (const Stream& stream : kFrames)
        for (const int32_t quality : {0, 3, 5})
            lines.Add(NameOf(stream.format) + "/" + NameOf(stream.pixels) + "/" + std::to_string(quality),
                      [&](Line& line) {
                          const Walk& walk = kWalks[quality % 3];
                          Image picture = PictureOf(stream, walk, line.random),
                                frame = FrameOf(stream.format, line.random);
                          line.results.Add(PK_Convert(picture.First(), picture.Step(), stream.pixels,
                                                      frame.First(), static_cast<int32_t>(frame.RowLength()),
                                                      stream.format, stream.width, stream.height, quality));
                          frame.AddTo(line.results);
                      });
}

void AddPairs(Lines& lines) {
    for (const Stream& stream : kFrames) {
        if (stream.height < 720) continue;
        for (const int32_t offset : {1, 2, -2})
            lines.Add(NameOf(stream.format) + "/offset/" + std::to_string(offset), [&](Line& line) {
                Image picture = PictureOf(stream, kTight, line.random),
                      frame = FrameOf(stream.format, line.random);
                line.results.Add(PK_CompressDV100720pWithChannelOffset(
                    picture.First(), picture.Step(), stream.pixels, stream.width, stream.height,
                    frame.First(), static_cast<int32_t>(frame.RowLength()), offset, stream.format, 4));
                frame.AddTo(line.results);
            });
    }
}

void AddDVCPRO(Lines& lines) {
    for (const Stream& stream : kFrames) {
        if (stream.height > 576) continue;
        lines.Add(NameOf(stream.format) + "/" + NameOf(stream.pixels) + "/dvcpro", [&](Line& line) {
            Image picture = PictureOf(stream, kTight, line.random),
                  frame = FrameOf(stream.format, line.random);
            line.results.Add(PK_CompressDVCPROPAL25(
                picture.First(), picture.Step(), stream.pixels, stream.width, stream.height, frame.First(),
                static_cast<int32_t>(frame.RowLength()), stream.format, 4));
            frame.AddTo(line.results);
        });
    }
}

/// A small picture, which is refused in any case.
void AddOdd(Lines& lines) {
    for (const Stream& stream : kFrames)
        AddOddCalls(lines, NameOf(stream.format) + "/" + NameOf(stream.pixels), 2,
                    [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
                        Image picture(stream.pixels, kOddWidth, kOddHeight, kTight, line.random);
                        Image frame = FrameOf(stream.format, line.random);
                        const auto bytes = static_cast<int32_t>(frame.RowLength());
                        line.results.Add(PK_CompressDVCPROPAL25(
                            nulls(0, picture.First()), picture.Step(), stream.pixels, width, height,
                            nulls(1, frame.First()), bytes, stream.format, 4));
                        line.results.Add(PK_CompressDV100720pWithChannelOffset(
                            nulls(0, picture.First()), picture.Step(), stream.pixels, width, height,
                            nulls(1, frame.First()), bytes, 2, stream.format, 4));
                        frame.AddTo(line.results);
                    });
}

void AddAll(Lines& lines) {
    AddFrames(lines);
    AddPairs(lines);
    AddDVCPRO(lines);
    AddOdd(lines);
}

const Family sDVEncode("dv-encode", AddAll);

} // namespace
