// The box blur of both directions, with what its radii are left as.

#include "results/Image.h"
#include "results/Lines.h"

#include <PixelKiln/BoxBlur.h>

#include <limits>
#include <string>
#include <vector>

namespace {

using namespace PKResults;

constexpr int32_t kAllBytes = PK_BoxBlur_Byte0 | PK_BoxBlur_Byte1 | PK_BoxBlur_Byte2 | PK_BoxBlur_Byte3;

struct Shape {
    int32_t width, height;
    Walk walk;
};

constexpr Walk kLoose = {4, 12, false}, kLooseUpwards = {12, 8, true}; // steps of whole pixels
constexpr Shape kShapes[] = {{4, 4, kTight},   {5, 7, kLoose},    {9, 12, kLooseUpwards},  {20, 33, kTight},
                             {97, 61, kLoose}, {300, 40, kTight}, {40, 300, kLooseUpwards}};

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
constexpr double kInfinity = std::numeric_limits<double>::infinity();
constexpr double kRadii[] = {0,   0.003, 0.3,   1,    1.003, 1.5,  2,  2.003,     2.7, 3.1,
                             6.5, 10,    17.25, 50.5, 80,    1000, -1, kInfinity, kNaN};

std::string NameOf(const Shape& shape) {
    return std::to_string(shape.width) + "x" + std::to_string(shape.height);
}

void Blur(Line& line, std::vector<double> radii, int32_t flags, const Shape& shape) {
    const auto width = static_cast<size_t>(shape.width), height = static_cast<size_t>(shape.height);
    Image image(4 * width, shape.height, shape.walk, line.random);
    std::vector<uint32_t> scratch(width + height + (width > height ? width : height));
    PK_BoxBlur(static_cast<int32_t>(radii.size()), radii.data(), flags, scratch.data(), image.First(),
               image.Step(), shape.width, shape.height);
    for (const double radius : radii) line.results.Add(radius);
    image.AddTo(line.results);
}

struct Way {
    const char* name;
    int32_t flags;
};

constexpr Way kWays[] = {{"rows/fade", kAllBytes},
                         {"rows/renormalise", kAllBytes | PK_BoxBlur_Renormalise},
                         {"columns/fade", kAllBytes | PK_BoxBlur_Columns},
                         {"columns/renormalise", kAllBytes | PK_BoxBlur_Columns | PK_BoxBlur_Renormalise}};

void AddWay(Lines& lines, const Way& way) {
    for (const Shape& shape : kShapes) {
        const std::string name = std::string(way.name) + "/" + NameOf(shape) + "/";
        for (const double radius : kRadii)
            lines.Add(name + std::to_string(radius),
                      [&](Line& line) { Blur(line, {radius}, way.flags, shape); });
        lines.Add(name + "three", [&](Line& line) { Blur(line, {3.1, 2.4, 1.7}, way.flags, shape); });
        lines.Add(name + "all", [&](Line& line) {
            Blur(line, {std::begin(kRadii), std::end(kRadii)}, way.flags, shape);
        });
    }
    for (int32_t bytes = 0; bytes < kAllBytes; ++bytes)
        lines.Add(std::string(way.name) + "/bytes-" + std::to_string(bytes), [&](Line& line) {
            Blur(line, {3.1, 80.5, 1.7}, (way.flags & ~kAllBytes) | bytes | 0x7f00, kShapes[4]);
        });
}

void AddOdd(Lines& lines) {
    for (int which = 0; which < 3; ++which)
        lines.Add("odd/null-" + std::to_string(which), [&](Line& line) {
            Image image(size_t{4} * 9, 9, kTight, line.random);
            double radius = 1.5;
            std::vector<uint32_t> scratch(27);
            PK_BoxBlur(1, which == 0 ? nullptr : &radius, kAllBytes, which == 1 ? nullptr : scratch.data(),
                       which == 2 ? nullptr : image.First(), image.Step(), 9, 9);
            line.results.Add(radius);
            image.AddTo(line.results);
        });
    for (const Shape& shape : {Shape{3, 9, kTight}, Shape{9, 3, kTight}})
        lines.Add("odd/" + NameOf(shape), [&](Line& line) { Blur(line, {1.5, 1000}, kAllBytes, shape); });
    lines.Add("odd/no-pass", [](Line& line) { Blur(line, {}, kAllBytes, kShapes[4]); });
}

void AddBlurs(Lines& lines) {
    for (const Way& way : kWays) AddWay(lines, way);
    AddOdd(lines);
}

const Family sBoxBlur("box-blur", AddBlurs);

} // namespace
