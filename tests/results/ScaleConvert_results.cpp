// Images scaled and converted: all pairs of formats by the routes that drop, and few by those that filter.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/ScaleConvert.h>

namespace {

using namespace PKResults;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kUYVY = PK_PixelFormat_UYVY_422_8u;
constexpr PK_PixelFormat kFew[] = {kBGRA,
                                   kUYVY,
                                   PK_PixelFormat_V210_422_10u_709,
                                   PK_PixelFormat_BGRP_4444_32f_Linear,
                                   PK_PixelFormat_RGB_444_10u,
                                   PK_PixelFormat_ARGB_4444_15u};

struct Side {
    PK_PixelFormat format;
    int32_t width, height, field;
};

struct Scaling {
    Side from, to;
    int32_t quality = 2, renderField = 0;

    void Make(Line& line, const Walk& walk) const {
        Image source(from.format, from.width, from.height, walk, line.random);
        source.Fill(from.format, Content::kOrdinary, line.random);
        Image image(to.format, to.width, to.height, walk, line.random);
        line.results.Add(PK_ScaleConvertOneField(
            source.First(), source.Step(), from.width, from.height, from.format, from.field, image.First(),
            image.Step(), to.width, to.height, to.format, to.field, quality, renderField));
        image.AddTo(line.results);
    }
};

void AddFormat(Lines& lines, PK_PixelFormat from) {
    lines.Add("format/" + NameOf(from), [&](Line& line) {
        for (const PK_PixelFormat to : kRasters)
            for (const Walk& walk : {kTight, kUpwards}) {
                Scaling{{from, 38, 12, 1}, {to, 19, 6, 0}}.Make(line, walk);
                Scaling{{from, 19, 12, 2}, {to, 19, 6, 0}}.Make(line, walk);
                Scaling{{from, 19, 6, 0}, {to, 19, 6, 0}}.Make(line, walk);
            }
    });
}

void AddQuality(Lines& lines, int32_t quality) {
    for (const PK_PixelFormat from : kFew)
        lines.Add("quality/" + std::to_string(quality) + "/" + NameOf(from), [&](Line& line) {
            for (const PK_PixelFormat to : kFew)
                for (const int32_t fromField : {0, 1, 2})
                    for (const int32_t toField : {0, 1, 2})
                        for (const int32_t renderField : {0, 1, 2}) {
                            const auto make = [&](int32_t width, int32_t height) {
                                Scaling{{from, 19, 12, fromField},
                                        {to, width, height, toField},
                                        quality,
                                        renderField}
                                    .Make(line, kSpread);
                            };
                            make(19, 12);
                            make(19, 6);
                            make(13, 7);
                            make(30, 15);
                        }
        });
}

void AddOdd(Lines& lines) {
    const auto scale = [](Line& line, PK_PixelFormat from, PK_PixelFormat to, Nulls nulls, int32_t width,
                          int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        for (const int32_t quality : {2, 4})
            line.results.Add(PK_ScaleConvert(nulls(0, source.First()), source.Step(), width, height, from, 1,
                                             nulls(1, image.First()), image.Step(), kOddWidth, kOddHeight, to,
                                             0, quality));
        image.AddTo(line.results);
    };
    AddOddCalls(lines, "images", 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        scale(line, kBGRA, kBGRA, nulls, width, height);
    });
    for (const PK_PixelFormat format : kStrangers)
        lines.Add("odd/" + NameOf(format), [&](Line& line) {
            scale(line, format, kBGRA, Nulls::None(), kOddWidth, kOddHeight);
            scale(line, kBGRA, format, Nulls::None(), kOddWidth, kOddHeight);
        });
}

void AddScaleConvert(Lines& lines) {
    for (const PK_PixelFormat format : kRasters) AddFormat(lines, format);
    for (const int32_t quality : {2, 4, 5}) AddQuality(lines, quality);
    AddOdd(lines);
}

const Family sScaleConvert("scale-convert", AddScaleConvert);

} // namespace
