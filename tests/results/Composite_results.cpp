// One image over another, plainly and by the blend modes.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Composite.h>

#include <algorithm>
#include <string>

namespace {

using namespace PKResults;

struct Layers {
    PK_PixelFormat top, back, destination;

    std::string Name() const { return NameOf(destination) + "/" + NameOf(top) + "/" + NameOf(back); }
};

struct Size {
    int32_t width, height;
};

/// Ends of rows, and bands.
constexpr Size kSizes[] = {{1, 2}, {7, 3}, {33, 2}, {64, 1}, {19, 66}};

void Lay(Line& line, const Layers& layers, PK_BlendMode mode, Size size, float opacity, bool inLinear) {
    Image top(layers.top, size.width, size.height, kSpread, line.random);
    Image back(layers.back, size.width, size.height, kUpwards, line.random);
    Image image(layers.destination, size.width, size.height, kSpread, line.random);
    top.Fill(layers.top, Content::kEdges, line.random);
    back.Fill(layers.back, Content::kEdges, line.random);
    if (mode == PK_BlendMode_Normal)
        line.results.Add(PK_Composite(top.First(), top.Step(), layers.top, back.First(), back.Step(),
                                      layers.back, image.First(), image.Step(), layers.destination,
                                      size.width, size.height, opacity, 4, inLinear));
    else
        line.results.Add(PK_CompositeWithBlendMode(
            top.First(), top.Step(), layers.top, back.First(), back.Step(), layers.back, image.First(),
            image.Step(), layers.destination, size.width, size.height, opacity, mode, 4, inLinear));
    image.AddTo(line.results);
}

void AddComposite(Lines& lines, const Layers& layers) {
    lines.Add("over/" + layers.Name(), [&](Line& line) {
        for (const float opacity : {0.0f, 0.00001f, 0.3f, 1.0f})
            for (const bool inLinear : {false, true})
                for (const Size size : kSizes)
                    Lay(line, layers, PK_BlendMode_Normal, size, opacity, inLinear);
    });
}

constexpr PK_PixelFormat kOthers[] = {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_XRGB_4444_8u,
                                      PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_VUYP_4444_32f,
                                      PK_PixelFormat_BGRP_4444_32f_Linear};

void AddComposites(Lines& lines) {
    for (const PK_PixelFormat destination : kRasters)
        for (const PK_PixelFormat top : kOthers)
            for (const PK_PixelFormat back : kOthers) AddComposite(lines, {top, back, destination});
    lines.Add("over/down", [](Line& line) {
        const Rounding mode(RoundingMode::kDown);
        for (const PK_PixelFormat format : kRasters)
            Lay(line, {kOthers[0], kOthers[2], format}, PK_BlendMode_Normal, {21, 2}, 0.4f, false);
    });
}

void AddModes(Lines& lines) {
    for (PK_BlendMode mode = -1; mode <= 27; ++mode)
        for (const Layers& layers :
             {Layers{PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_32f,
                     PK_PixelFormat_BGRA_4444_32f},
              Layers{PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_15u, PK_PixelFormat_V210_422_10u}})
            lines.Add("mode/" + std::to_string(mode) + "/" + layers.Name(), [&](Line& line) {
                for (const float opacity : {0.0f, 0.3f, 1.0f})
                    for (Size size : kSizes) {
                        if (mode == PK_BlendMode_Dissolve && size.height > 64)
                            size.height = 64; // bands draw anyhow
                        Lay(line, layers, mode, size, opacity, false);
                    }
                Lay(line, layers, mode, {721, 2}, 0.5f, false);
            });
}

void AddOdd(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    for (const PK_BlendMode mode : {PK_BlendMode_Normal, PK_BlendMode_Screen}) {
        const auto lay = [&](Line& line, const Layers& layers, Nulls nulls, int32_t width, int32_t height) {
            constexpr size_t kLength = size_t{16} * kOddWidth;
            Image top(kLength, kOddHeight, kTight, line.random),
                back(kLength, kOddHeight, kTight, line.random),
                image(kLength, kOddHeight, kTight, line.random);
            line.results.Add(PK_CompositeWithBlendMode(
                nulls(0, top.First()), top.Step(), layers.top, nulls(1, back.First()), back.Step(),
                layers.back, nulls(2, image.First()), image.Step(), layers.destination, width, height, 0.5f,
                mode, 4, false));
            image.AddTo(line.results);
        };
        const std::string name = mode == PK_BlendMode_Normal ? "over" : "mode";
        AddOddCalls(lines, name, 3, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
            lay(line, {kFormat, kFormat, kFormat}, nulls, width, height);
        });
        const auto addFormat = [&](PK_PixelFormat format) {
            lines.Add(name + "/odd/" + NameOf(format), [&](Line& line) {
                for (const Layers& layers :
                     {Layers{format, kFormat, kFormat}, Layers{kFormat, format, kFormat},
                      Layers{kFormat, kFormat, format}})
                    lay(line, layers, Nulls::None(), kOddWidth, kOddHeight);
            });
        };
        std::ranges::for_each(kStrangers, addFormat);
        std::ranges::for_each(kStreams, addFormat);
    }
}

void AddAll(Lines& lines) {
    AddComposites(lines);
    AddModes(lines);
    AddOdd(lines);
}

const Family sComposite("composite", AddAll);

} // namespace
