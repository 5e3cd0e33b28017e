// Images scaled by a gain, and weighted sums of images.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Accumulate.h>

#include <algorithm>
#include <deque>
#include <vector>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Shape kShapes[] = {{1, 2, kTight, kTight},    {7, 3, kSpread, kUpwards},
                             {16, 2, kTight, kTight},   {33, 3, kUpwards, kSpread},
                             {64, 2, kTight, kUpwards}, {101, 3, kSpread, kSpread}};

struct Scaling {
    PK_PixelFormat from, to;
    float gain = 0.71f;
    int32_t quality = 4;
    RoundingMode rounding = RoundingMode::kNearest;

    std::string Name() const { return NameOf(to) + "/" + NameOf(from); }

    void Scale(Line& line, const Shape& shape) const {
        Image source(from, shape.width, shape.height, shape.from, line.random);
        Image image(to, shape.width, shape.height, shape.to, line.random);
        source.Fill(from, Content::kEdges, line.random);
        {
            const Rounding mode(rounding);
            line.results.Add(PK_AlphaGain(source.First(), source.Step(), from, image.First(), image.Step(),
                                          to, shape.width, shape.height, gain, quality));
        }
        if (IsFloat(to)) image.UniteNaNs();
        image.AddTo(line.results);
    }
};

void AddScaling(Lines& lines, const std::string& name, const Scaling& scaling) {
    lines.Add(name, [&](Line& line) {
        for (const Shape& shape : kShapes) scaling.Scale(line, shape);
    });
}

void AddOddGains(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    const auto scale = [](Line& line, PK_PixelFormat from, PK_PixelFormat to, float gain, Nulls nulls,
                          int32_t width, int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        line.results.Add(PK_AlphaGain(nulls(0, source.First()), source.Step(), from, nulls(1, image.First()),
                                      image.Step(), to, width, height, gain, 4));
        image.AddTo(line.results);
    };
    for (const float gain : {0.5f, 0.0f})
        AddOddCalls(lines, gain > 0 ? "gain" : "no-gain", 2,
                    [=](Line& line, Nulls nulls, int32_t width, int32_t height) {
                        scale(line, kFormat, kFormat, gain, nulls, width, height);
                    });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("gain/odd/" + NameOf(format), [&](Line& line) {
            for (const float gain : {0.5f, 0.0f}) {
                scale(line, format, kFormat, gain, Nulls::None(), kOddWidth, kOddHeight);
                scale(line, kFormat, format, gain, Nulls::None(), kOddWidth, kOddHeight);
            }
        });
    };
    std::ranges::for_each(kStrangers, addFormat);
    std::ranges::for_each(kStreams, addFormat);
}

void AddGains(Lines& lines) {
    for (const PK_PixelFormat to : kRasters) {
        for (const PK_PixelFormat from :
             {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_V210_422_10u_709, PK_PixelFormat_VUYA_4444_32f}) {
            const Scaling scaling = {from, to};
            AddScaling(lines, scaling.Name(), scaling);
        }
        AddScaling(lines, NameOf(to) + "/itself", {to, to});
        AddScaling(lines, NameOf(to) + "/itself-up", {to, to, 1.83f, 2});
        AddScaling(lines, NameOf(to) + "/itself-down", {to, to, 0.9f, 4, RoundingMode::kDown});
        AddScaling(lines, NameOf(to) + "/none", {to, to, 7e-6f});
    }
    AddOddGains(lines);
    lines.Add("nop", [](Line& line) {
        for (PK_BlendMode mode = -1; mode < 30; ++mode)
            for (const float opacity : {0.0f, 0.99999f, 0.999993f, 1.0f, 1.000007f, 1.00001f})
                line.results.Add(PK_IsOpacityNOP(mode, opacity));
    });
}

constexpr PK_PixelFormat kSummed[] = {
    PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f,        PK_PixelFormat_UYVY_422_8u_709,
    PK_PixelFormat_V210_422_10u, PK_PixelFormat_ARGB_4444_32f_Linear, PK_PixelFormat_XRGB_4444_15u,
};

struct Summing {
    int32_t count;
    PK_PixelFormat to;
    int32_t quality;

    void Sum(Line& line, const Shape& shape) const {
        std::deque<Image> images;
        std::vector<const void*> pixels;
        std::vector<int32_t> rowBytes;
        std::vector<PK_PixelFormat> formats;
        std::vector<double> weights;
        for (int32_t i = 0; i < count; ++i) {
            formats.push_back(kSummed[static_cast<size_t>(i) % std::size(kSummed)]);
            Image& image =
                images.emplace_back(formats.back(), shape.width, shape.height, kWalks[i % 3], line.random);
            image.Fill(formats.back(), Content::kOrdinary, line.random);
            pixels.push_back(image.First());
            rowBytes.push_back(image.Step());
            weights.push_back(i % 7 == 4 ? -0.5 : 0.13 * (1 + i % 3));
        }
        Image sum(to, shape.width, shape.height, shape.to, line.random);
        line.results.Add(PK_Accumulate(pixels.data(), rowBytes.data(), formats.data(), weights.data(), count,
                                       sum.First(), sum.Step(), to, shape.width, shape.height, quality));
        if (IsFloat(to)) sum.UniteNaNs();
        sum.AddTo(line.results);
    }
};

void AddOddSums(Lines& lines) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    const auto sum = [](Line& line, PK_PixelFormat from, PK_PixelFormat to, int32_t count, Nulls nulls,
                        int32_t width, int32_t height) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        const void* const pixels[2] = {source.First(), nulls(4, source.First())};
        const int32_t rowBytes[2] = {source.Step(), source.Step()};
        const PK_PixelFormat formats[2] = {kFormat, from};
        const double weights[2] = {0.5, 0.25};
        line.results.Add(PK_Accumulate(nulls(0, pixels), nulls(1, rowBytes), nulls(2, formats),
                                       nulls(3, weights), count, nulls(5, image.First()), image.Step(), to,
                                       width, height, 4));
        image.AddTo(line.results);
    };
    AddOddCalls(lines, "sum", 6, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        sum(line, kFormat, kFormat, 2, nulls, width, height);
    });
    for (const int32_t count : {0, -1})
        AddOddCalls(lines, count == 0 ? "sum-of-none" : "sum-of-less", 6,
                    [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
                        sum(line, kFormat, kFormat, count, nulls, width, height);
                    });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("sum/odd/" + NameOf(format), [&](Line& line) {
            sum(line, format, kFormat, 2, Nulls::None(), kOddWidth, kOddHeight);
            sum(line, kFormat, format, 2, Nulls::None(), kOddWidth, kOddHeight);
        });
    };
    std::ranges::for_each(kStrangers, addFormat);
    std::ranges::for_each(kStreams, addFormat);
}

void AddSums(Lines& lines) {
    for (const PK_PixelFormat to : kRasters)
        for (const int32_t quality : {4, 5})
            lines.Add(NameOf(to) + "/q" + std::to_string(quality), [&](Line& line) {
                for (const Shape& shape : kShapes) Summing{5, to, quality}.Sum(line, shape);
            });
    for (int32_t count = 0; count < 32; ++count)
        lines.Add("count/" + std::to_string(count), [&](Line& line) {
            for (const Shape& shape : kShapes)
                Summing{count, PK_PixelFormat_BGRP_4444_32f, 4}.Sum(line, shape);
        });
    AddOddSums(lines);
}

const Family sGain("alpha-gain", AddGains);
const Family sSum("accumulate", AddSums);

} // namespace
