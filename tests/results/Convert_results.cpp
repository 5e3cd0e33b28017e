// PK_Convert of every raster format to every other.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Lifecycle.h>

#include <algorithm>

namespace {

using namespace PKResults;

constexpr int32_t kTooWide = 134217728;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Shape kShapes[] = {
    {1, 3, kTight, kTight},    {2, 2, kSpread, kSpread},    {3, 3, kUpwards, kTight},
    {5, 2, kSpread, kUpwards}, {7, 2, kTight, kUpwards},    {16, 3, kTight, kTight},
    {17, 3, kSpread, kSpread}, {31, 2, kUpwards, kSpread},  {48, 2, kUpwards, kUpwards},
    {64, 2, kTight, kSpread},  {101, 2, kUpwards, kSpread}, {130, 2, kSpread, kTight},
    {323, 2, kTight, kSpread}, {640, 2, kTight, kTight},
};

struct Variant {
    const char* name;
    int32_t quality;
    Content content;
    RoundingMode rounding = RoundingMode::kNearest;
    bool unitesNaNs = false;
};

constexpr Variant kVariants[] = {
    {"q0", 0, Content::kOrdinary},
    {"q0-edges", 0, Content::kEdges},
    {"q4", 4, Content::kOrdinary},
    {"q4-edges", 4, Content::kEdges},
    {"q4-down", 4, Content::kEdges, RoundingMode::kDown},
};

// Two lines, so that it shows where only bits of not-a-number differ.
constexpr Variant kFloatVariants[] = {
    {"q4-nan", 4, Content::kNaNs, RoundingMode::kNearest, true},
    {"q4-nan-bits", 4, Content::kNaNs},
};

struct Pair {
    PK_PixelFormat from, to;

    std::string Name() const { return NameOf(from) + "/" + NameOf(to); }

    void Convert(Line& line, const Variant& variant, const Shape& shape) const {
        Image source(from, shape.width, shape.height, shape.from, line.random);
        Image destination(to, shape.width, shape.height, shape.to, line.random);
        source.Fill(from, variant.content, line.random);
        const Rounding rounding(variant.rounding);
        line.results.Add(PK_Convert(source.First(), source.Step(), from, destination.First(),
                                    destination.Step(), to, shape.width, shape.height, variant.quality));
        if (variant.unitesNaNs && IsFloat(to)) destination.UniteNaNs();
        destination.AddTo(line.results);
    }
};

void AddPair(Lines& lines, const Pair& pair, const Variant& variant) {
    lines.Add(pair.Name() + "/" + variant.name, [&](Line& line) {
        for (const Shape& shape : kShapes) pair.Convert(line, variant, shape);
    });
}

void AddPairs(Lines& lines) {
    for (const PK_PixelFormat from : kRasters)
        for (const PK_PixelFormat to : kRasters) {
            for (const Variant& variant : kVariants) AddPair(lines, {from, to}, variant);
            if (!IsFloat(from)) continue;
            AddPair(lines, {from, to}, kFloatVariants[0]);
            if (IsFloat(to)) AddPair(lines, {from, to}, kFloatVariants[1]);
        }
}

constexpr Pair kSomePairs[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_15u},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_15u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f_Linear},
    {PK_PixelFormat_YUYV_422_8u_709, PK_PixelFormat_RGB_444_10u},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_V210_422_10u_709},
    {PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_VUYP_4444_32f_709},
};

/// Frames of many rows, of either direction, and rows whose scratch is not the stack's.
void AddFrames(Lines& lines) {
    constexpr Shape frames[] = {{640, 97, kTight, kTight},
                                {640, 97, kUpwards, kSpread},
                                {640, 97, kSpread, kUpwards},
                                {17001, 2, kTight, kTight}};
    for (const Pair& pair : kSomePairs)
        for (size_t i = 0; i < std::size(frames); ++i)
            lines.Add("frames/" + pair.Name() + "/" + std::to_string(i),
                      [&](Line& line) { pair.Convert(line, kVariants[2], frames[i]); });
}

/// All origins at the top left.
void AddTopLeft(Lines& lines) {
    for (const Pair& pair : kSomePairs)
        lines.Add("top-left/" + pair.Name(), [&](Line& line) {
            PK_SetDebugFlag(10, 1);
            pair.Convert(line, kVariants[2], {17, 5, kSpread, kTight});
            PK_SetDebugFlag(10, 0);
        });
}

void AddQualities(Lines& lines) {
    for (int32_t quality = -1; quality < 7; ++quality)
        lines.Add("quality/" + std::to_string(quality), [&](Line& line) {
            const Variant variant = {"", quality, Content::kOrdinary};
            for (const Pair& pair : kSomePairs) pair.Convert(line, variant, kShapes[6]);
        });
}

void CallOddly(Line& line, const Pair& pair, Nulls nulls, int32_t width, int32_t height) {
    constexpr size_t kRowLength = 16 * 6; // for any format
    Image source(kRowLength, kOddHeight, kTight, line.random);
    Image destination(kRowLength, kOddHeight, kTight, line.random);
    line.results.Add(PK_Convert(nulls(0, source.First()), source.Step(), pair.from,
                                nulls(1, destination.First()), destination.Step(), pair.to, width, height,
                                4));
    destination.AddTo(line.results);
}

void AddOdd(Lines& lines) {
    for (const Pair& pair : kSomePairs) {
        AddOddCalls(lines, pair.Name(), 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
            CallOddly(line, pair, nulls, width, height);
        });
        lines.Add(pair.Name() + "/odd/too-wide",
                  [&](Line& line) { CallOddly(line, pair, Nulls::None(), kTooWide, 1); });
    }
    for (const PK_PixelFormat stranger : kStrangers) {
        if (stranger >> 24 != 0) continue; // streams are another family
        const std::string name = NameOf(stranger);
        constexpr PK_PixelFormat kKnown = PK_PixelFormat_BGRA_4444_8u;
        for (const Pair& pair : {Pair{stranger, kKnown}, Pair{kKnown, stranger}, Pair{stranger, stranger}})
            lines.Add(pair.Name() + "/odd",
                      [&](Line& line) { CallOddly(line, pair, Nulls::None(), kOddWidth, kOddHeight); });
    }
}

void AddConversions(Lines& lines) {
    AddPairs(lines);
    AddFrames(lines);
    AddTopLeft(lines);
    AddQualities(lines);
    AddOdd(lines);
}

const Family sConvert("convert", AddConversions);

} // namespace
