// The choice between two images by a mask of one bit a pixel.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Overlay.h>

#include <algorithm>
#include <vector>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    uint8_t bitOffset;
    Walk first, second, mask, destination;
};

constexpr Shape kShapes[] = {
    {1, 2, 0, kTight, kTight, kTight, kTight},       {7, 3, 3, kSpread, kUpwards, kSpread, kTight},
    {16, 2, 0, kTight, kTight, kTight, kTight},      {33, 3, 7, kTight, kSpread, kUpwards, kSpread},
    {64, 2, 5, kUpwards, kTight, kTight, kUpwards},  {101, 3, 13, kSpread, kSpread, kTight, kSpread},
    {323, 2, 130, kTight, kUpwards, kSpread, kTight}};

struct Choice {
    PK_PixelFormat first, second, destination;
    int32_t quality = 4;
    Content content = Content::kEdges;
    RoundingMode rounding = RoundingMode::kNearest;

    std::string Name() const { return NameOf(destination) + "/" + NameOf(first) + "/" + NameOf(second); }

    void Choose(Line& line, const Shape& shape) const {
        Image one(first, shape.width, shape.height, shape.first, line.random);
        Image other(second, shape.width, shape.height, shape.second, line.random);
        Image mask(static_cast<size_t>((shape.bitOffset % 8 + shape.width + 7) / 8), shape.height, shape.mask,
                   line.random);
        Image image(destination, shape.width, shape.height, shape.destination, line.random);
        one.Fill(first, content, line.random);
        other.Fill(second, content, line.random);
        const Rounding mode(rounding);
        line.results.Add(PK_OneBitMaskComposite(
            one.First(), one.Step(), first, other.First(), other.Step(), second, mask.First(), mask.Step(),
            shape.bitOffset, image.First(), image.Step(), destination, shape.width, shape.height, quality));
        image.AddTo(line.results);
    }
};

void AddChoice(Lines& lines, const std::string& name, const Choice& choice) {
    lines.Add(name, [&](Line& line) {
        for (const Shape& shape : kShapes) choice.Choose(line, shape);
    });
}

void AddDestination(Lines& lines, PK_PixelFormat destination) {
    const PK_PixelFormat sources[] = {destination,
                                      PK_PixelFormat_BGRA_4444_8u,
                                      PK_PixelFormat_UYVY_422_8u,
                                      PK_PixelFormat_V210_422_10u_709,
                                      PK_PixelFormat_ARGB_4444_15u,
                                      PK_PixelFormat_VUYA_4444_32f};
    for (size_t first = 0; first < std::size(sources); ++first)
        for (size_t second = 0; second < std::size(sources); ++second) {
            if (first != 0 && destination == sources[first]) continue; // is the first of them too
            if (second != 0 && destination == sources[second]) continue;
            const Choice choice = {sources[first], sources[second], destination};
            AddChoice(lines, choice.Name(), choice);
        }
    const Choice down = {
        PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_BGRA_4444_32f_Linear, destination, 0, Content::kEdges,
        RoundingMode::kDown};
    AddChoice(lines, down.Name() + "/down", down);
}

/// The destination is one of its sources.
void AddInPlace(Lines& lines) {
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_VUYA_4444_32f})
        for (const bool first : {false, true})
            lines.Add("in-place/" + NameOf(format) + (first ? "/first" : "/second"), [&](Line& line) {
                for (const Shape& shape : kShapes) {
                    Image other(PK_PixelFormat_UYVY_422_8u, shape.width, shape.height, kTight, line.random);
                    Image mask(static_cast<size_t>(shape.width / 8 + 2), shape.height, kTight, line.random);
                    Image image(format, shape.width, shape.height, shape.destination, line.random);
                    image.Fill(format, Content::kEdges, line.random);
                    const auto choose = [&](Image& one, PK_PixelFormat oneFormat, Image& two,
                                            PK_PixelFormat twoFormat) {
                        return PK_OneBitMaskComposite(one.First(), one.Step(), oneFormat, two.First(),
                                                      two.Step(), twoFormat, mask.First(), mask.Step(),
                                                      shape.bitOffset, image.First(), image.Step(), format,
                                                      shape.width, shape.height, 4);
                    };
                    line.results.Add(first ? choose(image, format, other, PK_PixelFormat_UYVY_422_8u)
                                           : choose(other, PK_PixelFormat_UYVY_422_8u, image, format));
                    image.AddTo(line.results);
                }
            });
}

/// Every bit at which a mask may begin, and scratch that is not the stack's.
void AddOffsetsAndWidths(Lines& lines) {
    const Choice choice = {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRP_4444_8u,
                           PK_PixelFormat_BGRP_4444_8u};
    for (uint8_t offset = 0; offset < 9; ++offset)
        lines.Add("offset/" + std::to_string(offset), [&](Line& line) {
            for (int32_t width = 0; width < 70; ++width)
                choice.Choose(line, {width, 1, offset, kTight, kTight, kTight, kTight});
        });
    lines.Add("wide", [&](Line& line) {
        choice.Choose(line, {17001, 2, 5, kTight, kTight, kTight, kTight});
    });
}

void AddOdd(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    struct Formats {
        PK_PixelFormat first, second, destination;
    };
    const auto choose = [](Line& line, const Formats& formats, Nulls nulls, int32_t width, int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image first(kLength, kOddHeight, kTight, line.random),
            second(kLength, kOddHeight, kTight, line.random);
        Image mask(2, kOddHeight, kTight, line.random), image(kLength, kOddHeight, kTight, line.random);
        line.results.Add(PK_OneBitMaskComposite(
            nulls(0, first.First()), first.Step(), formats.first, nulls(1, second.First()), second.Step(),
            formats.second, nulls(2, mask.First()), mask.Step(), 3, nulls(3, image.First()), image.Step(),
            formats.destination, width, height, 4));
        image.AddTo(line.results);
    };
    const auto known = [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        choose(line, {kFormat, kFormat, kFormat}, nulls, width, height);
    };
    AddOddCalls(lines, "mask", 4, known);
    lines.Add("mask/odd/too-wide", [&](Line& line) { known(line, Nulls::None(), 134217728, 1); });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("mask/odd/" + NameOf(format), [&](Line& line) {
            for (const Formats& formats :
                 {Formats{format, kFormat, kFormat}, Formats{kFormat, format, kFormat},
                  Formats{kFormat, kFormat, format}, Formats{format, format, format}})
                choose(line, formats, Nulls::None(), kOddWidth, kOddHeight);
        });
    };
    std::ranges::for_each(kStrangers, addFormat);
    std::ranges::for_each(kStreams, addFormat);
}

void AddMasks(Lines& lines) {
    for (const PK_PixelFormat destination : kRasters) AddDestination(lines, destination);
    AddInPlace(lines);
    AddOffsetsAndWidths(lines);
    AddOdd(lines);
}

const Family sMask("mask", AddMasks);

} // namespace
