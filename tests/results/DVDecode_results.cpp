// Pictures of frames of DV, some of whose bytes are anything, at all sizes and in the formats that decoders give.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/ScaleConvert.h>

#include <string>
#include <vector>

namespace {

using namespace PKResults;

constexpr PK_PixelFormat kFormatsOfDV25[] = {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_8u,
                                             PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_V210_422_10u};

struct Stream {
    PK_PixelFormat format;
    int32_t width, height;
    std::vector<PK_PixelFormat> whole, half;
};

const std::vector<Stream>& Streams() {
    static const std::vector<PK_PixelFormat> ofDV25(std::begin(kFormatsOfDV25), std::end(kFormatsOfDV25));
    static const std::vector<PK_PixelFormat> of50 = {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_BGRX_4444_8u};
    static const std::vector<PK_PixelFormat> of100 = {PK_PixelFormat_YUYV_422_8u_709,
                                                      PK_PixelFormat_BGRA_4444_15u};
    static const std::vector<Stream> streams = {
        {PK_PixelFormat_NTSCDV25, 720, 480, ofDV25, {}},
        {PK_PixelFormat_PALDV25, 720, 576, ofDV25, {}},
        {PK_PixelFormat_NTSCDV50, 720, 480, of50, {PK_PixelFormat_VUYA_4444_8u}},
        {PK_PixelFormat_PALDV50, 720, 576, of50, {PK_PixelFormat_BGRA_4444_8u}},
        {PK_PixelFormat_NTSC_DV100_720p, 960, 720, of100, {PK_PixelFormat_VUYA_4444_8u_709}},
        {PK_PixelFormat_PAL_DV100_720p, 960, 720, of100, {PK_PixelFormat_VUYA_4444_8u_709}},
        {PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, of100, {PK_PixelFormat_BGRA_4444_8u}},
        {PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, of100, {PK_PixelFormat_VUYA_4444_8u_709}},
    };
    return streams;
}

/// Blocks that begin with little and go on in bits that have fewer ones than zeros or as many, as streams do, behind a good
/// header.
std::vector<uint8_t> FrameOf(const Stream& stream, uint8_t application, Random& random) {
    std::vector<uint8_t> frame(static_cast<size_t>(PK_PixelFormatSize(stream.format, 0, 0)));
    for (uint8_t& byte : frame) {
        const uint64_t bits = random.Next();
        byte = static_cast<uint8_t>(bits % 3 == 0 ? bits >> 8 : bits >> 8 & bits >> 16);
    }
    for (const size_t byte : {4u, 5u, 6u, 7u})
        frame[byte] = static_cast<uint8_t>((frame[byte] & 0xf8) | application);
    return frame;
}

void AddPicture(Lines& lines, const Stream& stream, uint8_t application, PK_PixelFormat format, int32_t shift,
                const std::string& name) {
    lines.Add(NameOf(stream.format) + "/" + NameOf(format) + "/" + name, [&](Line& line) {
        const std::vector<uint8_t> frame = FrameOf(stream, application, line.random);
        const int32_t width = stream.width >> shift, height = stream.height >> shift;
        Image picture(format, width, height, kWalks[line.random.Next() % 3], line.random);
        line.results.Add(PK_Convert(frame.data(), 0, stream.format, picture.First(), picture.Step(), format,
                                    width, height, 2));
        picture.AddTo(line.results);
    });
}

void AddField(Lines& lines, const Stream& stream, int32_t field) {
    const PK_PixelFormat format = stream.whole.front();
    lines.Add(NameOf(stream.format) + "/field/" + std::to_string(field), [&](Line& line) {
        const std::vector<uint8_t> frame = FrameOf(stream, 0, line.random);
        Image picture(format, stream.width, stream.height / 2, kSpread, line.random);
        line.results.Add(PK_ScaleConvert(frame.data(), 0, stream.width, stream.height, stream.format, field,
                                         picture.First(), picture.Step(), stream.width, stream.height / 2,
                                         format, 0, 2));
        picture.AddTo(line.results);
    });
}

void AddAll(Lines& lines) {
    for (const Stream& stream : Streams()) {
        for (const PK_PixelFormat format : stream.whole) AddPicture(lines, stream, 0, format, 0, "whole");
        for (const PK_PixelFormat format : stream.half) AddPicture(lines, stream, 0, format, 1, "half");
        for (const int32_t field : {1, 2}) AddField(lines, stream, field);
    }
    for (const Stream& stream : {Streams()[0], Streams()[1]}) {
        AddPicture(lines, stream, 1, PK_PixelFormat_UYVY_422_8u, 0, "dvcpro");
        for (const PK_PixelFormat format : stream.whole) {
            AddPicture(lines, stream, 0, format, 2, "quarter");
            AddPicture(lines, stream, 0, format, 3, "eighth");
        }
    }
}

const Family sDVDecode("dv-decode", AddAll);

} // namespace
