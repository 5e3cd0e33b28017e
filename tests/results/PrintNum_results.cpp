// Numbers burnt into images of every format.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"

#include <PixelKiln/Overlay.h>

#include <algorithm>
#include <limits>

namespace {

using namespace PKResults;

constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

struct Shape {
    int32_t width, height;
    Walk walk;
};

constexpr Shape kShapes[] = {{97, 33, kTight}, {200, 60, kSpread}, {64, 48, kUpwards},
                             {12, 9, kTight},  {5, 3, kSpread},    {1, 1, kTight}};

struct Number {
    int32_t number;
    bool decimal;
    float size;
    PK_Point position;
};

constexpr Number kNumbers[] = {
    {0, true, 0.1f, {0, 0}},
    {1234567890, true, 0.07f, {0.1f, 0.1f}},
    {-406, true, 0.1f, {0.25f, 0.5f}},
    {-406, false, 0.08f, {0.1f, 0.1f}},
    {0x1abcdef, false, 0.25f, {0.3f, 0.2f}},
    {std::numeric_limits<int32_t>::min(), true, 1, {0.9f, 0.9f}},
    {8, true, 1, {0, 0}},
    {77, true, 0, {1, 1}},
};

/// Row bytes do not count for planes, which lie in one block.
Image ImageFor(PK_PixelFormat format, const Shape& shape, Random& random) {
    const int64_t bytes = PK_PixelFormatSize(format, shape.width, shape.height);
    if (format >> 24 != 0) return {static_cast<size_t>(std::max<int64_t>(bytes, 64)), 1, kTight, random};
    const int32_t length = std::max(PK_PixelFormatPackedRowBytes(format, shape.width), shape.width);
    return {static_cast<size_t>(length), shape.height, shape.walk, random};
}

void Print(Line& line, PK_PixelFormat format, const Shape& shape, const Number& number) {
    Image image = ImageFor(format, shape, line.random);
    line.results.Add(PK_PrintNum(image.First(), image.Step(), format, shape.width, shape.height,
                                 number.number, number.size, number.position, number.decimal));
    image.AddTo(line.results);
}

void AddOdd(Lines& lines) {
    struct Fractions {
        const char* name;
        float size, x, y;
    };
    constexpr Fractions fractions[] = {
        {"size-negative", -0.1f, 0, 0}, {"size-large", 1.1f, 0, 0},    {"size-nan", kNaN, 0, 0},
        {"x-negative", 0.1f, -0.1f, 0}, {"x-large", 0.1f, 1.5f, 0},    {"x-nan", 0.1f, kNaN, 0},
        {"y-negative", 0.1f, 0, -1},    {"y-large", 0.1f, 0, 1.0001f}, {"y-nan", 0.1f, 0, kNaN}};
    for (const Fractions& odd : fractions)
        lines.Add(std::string("odd/") + odd.name, [&](Line& line) {
            Print(line, PK_PixelFormat_BGRA_4444_8u, kShapes[0], {12, true, odd.size, {odd.x, odd.y}});
        });
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_YUV_420_MPEG4_FRAME}) {
        const auto print = [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
            Image image = ImageFor(format, {kOddWidth, kOddHeight, kTight}, line.random);
            line.results.Add(PK_PrintNum(nulls(0, image.First()), image.Step(), format, width, height, 7,
                                         0.5f, {0, 0}, true));
            image.AddTo(line.results);
        };
        AddOddCalls(lines, NameOf(format), 1, print);
        lines.Add(NameOf(format) + "/odd/too-wide",
                  [&](Line& line) { print(line, Nulls::None(), 134217728, 1); });
    }
}

void AddNumbers(Lines& lines) {
    const auto add = [&](PK_PixelFormat format) {
        lines.Add(NameOf(format), [&](Line& line) {
            for (const Shape& shape : kShapes)
                for (const Number& number : kNumbers) Print(line, format, shape, number);
        });
    };
    std::ranges::for_each(kRasters, add);
    std::ranges::for_each(kStreams, add);
    std::ranges::for_each(kStrangers, add);
    AddOdd(lines);
}

const Family sPrintNum("print-num", AddNumbers);

} // namespace
