// Transposition of pixels of every size, and quarter turns.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Rotate.h>

#include <algorithm>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Walk kLoose = {16, 16, false}, kLooseUpwards = {16, 32, true}; // steps of whole pixels
constexpr Shape kShapes[] = {{1, 1, kTight, kTight},         {1, 9, kTight, kSpread},
                             {5, 3, kSpread, kSpread},       {8, 8, kTight, kTight},
                             {16, 7, kLooseUpwards, kTight}, {17, 33, kLoose, kLooseUpwards},
                             {33, 16, kTight, kUpwards},     {64, 64, kTight, kTight},
                             {100, 71, kLoose, kLoose},      {301, 130, kTight, kTight}};

std::string NameOf(const Shape& shape) {
    return std::to_string(shape.width) + "x" + std::to_string(shape.height);
}

void Transpose(Line& line, uint8_t pixelBytes, const Shape& shape) {
    Image source(size_t{pixelBytes} * static_cast<size_t>(shape.width), shape.height, shape.from,
                 line.random);
    Image destination(size_t{pixelBytes} * static_cast<size_t>(shape.height), shape.width, shape.to,
                      line.random);
    line.results.Add(PK_Transpose(source.First(), source.Step(), destination.First(), destination.Step(),
                                  shape.width, shape.height, pixelBytes));
    destination.AddTo(line.results);
}

void AddTranspositions(Lines& lines) {
    for (const int bytes : {0, 1, 2, 3, 4, 5, 8, 12, 16, 17, 32, 255}) {
        const auto pixelBytes = static_cast<uint8_t>(bytes);
        const std::string name = "transpose/" + std::to_string(bytes);
        for (const Shape& shape : kShapes)
            lines.Add(name + "/" + NameOf(shape), [&](Line& line) { Transpose(line, pixelBytes, shape); });
    }
    AddOddCalls(lines, "transpose", 2, [](Line& line, Nulls nulls, int32_t width, int32_t height) {
        Image source(size_t{4} * kOddWidth, kOddHeight, kTight, line.random);
        Image destination(size_t{4} * kOddHeight, kOddWidth, kTight, line.random);
        line.results.Add(PK_Transpose(nulls(0, source.First()), source.Step(), nulls(1, destination.First()),
                                      destination.Step(), width, height, 4));
        destination.AddTo(line.results);
    });
}

void Rotate(Line& line, PK_PixelFormat format, int32_t degrees, const Shape& shape) {
    const bool turns = degrees % 180 != 0;
    const int32_t width = turns ? shape.height : shape.width, height = turns ? shape.width : shape.height;
    Image source(size_t{4} * static_cast<size_t>(shape.width), shape.height, shape.from, line.random);
    Image destination(size_t{4} * static_cast<size_t>(width), height, shape.to, line.random);
    line.results.Add(PK_RotateImage(source.First(), source.Step(), destination.First(), destination.Step(),
                                    shape.width, shape.height, format, degrees));
    destination.AddTo(line.results);
}

void AddRotations(Lines& lines) {
    for (const int32_t degrees : {90, 180, 270, -90, -180, -270, 0, 360, 45, 450}) {
        const std::string name = std::to_string(degrees);
        for (const Shape& shape : kShapes)
            lines.Add(name + "/" + NameOf(shape),
                      [&](Line& line) { Rotate(line, PK_PixelFormat_BGRA_4444_8u, degrees, shape); });
        lines.Add(name + "/formats", [&](Line& line) {
            const auto rotate = [&](PK_PixelFormat format) { Rotate(line, format, degrees, kShapes[2]); };
            std::ranges::for_each(kRasters, rotate);
            std::ranges::for_each(kStreams, rotate);
            std::ranges::for_each(kStrangers, rotate);
        });
    }
    AddOddCalls(lines, "rotate", 2, [](Line& line, Nulls nulls, int32_t width, int32_t height) {
        Image source(size_t{4} * kOddWidth, kOddHeight, kTight, line.random);
        Image destination(size_t{4} * kOddHeight, kOddWidth, kTight, line.random);
        line.results.Add(PK_RotateImage(nulls(0, source.First()), source.Step(),
                                        nulls(1, destination.First()), destination.Step(), width, height,
                                        PK_PixelFormat_BGRA_4444_8u, 90));
        destination.AddTo(line.results);
    });
}

void AddMoves(Lines& lines) {
    AddTranspositions(lines);
    AddRotations(lines);
}

const Family sRotate("rotate", AddMoves);

} // namespace
