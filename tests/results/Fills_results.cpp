// The named fills, and fills with a pixel of any format.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Fills.h>

#include <algorithm>
#include <span>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk walk;
};

constexpr Shape kShapes[] = {{1, 2, kTight},    {2, 2, kTight},   {7, 3, kSpread},
                             {33, 3, kUpwards}, {101, 2, kTight}, {320, 4, kSpread}};

/// Streams are large, and have no rows.
std::span<const Shape> ShapesFor(PK_PixelFormat format) {
    const std::span<const Shape> shapes = kShapes;
    return format >> 24 == 0 ? shapes : shapes.subspan(2, 2);
}

/// Room for an image of any format, or for a stream of that size.
Image ImageFor(PK_PixelFormat format, const Shape& shape, Random& random) {
    if (format >> 24 == 0) {
        const int32_t length = std::max(PK_PixelFormatPackedRowBytes(format, shape.width), 16 * shape.width);
        return {static_cast<size_t>(length), shape.height, shape.walk, random};
    }
    const int64_t bytes = PK_PixelFormatSize(format, shape.width, shape.height);
    return {static_cast<size_t>(std::max<int64_t>(bytes, 256)), 1, kTight, random};
}

struct NamedFill {
    const char* name;
    decltype(&PK_FillWithOpaqueBlack) fill;
};

constexpr NamedFill kFills[] = {{"opaque-black", PK_FillWithOpaqueBlack},
                                {"opaque-white", PK_FillWithOpaqueWhite},
                                {"transparent-black", PK_FillWithTransparentBlack},
                                {"transparent-white", PK_FillWithTransparentWhite}};

template <class Use>
void ForEachFormat(Use use) {
    std::ranges::for_each(kRasters, use);
    std::ranges::for_each(kStreams, use);
    std::ranges::for_each(kStrangers, use);
}

void AddNamedFills(Lines& lines) {
    for (const NamedFill& named : kFills) {
        ForEachFormat([&](PK_PixelFormat format) {
            lines.Add(std::string(named.name) + "/" + NameOf(format), [&](Line& line) {
                for (const Shape& shape : ShapesFor(format)) {
                    Image image = ImageFor(format, shape, line.random);
                    line.results.Add(
                        named.fill(image.First(), image.Step(), shape.width, shape.height, format));
                    image.AddTo(line.results);
                }
            });
        });
        for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_YUV_420_MPEG2_FIELD})
            AddOddCalls(lines, std::string(named.name) + "/" + NameOf(format), 1,
                        [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
                            Image image = ImageFor(format, {kOddWidth, kOddHeight, kTight}, line.random);
                            line.results.Add(
                                named.fill(nulls(0, image.First()), image.Step(), width, height, format));
                            image.AddTo(line.results);
                        });
    }
}

struct Colour {
    Colour(PK_PixelFormat itsFormat, Random& random) : format(itsFormat) {
        FillSamples(format, Content::kOrdinary, bytes, sizeof bytes, random);
    }

    PK_PixelFormat format;
    alignas(16) uint8_t bytes[16];
};

void FillWithColours(Line& line, PK_PixelFormat format, PK_PixelFormat pixelFormat) {
    for (const Shape& shape : ShapesFor(format)) {
        const Colour colour(pixelFormat, line.random);
        Image image = ImageFor(format, shape, line.random);
        line.results.Add(PK_FillWithColor(image.First(), image.Step(), shape.width, shape.height, format,
                                          colour.bytes, pixelFormat));
        image.AddTo(line.results);
    }
}

void AddColours(Lines& lines) {
    ForEachFormat([&](PK_PixelFormat format) {
        for (const PK_PixelFormat pixelFormat : kRasters)
            lines.Add("colour/" + NameOf(format) + "/" + NameOf(pixelFormat),
                      [&](Line& line) { FillWithColours(line, format, pixelFormat); });
        lines.Add("colour/" + NameOf(format) + "/odd/no-pixels", [&](Line& line) {
            for (const PK_PixelFormat stream : kStreams) FillWithColours(line, format, stream);
            for (const PK_PixelFormat stranger : kStrangers) FillWithColours(line, format, stranger);
        });
    });
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_V210_422_10u})
        AddOddCalls(lines, "colour/" + NameOf(format), 2,
                    [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
                        const Colour colour(PK_PixelFormat_ARGB_4444_8u, line.random);
                        Image image = ImageFor(format, {kOddWidth, kOddHeight, kTight}, line.random);
                        line.results.Add(PK_FillWithColor(nulls(0, image.First()), image.Step(), width,
                                                          height, format, nulls(1, colour.bytes),
                                                          colour.format));
                        image.AddTo(line.results);
                    });
}

void AddFills(Lines& lines) {
    AddNamedFills(lines);
    AddColours(lines);
}

const Family sFills("fills", AddFills);

} // namespace
