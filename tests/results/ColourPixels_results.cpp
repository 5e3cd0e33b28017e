// Pixels from and to the hub in every colour space, the tone-range compression, YCbCr and the clamp. Their bodies
// follow the processor alone.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/Rounding.h"
#include "results/Spaces.h"

#include <functional>
#include <limits>

namespace {

using namespace PKResults;

constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_32f;

struct Variant {
    const char* name;
    Content content;
    float scale = 1; ///< of samples from -0.5 to 1.5
    bool unitesNaNs = false;
    RoundingMode rounding = RoundingMode::kNearest;
};

constexpr Variant kVariants[] = {
    {"ordinary", Content::kOrdinary}, {"highlights", Content::kOrdinary, 20},
    {"edges", Content::kEdges},       {"down", Content::kEdges, 1, false, RoundingMode::kDown},
    {"nan", Content::kNaNs, 1, true}, {"nan-bits", Content::kNaNs},
};

using Convert = std::function<void(const float* source, float* destination, int32_t count)>;

Image Pixels(int32_t count, const Walk& walk, const Variant& variant, Random& random) {
    Image pixels(size_t{16} * static_cast<size_t>(count), 1, walk, random);
    pixels.Fill(kFormat, variant.content, random);
    auto* samples = reinterpret_cast<float*>(pixels.First());
    for (int32_t i = 0; i < 4 * count; ++i)
        if (variant.scale != 1) samples[i] *= variant.scale;
    return pixels;
}

void ConvertApart(Line& line, const Variant& variant, int32_t count, const Convert& convert) {
    const auto lead = static_cast<size_t>(count % 16) * 4; // every place that floats may have in a cache line
    Image source = Pixels(count, {lead, 0, false}, variant, line.random);
    Image destination(source.RowLength(), 1, {60 - lead, 0, false}, line.random);
    convert(reinterpret_cast<const float*>(source.First()), reinterpret_cast<float*>(destination.First()),
            count);
    if (variant.unitesNaNs) destination.UniteNaNs();
    destination.AddTo(line.results);
}

void ConvertInPlace(Line& line, const Variant& variant, int32_t count, const Convert& convert) {
    Image pixels = Pixels(count, kTight, variant, line.random);
    auto* samples = reinterpret_cast<float*>(pixels.First());
    convert(samples, samples, count);
    if (variant.unitesNaNs) pixels.UniteNaNs();
    pixels.AddTo(line.results);
}

void AddConversion(Lines& lines, const std::string& name, const Convert& convert) {
    for (const Variant& variant : kVariants)
        lines.Add(name + "/" + variant.name, [&](Line& line) {
            const Rounding rounding(variant.rounding);
            for (int32_t count = 0; count <= 40; ++count) ConvertApart(line, variant, count, convert);
            for (const int32_t count : {64, 100, 257, 1003}) ConvertApart(line, variant, count, convert);
            for (const int32_t count : {7, 37, 256}) ConvertInPlace(line, variant, count, convert);
        });
    lines.Add(name + "/odd/negative-count", [&](Line& line) {
        Image pixels = Pixels(4, kTight, kVariants[0], line.random);
        auto* samples = reinterpret_cast<float*>(pixels.First());
        convert(samples, samples, -1);
        convert(nullptr, nullptr, 0);
        pixels.AddTo(line.results);
    });
}

void AddHub(Lines& lines, const NamedSpace& named) {
    const PK::ColorSpace& space = *named.space;
    for (const bool clip : {false, true}) {
        const std::string suffix = clip ? "/clip" : "/no-clip";
        AddConversion(lines, named.name + "/from-hub" + suffix,
                      [&space, clip](const float* source, float* destination, int32_t count) {
                          space.ConvertPixelsFromRec709(source, destination, count, clip);
                      });
        AddConversion(lines, named.name + "/to-hub" + suffix,
                      [&space, clip](const float* source, float* destination, int32_t count) {
                          space.ConvertPixelsToRec709(source, destination, count, clip);
                      });
    }
}

struct Curve {
    float exposure, slope, knee;
};

constexpr Curve kCurves[] = {
    {1, 1.2f, 0.7f}, {0.5f, 1, 0.8f}, {2.7f, 0.7f, 0.5f}, {1, 0, 0.5f}, {1, 1.1f, 1}};

void AddCurves(Lines& lines, const NamedSpace& named) {
    for (size_t i = 0; i < std::size(kCurves); ++i)
        AddConversion(lines, named.name + "/compress/" + std::to_string(i),
                      [&, i](const float* source, float* destination, int32_t count) {
                          named.space->CompressPixelsToSDR(source, destination, count, kCurves[i].exposure,
                                                           kCurves[i].slope, kCurves[i].knee);
                      });
}

void AddYUV(Lines& lines) {
    static const PK::Rec2020ColorSpace space;
    AddConversion(lines, "rec2020/yuv-rgb", [](const float* source, float* destination, int32_t count) {
        space.ConvertPixelsFromYUVtoRGB(source, destination, count);
    });
    AddConversion(lines, "rec2020/rgb-yuv", [](const float* source, float* destination, int32_t count) {
        space.ConvertPixelsFromRGBtoYUV(source, destination, count);
    });
}

struct Range {
    const char* name;
    float low, high;
};

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr Range kRanges[] = {{"0-1", 0, 1},
                             {"near", 0.1f, 0.3f},
                             {"inverted", 0.7f, 0.2f},
                             {"all", -kInfinity, kInfinity},
                             {"nan", std::numeric_limits<float>::quiet_NaN(), 1}};

/// Rows of any number of floats, and of bytes that are no whole floats.
void AddClamp(Lines& lines) {
    for (const Range& range : kRanges)
        for (const int32_t rows : {-1, 0, 1, 2, 3, 5})
            lines.Add(std::string("clamp/") + range.name + "/" + std::to_string(rows), [&](Line& line) {
                for (int32_t rowBytes = -5; rowBytes < 600; rowBytes += rowBytes % 4 == 3 ? 2 : 3) {
                    const auto length = static_cast<size_t>(rowBytes < 0 ? 0 : rowBytes);
                    Image source(length, 6, kTight, line.random), destination(length, 6, kTight, line.random);
                    FillSamples(kFormat, Content::kNaNs, source.First(), 6 * length, line.random);
                    const auto* from = reinterpret_cast<const float*>(source.First());
                    auto* to =
                        reinterpret_cast<float*>(rowBytes % 2 == 0 ? source.First() : destination.First());
                    PK::ClampFloatPixels(from, to, rows, rowBytes, range.low, range.high);
                    source.AddTo(line.results);
                    destination.AddTo(line.results);
                }
            });
}

void AddPixels(Lines& lines) {
    for (const NamedSpace& named : AllSpaces()) {
        if (named.name.starts_with("own-")) continue; // have no pixels
        AddHub(lines, named);
        AddCurves(lines, named);
    }
    AddYUV(lines);
    AddClamp(lines);
}

const Family sColourPixels("colour-pixels", AddPixels, Family::Choice::kProcessor);

} // namespace
