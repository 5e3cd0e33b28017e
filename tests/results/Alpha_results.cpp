// Alpha of whole images, set, inverted and replaced, in place and from one image to another.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Utilities.h>

#include <algorithm>
#include <functional>
#include <limits>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Shape kShapes[] = {{1, 2, kTight, kTight},  {3, 3, kSpread, kSpread},    {17, 3, kUpwards, kTight},
                             {64, 2, kTight, kTight}, {101, 3, kSpread, kUpwards}, {323, 2, kTight, kSpread}};

/// A call from one image to another, or to itself.
struct Images {
    const void* source;
    int32_t sourceStep;
    void* destination;
    int32_t destinationStep;
    int32_t width, height;
};
using Call = std::function<PK_Result(const Images& images, PK_PixelFormat format)>;

struct NamedCall {
    std::string name;
    Call call;
};

std::vector<NamedCall> AllCalls() {
    std::vector<NamedCall> calls;
    for (const bool opaque : {false, true})
        calls.push_back(
            {opaque ? "set-opaque" : "set-clear", [opaque](const Images& images, PK_PixelFormat format) {
                 return PK_SetAlphaChannel(images.width, images.height, images.destination,
                                           images.destinationStep, format, opaque);
             }});
    calls.push_back({"invert", [](const Images& images, PK_PixelFormat format) {
                         return PK_InvertAlpha(images.source, images.sourceStep, images.destination,
                                               images.destinationStep, format, images.width, images.height);
                     }});
    for (const float alpha :
         {0.0f, 0.3f, 1.0f, 127.5f / 255, 1.7f, -0.4f, std::numeric_limits<float>::infinity(),
          std::numeric_limits<float>::quiet_NaN()})
        calls.push_back(
            {"copy-" + std::to_string(alpha), [alpha](const Images& images, PK_PixelFormat format) {
                 return PK_CopyAndSetAlpha(images.source, images.sourceStep, images.destination,
                                           images.destinationStep, format, images.width, images.height,
                                           alpha);
             }});
    return calls;
}

size_t RowLength(PK_PixelFormat format, int32_t width) {
    const bool isKnown = std::ranges::find(kRasters, format) != std::end(kRasters);
    return static_cast<size_t>(isKnown ? PK_PixelFormatPackedRowBytes(format, width) : 16 * width);
}

void CallApart(Line& line, const Call& call, PK_PixelFormat format, const Shape& shape) {
    const size_t length = RowLength(format, shape.width);
    Image source(length, shape.height, shape.from, line.random);
    Image destination(length, shape.height, shape.to, line.random);
    source.Fill(format, Content::kNaNs, line.random);
    line.results.Add(call(
        {source.First(), source.Step(), destination.First(), destination.Step(), shape.width, shape.height},
        format));
    destination.AddTo(line.results);
}

void CallInPlace(Line& line, const Call& call, PK_PixelFormat format, const Shape& shape) {
    Image image(RowLength(format, shape.width), shape.height, shape.from, line.random);
    image.Fill(format, Content::kNaNs, line.random);
    line.results.Add(
        call({image.First(), image.Step(), image.First(), image.Step(), shape.width, shape.height}, format));
    image.AddTo(line.results);
}

void AddFormat(Lines& lines, const NamedCall& named, PK_PixelFormat format) {
    const std::string name = named.name + "/" + NameOf(format);
    lines.Add(name, [&](Line& line) {
        for (const Shape& shape : kShapes) CallApart(line, named.call, format, shape);
    });
    lines.Add(name + "/in-place", [&](Line& line) {
        for (const Shape& shape : kShapes) CallInPlace(line, named.call, format, shape);
    });
    lines.Add(name + "/down", [&](Line& line) {
        const Rounding rounding(RoundingMode::kDown);
        CallApart(line, named.call, format, kShapes[4]);
    });
}

void AddOdd(Lines& lines, const NamedCall& named) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_32f;
    const auto call = [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        Image source(kFormat, kOddWidth, kOddHeight, kTight, line.random);
        Image destination(kFormat, kOddWidth, kOddHeight, kTight, line.random);
        line.results.Add(named.call({nulls(0, source.First()), source.Step(), nulls(1, destination.First()),
                                     destination.Step(), width, height},
                                    kFormat));
        destination.AddTo(line.results);
    };
    AddOddCalls(lines, named.name, 2, call);
    lines.Add(named.name + "/odd/too-wide", [&](Line& line) { call(line, Nulls::None(), 134217728, 1); });
}

void AddAlpha(Lines& lines) {
    for (const NamedCall& named : AllCalls()) {
        for (const PK_PixelFormat format : kRasters) AddFormat(lines, named, format);
        for (const PK_PixelFormat format : {kStreams[0], kStreams[8]}) AddFormat(lines, named, format);
        for (const PK_PixelFormat format : kStrangers) AddFormat(lines, named, format);
        AddOdd(lines, named);
    }
}

const Family sAlpha("alpha", AddAlpha);

} // namespace
