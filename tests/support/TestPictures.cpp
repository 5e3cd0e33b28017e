#include "support/TestPictures.h"

#include "support/Photograph.h"
#include "support/Random.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/ScaleConvert.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <iterator>
#include <stdexcept>

namespace PKTest {
namespace {

struct Code {
    double luma, chroma;
};

std::vector<uint8_t> Drawn(int32_t width, int32_t height,
                           const std::function<Code(int32_t x, int32_t y)>& code) {
    std::vector<uint8_t> bytes;
    bytes.reserve(static_cast<size_t>(2 * width) * static_cast<size_t>(height));
    for (int32_t y = 0; y < height; ++y)
        for (int32_t x = 0; x < width; ++x) {
            const Code of = code(x, y);
            bytes.push_back(static_cast<uint8_t>(std::lround(of.luma)));
            bytes.push_back(static_cast<uint8_t>(std::lround(of.chroma)));
        }
    return bytes;
}

std::vector<uint8_t> Scaled(const std::string& name, int32_t width, int32_t height) {
    const Photograph photograph = ReadPhotograph(name + ".png");
    std::vector<uint8_t> bytes(static_cast<size_t>(2 * width) * static_cast<size_t>(height));
    const PK_Result result = PK_ScaleConvert(
        photograph.pixels.data() + 4 * photograph.width * (photograph.height - 1), -4 * photograph.width,
        photograph.width, photograph.height, PK_PixelFormat_BGRX_4444_8u, 0, bytes.data(), 2 * width, width,
        height, PK_PixelFormat_YUYV_422_8u, 0, 4);
    if (result != PK_Success) throw std::runtime_error("the photograph cannot be scaled");
    return bytes;
}

/// Odd lines were taken later, when the picture had moved on.
std::vector<uint8_t> InMotion(std::vector<uint8_t> picture, int32_t width, int32_t height) {
    constexpr int32_t kPixels = 12;
    for (int32_t y = 1; y < height; y += 2) {
        const auto row = picture.begin() + int64_t{2} * width * y;
        std::rotate(row, row + 2 * kPixels, row + 2 * width);
    }
    return picture;
}

/// Circles about the middle, the finer the further out.
std::vector<uint8_t> Fine(int32_t width, int32_t height) {
    return Drawn(width, height, [=](int32_t x, int32_t y) {
        const double dx = x - width / 2.0, dy = y - height / 2.0;
        return Code{128 + 100 * std::cos((dx * dx + dy * dy) * 0.8 / width),
                    128 + 40 * std::sin(0.015 * (x - x % 2) + 0.02 * y + x % 2)};
    });
}

/// Bars, and below them small rectangles of full contrast.
std::vector<uint8_t> Graphics(int32_t width, int32_t height) {
    return Drawn(width, height, [=](int32_t x, int32_t y) {
        const int32_t bar = 8 * x / width, chromaBar = 8 * (x - x % 2) / width;
        const bool isInk = y > height / 2 && ((x / 3) ^ (y / 5)) % 7 == 0;
        return Code{isInk ? 235.0 : 16.0 + 27 * bar,
                    x % 2 != 0 ? 60.0 + 17 * chromaBar : 200.0 - 20 * chromaBar};
    });
}

/// Discs of full colours, that differ far less in luma.
std::vector<uint8_t> Colours(int32_t width, int32_t height) {
    constexpr Code kColours[][2] = {// Y and U, Y and V, of yellow, cyan, green, magenta, red and blue
                                    {{150, 40}, {150, 145}}, {{140, 165}, {140, 40}},
                                    {{130, 55}, {130, 50}},  {{110, 200}, {110, 205}},
                                    {{100, 95}, {100, 220}}, {{90, 220}, {90, 110}}};
    return Drawn(width, height, [=](int32_t x, int32_t y) {
        const int32_t pair = x - x % 2;
        const double dx = pair % 240 - 120.0, dy = y % 180 - 90.0;
        const auto ring = static_cast<size_t>(std::sqrt(dx * dx + 1.6 * dy * dy) / 22 + pair / 240 + y / 180);
        return kColours[ring % std::size(kColours)][x % 2];
    });
}

std::vector<uint8_t> Noise(int32_t width, int32_t height) {
    Random random(17);
    const auto code = [&random] { return 16.0 + random.Below(220); };
    return Drawn(width, height, [&](int32_t, int32_t) { return Code{code(), code()}; });
}

} // namespace

std::vector<TestPicture> TestPictures(int32_t width, int32_t height) {
    std::vector<TestPicture> pictures;
    for (const std::string name : {"astronaut", "chelsea", "coffee"}) {
        const std::vector<uint8_t> picture = Scaled(name, width, height);
        pictures.push_back({name, picture});
        pictures.push_back({name + " in motion", InMotion(picture, width, height)});
    }
    pictures.push_back({"fine", Fine(width, height)});
    pictures.push_back({"graphics", Graphics(width, height)});
    pictures.push_back({"colours in motion", InMotion(Colours(width, height), width, height)});
    pictures.push_back({"noise", Noise(width, height)});
    return pictures;
}

} // namespace PKTest
