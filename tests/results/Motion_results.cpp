// Images placed in others: every source, the kinds of destinations, fields, crops, edges, and what is odd.

#include "results/Formats.h"
#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/Motion.h>

#include <limits>
#include <optional>
#include <string>

namespace {

using namespace PKResults;

constexpr float kInfinity = std::numeric_limits<float>::infinity(),
                kNaN = std::numeric_limits<float>::quiet_NaN();
constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kLinear = PK_PixelFormat_BGRP_4444_32f_Linear;

struct Size {
    int32_t width, height;
};

struct Place {
    const char* name;
    PK_Point position = {0.5f, 0.5f}, anchor = {0.5f, 0.5f}, scale = {1, 1};
    double rotation = 0;
    Size from = {23, 17}, to = {31, 26};
};

/// At the highest quality scaled sources other than linear ones are refused.
constexpr Place kPlaces[] = {
    {.name = "copied", .to = {23, 17}},
    {.name = "on-pixels", .position = {17.5f / 31, 10.5f / 26}},
    {.name = "moved", .position = {0.53f, 0.41f}},
    {.name = "smaller", .position = {0.45f, 0.6f}, .scale = {0.6f, 0.3f}},
    {.name = "larger", .anchor = {0.2f, 0.7f}, .scale = {1.7f, 2.3f}},
    {.name = "turned", .anchor = {0.3f, 0.6f}, .rotation = 33},
    {.name = "turned-back", .scale = {1.2f, 0.8f}, .rotation = -171.5},
};
constexpr const Place &kMoved = kPlaces[2], &kSmaller = kPlaces[3], &kTurned = kPlaces[6];

/// More rows than one band has.
constexpr Place kBands[] = {
    {.name = "high", .position = {0.48f, 0.51f}, .from = {29, 80}, .to = {40, 75}},
    {.name = "high-scaled", .scale = {0.7f, 1.1f}, .from = {29, 80}, .to = {40, 75}},
    {.name = "high-turned", .scale = {0.9f, 1.3f}, .rotation = 12, .from = {50, 60}, .to = {44, 70}},
};

/// Where single numbers are absurd.
constexpr Place kStrangePlaces[] = {
    {.name = "position-nan", .position = {kNaN, 0.5f}},
    {.name = "position-infinite", .position = {0.5f, kInfinity}},
    {.name = "position-far", .position = {1e30f, 0.5f}},
    {.name = "anchor-nan", .anchor = {0.5f, kNaN}},
    {.name = "scale-nan", .scale = {kNaN, 1}},
    {.name = "scale-infinite", .scale = {1, kInfinity}},
    {.name = "scale-huge", .scale = {1e9f, 1e9f}},
    {.name = "scale-tiny", .scale = {1e-4f, 1e-5f}},
    {.name = "scale-none", .scale = {1, 7e-6f}},
    {.name = "scale-negative", .scale = {-1, 1}},
    {.name = "rotation-infinite", .rotation = kInfinity},
    {.name = "rotation-huge", .rotation = 1e20},
    {.name = "outside", .position = {-3, 0.5f}},
};

struct Placing {
    PK_PixelFormat source = kBGRA, destination = kBGRA;
    int32_t sourceField = 0, destinationField = 0, renderField = 0, quality = 4;
    std::optional<PK_Rect> crop = {};
    uint32_t aspectNum = 10, aspectDen = 11;
    float opacity = 1;
    bool composite = false, smoothEdges = false, inLinear = false;
    double softness = 0;
    std::optional<PK_BlendMode> mode = {};
    Content content = Content::kOrdinary;
    RoundingMode rounding = RoundingMode::kNearest;
    Walk sourceWalk = kSpread, destinationWalk = kUpwards;

    void Make(Line& line, const Place& place) const {
        Image from(source, place.from.width, place.from.height, sourceWalk, line.random);
        Image image(destination, place.to.width, place.to.height, destinationWalk, line.random);
        from.Fill(source, content, line.random);
        image.Fill(destination, Content::kOrdinary, line.random);
        line.results.Add(
            Call(place, from.First(), from.Step(), place.from, image.First(), image.Step(), place.to));
        if (IsFloat(destination)) image.UniteNaNs();
        image.AddTo(line.results);
    }

