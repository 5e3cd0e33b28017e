// Images over black, and without the share of a matte.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Matte.h>

namespace {

using namespace PKResults;

constexpr int32_t kWidths[] = {1, 7, 33, 64};
constexpr int32_t kHeight = 3;

/// An image and what becomes of it, by a call that gets both.
template <class Call>
void Try(Line& line, PK_PixelFormat from, PK_PixelFormat to, const Call& call) {
    for (const int32_t width : kWidths) {
        Image source(from, width, kHeight, kSpread, line.random),
            image(to, width, kHeight, kUpwards, line.random);
        source.Fill(from, Content::kEdges, line.random);
        call(source, image, width);
        image.AddTo(line.results);
    }
}

void AddToBlack(Lines& lines, PK_PixelFormat from, PK_PixelFormat to) {
    lines.Add("black/" + NameOf(to) + "/" + NameOf(from), [&](Line& line) {
        for (const float opacity : {0.0f, 0.4f, 1.0f})
            for (const int32_t quality : {2, 4})
                Try(line, from, to, [&](Image& source, Image& image, int32_t width) {
                    line.results.Add(PK_CompositeToBlack(source.First(), source.Step(), from, image.First(),
                                                         image.Step(), to, width, kHeight, opacity, quality));
                });
        Try(line, from, to, [&](Image& source, Image& image, int32_t width) {
            uint32_t told = 9;
            line.results.Add(PK_CompositeToBlackAndTestSourceAlpha(source.First(), source.Step(), from,
                                                                   image.First(), image.Step(), to, width,
                                                                   kHeight, &told, 4));
            line.results.Add(static_cast<int32_t>(told));
        });
    });
}

void AddMatte(Lines& lines, PK_PixelFormat format) {
    lines.Add("matte/" + NameOf(format), [&](Line& line) {
        const uint8_t matte[4] = {200, 100, 50, 255};
        Try(line, format, format, [&](Image& source, Image& image, int32_t width) {
            line.results.Add(PK_UnPremultiplyAgainstMatteColor(source.First(), source.Step(), image.First(),
                                                               image.Step(), format, width, kHeight, matte,
                                                               PK_PixelFormat_BGRA_4444_8u, 4));
        });
    });
}

void AddOdd(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    AddOddCalls(lines, "black", 3, [](Line& line, Nulls nulls, int32_t width, int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        uint32_t told = 9;
        line.results.Add(PK_CompositeToBlackAndTestSourceAlpha(nulls(0, source.First()), source.Step(),
                                                               kFormat, nulls(1, image.First()), image.Step(),
                                                               kFormat, width, height, nulls(2, &told), 4));
        line.results.Add(PK_CompositeToBlack(nulls(0, source.First()), source.Step(), kFormat,
                                             nulls(1, image.First()), image.Step(), kFormat, width, height,
                                             0.5f, 4));
        line.results.Add(PK_UnPremultiplyAgainstMatteColor(
            nulls(0, source.First()), source.Step(), nulls(1, image.First()), image.Step(), kFormat, width,
            height, nulls(2, source.First()), kFormat, 4));
        line.results.Add(static_cast<int32_t>(told));
        image.AddTo(line.results);
    });
}

void AddAll(Lines& lines) {
    for (const PK_PixelFormat to : kRasters) {
        AddToBlack(lines, to, to);
        for (const PK_PixelFormat from : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_32f})
            if (from != to) AddToBlack(lines, from, to);
        AddMatte(lines, to);
    }
    AddOdd(lines);
}

const Family sMatte("matte", AddAll);

} // namespace
