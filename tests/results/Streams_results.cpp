// PK_Convert from, to and between streams: copies, and the result codes of what has no codec.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Convert.h>

#include <algorithm>
#include <span>
#include <vector>

namespace {

using namespace PKResults;

struct Size {
    int32_t width, height;
};

/// Those of DV pictures, their fields and halves, and others.
constexpr Size kSizes[] = {{720, 480},   {720, 576},  {720, 240},   {360, 240}, {960, 720}, {480, 360},
                           {1280, 1080}, {1280, 540}, {1440, 1080}, {640, 540}, {45, 31}};

/// A raster picture is converted before an encoder refuses it.
constexpr Size kSmallSizes[] = {{48, 32}, {45, 31}, {0, 32}, {48, 0}, {-1, 32}, {48, -1}};

/// What decoders give, and what is converted from it.
constexpr PK_PixelFormat kSomeRasters[] = {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_VUYA_4444_8u_709,
                                           PK_PixelFormat_BGRA_4444_8u};

/// Memory that is large enough for every picture, and stays what it is where nothing is converted.
std::vector<uint8_t>& Picture() {
    static std::vector<uint8_t> picture(size_t{16} * 1440 * 1080);
    return picture;
}

void AddCodes(Line& line, PK_PixelFormat from, PK_PixelFormat to, std::span<const Size> sizes) {
    constexpr size_t kLookedAt = 4096;
    static std::vector<uint8_t> destination(Picture().size());
    std::fill_n(destination.begin(), kLookedAt, uint8_t{0}); // whatever lines went before
    for (const Size& size : sizes)
        for (const int32_t quality : {0, 4})
            line.results.Add(PK_Convert(Picture().data(), PK_PixelFormatRowBytes(from, size.width), from,
                                        destination.data(), PK_PixelFormatRowBytes(to, size.width), to,
                                        size.width, size.height, quality));
    line.results.AddBytes(destination.data(), kLookedAt);
}

/// Too wide for what a picture would be decoded to.
void AddTooWide(Lines& lines) {
    constexpr Size sizes[] = {{134217728, 1}};
    for (const PK_PixelFormat stream : {kStreams[0], kStreams[2], kStreams[8]}) {
        constexpr PK_PixelFormat kRaster = PK_PixelFormat_BGRA_4444_8u;
        lines.Add("too-wide/" + NameOf(stream), [&](Line& line) {
            AddCodes(line, stream, kRaster, sizes);
            AddCodes(line, kRaster, stream, sizes);
        });
    }
}

/// From, to and between all streams but those that are copied.
void AddAllCodes(Lines& lines) {
    for (const PK_PixelFormat stream : kStreams) {
        const std::string name = NameOf(stream);
        lines.Add(name + "/to-rasters", [&](Line& line) {
            for (const PK_PixelFormat raster : kRasters) AddCodes(line, stream, raster, kSmallSizes);
            for (const PK_PixelFormat raster : kSomeRasters) AddCodes(line, stream, raster, kSizes);
        });
        lines.Add(name + "/from-rasters", [&](Line& line) {
            for (const PK_PixelFormat raster : kRasters) AddCodes(line, raster, stream, kSmallSizes);
        });
        lines.Add(name + "/to-streams", [&](Line& line) {
            for (const PK_PixelFormat other : kStreams)
                if (other != stream) AddCodes(line, stream, other, kSmallSizes);
        });
        lines.Add(name + "/strangers", [&](Line& line) {
            for (const PK_PixelFormat stranger : kStrangers) {
                AddCodes(line, stream, stranger, kSmallSizes);
                AddCodes(line, stranger, stream, kSmallSizes);
            }
        });
    }
}

void Copy(Line& line, PK_PixelFormat format, Nulls nulls, int32_t width, int32_t height) {
    const auto bytes = static_cast<size_t>(PK_PixelFormatSize(format, kOddWidth, kOddHeight));
    Image source(bytes, 1, kTight, line.random), destination(bytes, 1, kSpread, line.random);
    line.results.Add(PK_Convert(nulls(0, source.First()), source.Step(), format,
                                nulls(1, destination.First()), destination.Step(), format, width, height, 4));
    destination.AddTo(line.results);
}

void AddCopies(Lines& lines) {
    for (const PK_PixelFormat format : kStreams) {
        lines.Add(NameOf(format) + "/copy",
                  [&](Line& line) { Copy(line, format, Nulls::None(), kOddWidth, kOddHeight); });
        AddOddCalls(lines, NameOf(format), 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
            Copy(line, format, nulls, width, height);
        });
    }
}

/// A stream of a kind that nobody knows is a block of as many bytes as its row bytes say.
void AddUnknown(Lines& lines) {
    struct RowBytes {
        int32_t from, to;
    };
    constexpr RowBytes rowBytes[] = {{77, 77}, {77, 78}, {0, 0}, {-77, -77}};
    for (const PK_PixelFormat format : kStrangers)
        lines.Add(NameOf(format) + "/copy", [&](Line& line) {
            if (format >> 24 == 0) return;
            for (const RowBytes& bytes : rowBytes) {
                constexpr size_t kPlenty = 1 << 20; // more than any DV frame has
                Image source(kPlenty, 1, kTight, line.random), destination(kPlenty, 1, kTight, line.random);
                line.results.Add(PK_Convert(source.First(), bytes.from, format, destination.First(), bytes.to,
                                            format, kOddWidth, kOddHeight, 4));
                destination.AddTo(line.results);
            }
        });
}

void AddStreams(Lines& lines) {
    AddAllCodes(lines);
    AddCopies(lines);
    AddUnknown(lines);
    AddTooWide(lines);
}

const Family sStreams("streams", AddStreams);

} // namespace