    PK_Result Call(const Place& place, const uint8_t* from, int32_t fromStep, Size fromSize, uint8_t* to,
                   int32_t toStep, Size toSize) const {
        const PK_Rect* const rect = crop ? &*crop : nullptr;
        const Rounding mxcsr(rounding);
        if (mode)
            return PK_MotionWithBlendMode(from, fromStep, fromSize.width, fromSize.height, source,
                                          sourceField, rect, to, toStep, toSize.width, toSize.height,
                                          destination, destinationField, aspectNum, aspectDen, place.position,
                                          place.anchor, place.scale, place.rotation, opacity, softness,
                                          smoothEdges, renderField, *mode, quality, inLinear);
        return PK_Motion(from, fromStep, fromSize.width, fromSize.height, source, sourceField, rect, to,
                         toStep, toSize.width, toSize.height, destination, destinationField, aspectNum,
                         aspectDen, place.position, place.anchor, place.scale, place.rotation, opacity,
                         composite, softness, smoothEdges, renderField, quality, inLinear);
    }
};

/// The placing at all qualities and places.
void MakeAll(Line& line, Placing placing) {
    for (int32_t quality = 1; quality <= 5; ++quality) {
        placing.quality = quality;
        for (const Place& place : kPlaces) placing.Make(line, place);
    }
}

void AddFormat(Lines& lines, PK_PixelFormat format) {
    const auto add = [&](const std::string& name, const Placing& placing) {
        lines.Add(NameOf(format) + "/" + name, [&](Line& line) { MakeAll(line, placing); });
    };
    for (const PK_PixelFormat other :
         {kBGRA, PK_PixelFormat_BGRP_4444_15u, PK_PixelFormat_BGRP_4444_32f, PK_PixelFormat_UYVY_422_8u,
          PK_PixelFormat_V210_422_10u, PK_PixelFormat_RGB_444_10u})
        add("to/" + NameOf(other), {.source = format, .destination = other});
    add("smooth", {.source = format, .smoothEdges = true});
    add("soft", {.source = format, .smoothEdges = true, .softness = 0.6});
    add("over", {.source = format, .opacity = 0.7f, .composite = true});
    add("edges", {.source = format, .composite = true, .content = Content::kEdges});
    add("down", {.source = format, .opacity = 0.4f, .smoothEdges = true, .rounding = RoundingMode::kDown});
}

bool HasFourChannels(PK_PixelFormat format) {
    return (format & 0x30) == 0 && (format & 0xc) != 0;
}

constexpr PK_PixelFormat kFew[] = {kBGRA, PK_PixelFormat_VUYA_4444_8u_709, PK_PixelFormat_PRGB_4444_15u,
                                   kLinear};

void AddFields(Lines& lines, PK_PixelFormat format) {
    const auto add = [&](int32_t sourceField, int32_t destinationField, const Placing& placing) {
        const std::string fields = std::to_string(sourceField) + "-" + std::to_string(destinationField);
        lines.Add("fields/" + NameOf(format) + "/" + fields, [&](Line& line) {
            Placing drawn = placing;
            drawn.sourceField = sourceField;
            drawn.destinationField = destinationField;
            for (const int32_t renderField : {0, 1, 2, 3}) {
                drawn.renderField = renderField;
                for (const auto& crop : {std::optional<PK_Rect>(), std::optional<PK_Rect>({2, 3, 19, 14})}) {
                    drawn.crop = crop;
                    MakeAll(line, drawn);
                }
            }
        });
    };
    for (const int32_t sourceField : {0, 1, 2})
        for (const int32_t destinationField : {0, 1, 2})
            add(sourceField, destinationField, {.source = format, .composite = format == kLinear});
    add(3, -1, {.source = format});
}

void AddPlaces(Lines& lines) {
    const auto add = [&](const Place& place) {
        for (const PK_PixelFormat format : kFew)
            lines.Add("place/" + std::string(place.name) + "/" + NameOf(format), [&](Line& line) {
                for (const int32_t quality : {2, 4, 5})
                    for (const bool smoothEdges : {false, true})
                        Placing{.source = format,
                                .quality = quality,
                                .smoothEdges = smoothEdges,
                                .softness = smoothEdges ? 0.3 : 0}
                            .Make(line, place);
            });
    };
    for (const Place& place : kBands) add(place);
    for (const Place& place : kStrangePlaces) add(place);
}

void AddSettings(Lines& lines) {
    const auto add = [&](const std::string& name, const Placing& placing) {
        lines.Add("with/" + name, [&](Line& line) {
            for (const PK_PixelFormat format : kFew) {
                Placing drawn = placing;
                drawn.source = format;
                MakeAll(line, drawn);
            }
        });
    };
    // PK_BlendMode_Dissolve is left out: it draws from the C runtime.
    for (const PK_BlendMode mode : {PK_BlendMode_Normal, PK_BlendMode_Multiply, PK_BlendMode_Screen,
                                    PK_BlendMode_Color, PK_BlendMode_Divide, PK_BlendMode_Divide + 1, -1})
        for (const bool inLinear : {false, true})
            add("mode/" + std::to_string(mode) + (inLinear ? "/linear" : ""),
                {.opacity = 0.8f, .inLinear = inLinear, .mode = mode});
    for (const float opacity : {1.5f, 0.999995f, 0.25f, 7e-6f, -1.0f, kNaN})
        for (const bool composite : {false, true})
            add("opacity/" + std::to_string(opacity) + (composite ? "/over" : ""),
                {.opacity = opacity, .composite = composite});
    for (const double softness : {-0.1, 1e-9, 0.25, 1.0, 1.1, double{kNaN}})
        add("softness/" + std::to_string(softness), {.softness = softness});
    for (const uint32_t aspectNum : {0, 1, 16})
        for (const uint32_t aspectDen : {0, 15})
            add("aspect/" + std::to_string(aspectNum) + "-" + std::to_string(aspectDen),
                {.aspectNum = aspectNum, .aspectDen = aspectDen});
    for (const PK_Rect& crop : {PK_Rect{0, 0, 23, 17},
                                {3, 2, 4, 3},
                                {1, 5, 22, 16},
                                {0, 0, 24, 17},
                                {5, 5, 5, 9},
                                {-1, 0, 9, 9},
                                {9, 9, 3, 12}})
        for (const bool smoothEdges : {false, true})
            add("crop/" + std::to_string(crop.left) + "-" + std::to_string(crop.right) +
                    (smoothEdges ? "/smooth" : ""),
                {.crop = crop, .smoothEdges = smoothEdges});
    for (const int32_t quality : {-1, 0, 6})
        lines.Add("with/quality/" + std::to_string(quality), [&](Line& line) {
            for (const PK_PixelFormat format : kFew)
                for (const Place& place : kPlaces)
                    Placing{.source = format, .quality = quality}.Make(line, place);
        });
}

void AddOdd(Lines& lines) {
    const auto place = [](Line& line, PK_PixelFormat from, PK_PixelFormat to, Nulls nulls, Size fromSize,
                          Size toSize) {
        constexpr size_t kLength = size_t{16} * kOddWidth;
        Image source(kLength, kOddHeight, kTight, line.random),
            image(kLength, kOddHeight, kTight, line.random);
        for (const Place& drawn : {kMoved, kSmaller, kTurned})
            for (const int32_t quality : {2, 4})
                line.results.Add(Placing{.source = from, .destination = to, .quality = quality}.Call(
                    drawn, nulls(0, source.First()), source.Step(), fromSize, nulls(1, image.First()),
                    image.Step(), toSize));
        image.AddTo(line.results);
    };
    constexpr Size kOdd = {kOddWidth, kOddHeight};
    AddOddCalls(lines, "source", 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        place(line, kBGRA, kBGRA, nulls, {width, height}, kOdd);
    });
    AddOddCalls(lines, "destination", 2, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        place(line, kBGRA, kBGRA, nulls, kOdd, {width, height});
    });
    const auto addFormat = [&](PK_PixelFormat format) {
        lines.Add("odd/" + NameOf(format), [&](Line& line) {
            place(line, format, kBGRA, Nulls::None(), kOdd, kOdd);
            place(line, kBGRA, format, Nulls::None(), kOdd, kOdd);
        });
    };
    for (const PK_PixelFormat format : kStrangers) addFormat(format);
    for (const PK_PixelFormat format : kStreams) addFormat(format);
    for (const PK_PixelFormat format : kRasters)
        if (!HasFourChannels(format)) addFormat(format);
}

void AddMotion(Lines& lines) {
    for (const PK_PixelFormat format : kRasters)
        if (HasFourChannels(format)) AddFormat(lines, format);
    for (const PK_PixelFormat format : kFew) AddFields(lines, format);
    AddPlaces(lines);
    AddSettings(lines);
    AddOdd(lines);
}

const Family sMotion("motion", AddMotion);

} // namespace
