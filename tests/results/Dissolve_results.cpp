// The mix of two images by a ratio.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/CrossDissolve.h>

#include <algorithm>
#include <iterator>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk first, second, destination;
};

constexpr Shape kShapes[] = {{1, 2, kTight, kTight, kTight},
                             {7, 3, kSpread, kUpwards, kTight},
                             {33, 3, kTight, kSpread, kSpread},
                             {101, 2, kUpwards, kTight, kUpwards}};

struct Dissolve {
    PK_PixelFormat first, second, destination;
    float ratio = 0.3f;
    int32_t quality = 4;
    Content content = Content::kEdges;
    RoundingMode rounding = RoundingMode::kNearest;

    std::string Name() const { return NameOf(destination) + "/" + NameOf(first) + "/" + NameOf(second); }

    void Make(Line& line, const Shape& shape) const {
        Image one(first, shape.width, shape.height, shape.first, line.random);
        Image other(second, shape.width, shape.height, shape.second, line.random);
        Image image(destination, shape.width, shape.height, shape.destination, line.random);
        one.Fill(first, content, line.random);
        other.Fill(second, content, line.random);
        const Rounding mode(rounding);
        line.results.Add(PK_CrossDissolve(one.First(), one.Step(), first, other.First(), other.Step(), second,
                                          image.First(), image.Step(), destination, shape.width, shape.height,
                                          ratio, quality));
        if (IsFloat(destination)) image.UniteNaNs(); // infinities make them
        image.AddTo(line.results);
    }
};

void AddDissolve(Lines& lines, const std::string& name, const Dissolve& dissolve) {
    lines.Add(name, [&](Line& line) {
        for (const Shape& shape : kShapes) dissolve.Make(line, shape);
    });
}

void AddDestination(Lines& lines, PK_PixelFormat destination) {
    const PK_PixelFormat sources[] = {destination,
                                      PK_PixelFormat_BGRA_4444_8u,
                                      PK_PixelFormat_PRGB_4444_8u,
                                      PK_PixelFormat_UYVY_422_8u,
                                      PK_PixelFormat_V210_422_10u_709,
                                      PK_PixelFormat_ARGB_4444_15u,
                                      PK_PixelFormat_VUYP_4444_32f};
    for (size_t first = 0; first < std::size(sources); ++first)
        for (size_t second = 0; second < std::size(sources); ++second) {
            if (first != 0 && destination == sources[first]) continue; // is the first of them too
            if (second != 0 && destination == sources[second]) continue;
            const Dissolve dissolve = {sources[first], sources[second], destination};
            AddDissolve(lines, dissolve.Name(), dissolve);
            const Dissolve narrow = {sources[first], sources[second], destination, 0.77f, 2};
            AddDissolve(lines, dissolve.Name() + "/quality-2", narrow);
        }
    const Dissolve down = {destination, destination,        destination,        0.6f,
                           0,           Content::kOrdinary, RoundingMode::kDown};
    AddDissolve(lines, down.Name() + "/down", down);
}

void AddRatios(Lines& lines) {
    constexpr PK_PixelFormat kFormats[] = {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_15u,
                                           PK_PixelFormat_BGRX_4444_32f, PK_PixelFormat_V210_422_10u};
    for (const PK_PixelFormat format : kFormats)
        for (const float ratio : {-1.0f, 0.0f, 7e-6f, 9e-6f, 0.5f, 0.99999f, 0.999993f, 1.0f, 2.0f})
            AddDissolve(lines, "ratio/" + NameOf(format) + "/" + std::to_string(ratio * 1e6f),
                        {format, format, format, ratio});
    lines.Add("wide", [](Line& line) {
        const Dissolve dissolve = {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRP_4444_8u,
                                   PK_PixelFormat_BGRA_4444_32f};
        dissolve.Make(line, {17001, 2, kTight, kTight, kTight});
    });
}

void AddOdd(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    const auto dissolve = [](Line& line, const Dissolve& formats, Nulls nulls, int32_t width,
                             int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image first(kLength, kOddHeight, kTight, line.random),
            second(kLength, kOddHeight, kTight, line.random);
        Image image(kLength, kOddHeight, kTight, line.random);
        line.results.Add(PK_CrossDissolve(nulls(0, first.First()), first.Step(), formats.first,
                                          nulls(1, second.First()), second.Step(), formats.second,
                                          nulls(2, image.First()), image.Step(), formats.destination, width,
                                          height, formats.ratio, 4));
        image.AddTo(line.results);
    };
    AddOddCalls(lines, "dissolve", 3, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        dissolve(line, {kFormat, kFormat, kFormat}, nulls, width, height);
    });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("dissolve/odd/" + NameOf(format), [&](Line& line) {
            for (const Dissolve& formats :
                 {Dissolve{format, kFormat, kFormat}, Dissolve{kFormat, format, kFormat},
                  Dissolve{kFormat, kFormat, format}, Dissolve{format, format, format}})
                dissolve(line, formats, Nulls::None(), kOddWidth, kOddHeight);
        });
    };
    std::ranges::for_each(kStrangers, addFormat);
    std::ranges::for_each(kStreams, addFormat);
}

void AddDissolves(Lines& lines) {
    for (const PK_PixelFormat destination : kRasters) AddDestination(lines, destination);
    AddRatios(lines);
    AddOdd(lines);
}

const Family sDissolve("dissolve", AddDissolves);

} // namespace
