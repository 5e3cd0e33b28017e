// The Gaussian blur of all formats of four channels, sizes and sigmas.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/GaussianBlur.h>

#include <limits>
#include <string>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height, moreColumns, moreRows;
    Walk source, destination;
};

constexpr Shape kShapes[] = {{1, 1, 0, 0, kTight, kTight},
                             {7, 5, 3, 2, kSpread, kTight},
                             {33, 33, 0, 1, kTight, kUpwards},
                             {101, 40, 12, 9, kUpwards, kSpread}};

struct Blurring {
    PK_PixelFormat source, destination;
    double sigmaX, sigmaY;
    bool repeatEdge = false, linear = false;
    int32_t direction = 3, quality = 4;
    Content content = Content::kOrdinary;
    RoundingMode rounding = RoundingMode::kNearest;

    void Make(Line& line, const Shape& shape) const {
        const int32_t width = shape.width + shape.moreColumns, height = shape.height + shape.moreRows;
        Image from(source, shape.width, shape.height, shape.source, line.random);
        Image image(destination, width, height, shape.destination, line.random);
        from.Fill(source, content, line.random);
        if (IsFloat(destination)) image.Fill(destination, Content::kOrdinary, line.random);
        const Rounding mode(rounding);
        line.results.Add(PK_GaussianBlur(from.First(), from.Step(), shape.width, shape.height, source,
                                         image.First(), image.Step(), width, height, destination, sigmaX,
                                         sigmaY, repeatEdge, linear, direction, quality));
        if (IsFloat(destination)) image.UniteNaNs(); // infinities make them
        image.AddTo(line.results);
    }
};

bool HasFourChannels(PK_PixelFormat format) {
    return (format & 0x30) == 0 && (format & 0xc) != 0;
}

void AddFormat(Lines& lines, PK_PixelFormat format) {
    const auto add = [&](const std::string& name, const Blurring& blurring) {
        lines.Add(NameOf(format) + "/" + name, [&](Line& line) {
            for (const Shape& shape : kShapes) blurring.Make(line, shape);
        });
    };
    add("rows", {.source = format, .destination = format, .sigmaX = 1.3, .sigmaY = 2, .direction = 1});
    add("columns", {.source = format, .destination = format, .sigmaX = 2, .sigmaY = 3.1, .direction = 2});
    add("both", {.source = format, .destination = format, .sigmaX = 4.5, .sigmaY = 0.7});
    add("repeated",
        {.source = format, .destination = format, .sigmaX = 4.5, .sigmaY = 9, .repeatEdge = true});
    add("linear", {.source = format, .destination = format, .sigmaX = 1.5, .sigmaY = 2, .linear = true});
    add("none", {.source = format, .destination = format, .sigmaX = 0, .sigmaY = -1});
    add("edges",
        {.source = format, .destination = format, .sigmaX = 1.5, .sigmaY = 2, .content = Content::kEdges});
    add("down", {.source = format,
                 .destination = format,
                 .sigmaX = 1.5,
                 .sigmaY = 2,
                 .rounding = RoundingMode::kDown});
    for (const PK_PixelFormat other : {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_VUYA_4444_8u_709,
                                       PK_PixelFormat_XRGB_4444_15u, PK_PixelFormat_VUYP_4444_32f})
        add("to/" + NameOf(other), {.source = format, .destination = other, .sigmaX = 1.5, .sigmaY = 2});
}

void AddSigmas(Lines& lines) {
    constexpr double kSigmas[] = {1e-9,
                                  0.2,
                                  1,
                                  10,
                                  40,
                                  100,
                                  1e5,
                                  std::numeric_limits<double>::infinity(),
                                  std::numeric_limits<double>::quiet_NaN()};
    for (const double sigma : kSigmas)
        lines.Add("sigma/" + std::to_string(sigma), [&](Line& line) {
            for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f})
                Blurring{.source = format,
                         .destination = format,
                         .sigmaX = sigma,
                         .sigmaY = sigma,
                         .repeatEdge = true}
                    .Make(line, kShapes[3]);
        });
    for (int32_t direction = -1; direction < 5; ++direction)
        lines.Add("direction/" + std::to_string(direction), [&](Line& line) {
            Blurring{.source = PK_PixelFormat_BGRA_4444_8u,
                     .destination = PK_PixelFormat_BGRA_4444_8u,
                     .sigmaX = 2,
                     .sigmaY = 3,
                     .direction = direction}
                .Make(line, kShapes[1]);
        });
    lines.Add("long", [](Line& line) {
        const Blurring blurring = {.source = PK_PixelFormat_BGRA_4444_8u,
                                   .destination = PK_PixelFormat_BGRA_4444_8u,
                                   .sigmaX = 20,
                                   .sigmaY = 30};
        blurring.Make(line, {3001, 5, 7, 1, kTight, kTight});
        blurring.Make(line, {5, 3001, 1, 7, kTight, kTight});
        blurring.Make(line, {1100, 40, 0, 0, kTight, kTight});
    });
}

struct Size {
    int32_t width, height;
};

void AddOdd(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    const auto blur = [](Line& line, PK_PixelFormat from, PK_PixelFormat to, Nulls nulls, int32_t width,
                         int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        for (const double sigma : {0.0, 1.0})
            for (const Size& size : {Size{width, height}, Size{kOddWidth, kOddHeight}})
                line.results.Add(PK_GaussianBlur(nulls(0, source.First()), source.Step(), width, height, from,
                                                 nulls(1, image.First()), image.Step(), size.width,
                                                 size.height, to, sigma, sigma, false, false, 3, 4));
        image.AddTo(line.results);
    };
    AddOddCalls(lines, "gaussian-blur", 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        blur(line, kFormat, kFormat, nulls, width, height);
    });
    lines.Add("gaussian-blur/odd/too-large", [&](Line& line) {
        Image image(size_t{16} * kOddWidth, kOddHeight, kTight, line.random);
        for (const Size& size : {Size{kOddWidth, kOddHeight - 1}, Size{kOddWidth - 1, kOddHeight}})
            line.results.Add(PK_GaussianBlur(image.First(), image.Step(), kOddWidth, kOddHeight, kFormat,
                                             image.First(), image.Step(), size.width, size.height, kFormat, 1,
                                             1, false, false, 3, 4));
        image.AddTo(line.results);
    });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("gaussian-blur/odd/" + NameOf(format), [&](Line& line) {
            blur(line, format, kFormat, Nulls::None(), kOddWidth, kOddHeight);
            blur(line, kFormat, format, Nulls::None(), kOddWidth, kOddHeight);
        });
    };
    for (const PK_PixelFormat format : kStrangers) addFormat(format);
    for (const PK_PixelFormat format : kStreams) addFormat(format);
    for (const PK_PixelFormat format : kRasters)
        if (!HasFourChannels(format)) addFormat(format);
}

void AddGaussianBlurs(Lines& lines) {
    for (const PK_PixelFormat format : kRasters)
        if (HasFourChannels(format)) AddFormat(lines, format);
    AddSigmas(lines);
    AddOdd(lines);
}

const Family sGaussianBlur("gaussian-blur", AddGaussianBlurs);

} // namespace
