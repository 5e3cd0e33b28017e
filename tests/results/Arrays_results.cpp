// Products by constants, floats to integers, and A-law.

#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Utilities.h>

#include <cmath>

namespace {

using namespace PKResults;

constexpr int32_t kLengths[] = {0, 1, 2, 3, 4, 7, 8, 15, 16, 17, 31, 33, 63, 64, 65, 127, 259, 1003};
constexpr int32_t kScales[] = {-200, -140, -40, -3, -1, 0, 1, 5, 15, 16, 17, 31, 100, 140, 200};

void Multiply(Line& line, int32_t scale, bool inPlace, int32_t width, int32_t height, const Walk& walk) {
    constexpr uint8_t constants[] = {3, 90, 255, 0, 1, 131, 128, 17};
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    for (const uint8_t* four : {constants, constants + 4}) {
        Image source(kFormat, width, height, walk, line.random);
        Image destination(kFormat, width, height, kSpread, line.random);
        Image& written = inPlace ? source : destination;
        line.results.Add(PK_MultiplyByConstant(width, height, source.First(), source.Step(), written.First(),
                                               written.Step(), four, scale));
        written.AddTo(line.results);
    }
}

void AddProducts(Lines& lines) {
    for (const int32_t scale : {-300, -9, -8, -7, -1, 0, 1, 2, 4, 6, 7, 8, 9, 12, 15, 16, 17, 32, 300})
        lines.Add("multiply/" + std::to_string(scale), [&](Line& line) {
            for (const int32_t width : kLengths)
                for (const Walk& walk : kWalks) Multiply(line, scale, width % 2 == 1, width, 2, walk);
        });
    lines.Add("multiply/6/down", [](Line& line) {
        const Rounding rounding(RoundingMode::kDown);
        Multiply(line, 6, false, 101, 3, kTight);
    });
    const auto odd = [](Line& line, Nulls nulls, int32_t width, int32_t height) {
        constexpr uint8_t constants[] = {3, 90, 255, 0};
        Image source(size_t{4} * kOddWidth, kOddHeight, kTight, line.random);
        Image destination(size_t{4} * kOddWidth, kOddHeight, kTight, line.random);
        line.results.Add(PK_MultiplyByConstant(width, height, nulls(0, source.First()), source.Step(),
                                               nulls(1, destination.First()), destination.Step(),
                                               nulls(2, constants), 6));
        destination.AddTo(line.results);
    };
    AddOddCalls(lines, "multiply", 3, odd);
    lines.Add("multiply/odd/too-wide", [&](Line& line) { odd(line, Nulls::None(), 134217728, 1); });
}

template <class Integer>
using Convert = PK_Result (*)(const float*, Integer*, int32_t, int32_t, int32_t) noexcept;

/// Values about the limits of the integers, whatever the scale.
void FillFloats(float* floats, size_t count, int32_t scale, Random& random) {
    FillSamples(PK_PixelFormat_BGRA_4444_32f, Content::kNaNs, reinterpret_cast<uint8_t*>(floats),
                count * sizeof(float), random);
    for (size_t i = 0; i < count; i += 2)
        floats[i] = std::ldexp(random.Between(-2, 2), scale + static_cast<int>(random.Below(34)));
}

template <class Integer>
void ConvertFloats(Line& line, Convert<Integer> convert, int32_t rounding, int32_t scale, int32_t length,
                   size_t lead) {
    const auto count = static_cast<size_t>(length);
    Image source(count * sizeof(float), 1, {4 * lead, 0, false}, line.random);
    Image destination(count * sizeof(Integer), 1, {sizeof(Integer) * (lead + 1), 0, false}, line.random);
    auto* floats = reinterpret_cast<float*>(source.First());
    FillFloats(floats, count, scale, line.random);
    line.results.Add(
        convert(floats, reinterpret_cast<Integer*>(destination.First()), length, rounding, scale));
    destination.AddTo(line.results);
}

template <class Integer>
void AddFloats(Lines& lines, const std::string& name, Convert<Integer> convert) {
    for (const int32_t rounding : {0, 1, 2})
        for (const int32_t scale : kScales) {
            const std::string whole = name + "/" + std::to_string(rounding) + "/" + std::to_string(scale);
            const auto all = [&](Line& line) {
                for (const int32_t length : kLengths)
                    ConvertFloats(line, convert, rounding, scale, length, static_cast<size_t>(length % 3));
            };
            lines.Add(whole, all);
            lines.Add(whole + "/down", [&](Line& line) {
                const Rounding mode(RoundingMode::kDown);
                all(line);
            });
        }
    AddOddCalls(lines, name, 2, [&](Line& line, Nulls nulls, int32_t length, int32_t) {
        constexpr float floats[kOddWidth] = {1.5f, -2.5f, 1e9f, -3, 0.5f};
        Integer integers[kOddWidth] = {};
        line.results.Add(convert(nulls(0, floats), nulls(1, integers), length, 1, 0));
        line.results.AddBytes(integers, sizeof integers);
    });
}

void AddInPlace(Lines& lines) {
    lines.Add("32f-32s/in-place", [](Line& line) {
        for (const int32_t length : kLengths) {
            Image block(static_cast<size_t>(length) * 4, 1, kTight, line.random);
            auto* floats = reinterpret_cast<float*>(block.First());
            FillFloats(floats, static_cast<size_t>(length), -3, line.random);
            line.results.Add(
                PK_Convert_32f32sSfs(floats, reinterpret_cast<int32_t*>(block.First()), length, 1, -3));
            block.AddTo(line.results);
        }
    });
}

void AddALaw(Lines& lines) {
    lines.Add("a-law", [](Line& line) {
        for (const int32_t length : kLengths) {
            const auto count = static_cast<size_t>(length);
            Image source(count, 1, kSpread, line.random);
            Image destination(count * 2, 1, {6, 0, false}, line.random);
            line.results.Add(PK_DecodeALawTo16Bit(source.First(), length,
                                                  reinterpret_cast<int16_t*>(destination.First())));
            destination.AddTo(line.results);
        }
    });
    AddOddCalls(lines, "a-law", 2, [](Line& line, Nulls nulls, int32_t length, int32_t) {
        constexpr uint8_t codes[kOddWidth] = {0, 0x55, 0xd5, 0xff, 0x80};
        int16_t samples[kOddWidth] = {};
        line.results.Add(PK_DecodeALawTo16Bit(nulls(0, codes), length, nulls(1, samples)));
        line.results.AddBytes(samples, sizeof samples);
    });
}

void AddArrays(Lines& lines) {
    AddProducts(lines);
    AddFloats<int32_t>(lines, "32f-32s", PK_Convert_32f32sSfs);
    AddFloats<int16_t>(lines, "32f-16s", PK_Convert_32f16sSfs);
    AddInPlace(lines);
    AddALaw(lines);
}

const Family sArrays("arrays", AddArrays);

} // namespace
