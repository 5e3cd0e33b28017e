// Quadrilaterals of every kind, by both ways of sampling, all rules of writing, fields and the soft rim.

#include "results/Image.h"
#include "results/Lines.h"
#include "results/Rounding.h"

#include <PixelKiln/QuadWarp.h>

#include <limits>
#include <string>

namespace {

using namespace PKResults;

constexpr int32_t kWidth = 61, kHeight = 47;
constexpr PK_Rect kWhole = {0, 0, kWidth, kHeight};
constexpr double kInfinity = std::numeric_limits<double>::infinity();
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

struct Quads {
    const char* name;
    double source[8], destination[8];
    PK_Rect sourceRect = kWhole, destinationRect = kWhole;
};

constexpr Quads kQuads[] = {
    {"copy", {0, 0, 61, 0, 61, 47, 0, 47}, {0, 0, 61, 0, 61, 47, 0, 47}},
    {"upside-down", {0, 47, 61, 47, 61, 0, 0, 0}, {0, 0, 61, 0, 61, 47, 0, 47}},
    {"skew", {3.1, 1.7, 57.2, 5.9, 59.3, 44.1, 1.4, 41.5}, {-4.6, 8.3, 43.7, -2.1, 65.9, 30.2, 12.8, 45.4}},
    {"larger",
     {20.3, 11.6, 30.9, 12.2, 29.7, 21.4, 19.1, 20.8},
     {1.3, 0.4, 60.2, 2.9, 58.8, 46.3, 3.5, 44.1}},
    {"smaller", {0, 0, 61, 0, 61, 47, 0, 47}, {20.3, 11.6, 30.9, 12.2, 29.7, 21.4, 19.1, 20.8}},
    {"crossed", {0, 0, 61, 0, 61, 47, 0, 47}, {2, 3, 55.5, 41.25, 57.1, 4.4, 3.3, 40.6}},
    {"concave", {0, 0, 61, 0, 61, 47, 0, 47}, {2.2, 3.3, 58.1, 4.4, 20.5, 15.7, 4.1, 44.9}},
    {"triangle", {0, 0, 61, 0, 61, 47, 61, 47}, {2.2, 3.3, 58.1, 4.4, 40.5, 45.7, 40.5, 45.7}},
    {"line", {0, 0, 61, 0, 61, 47, 0, 47}, {2.5, 3.5, 58.5, 3.5, 58.5, 3.5, 2.5, 3.5}},
    {"outside", {0, 0, 61, 0, 61, 47, 0, 47}, {-90, -80, -20, -80, -20, -30, -90, -30}},
    {"huge", {0, 0, 61, 0, 61, 47, 0, 47}, {-1e6, -2e6, 3e6, -1e6, 2e6, 3e6, -2e6, 1e6}},
    {"source-outside", {-100, -70, 160, -60, 170, 110, -90, 120}, {1, 2, 60, 3, 59, 45, 2, 44}},
    {"rectangles",
     {3.1, 1.7, 57.2, 5.9, 59.3, 44.1, 1.4, 41.5},
     {-4.6, 8.3, 43.7, -2.1, 65.9, 30.2, 12.8, 45.4},
     {9, 7, 40, 30},
     {5, 3, 50, 41}},
    {"empty-source", {0, 0, 61, 0, 61, 47, 0, 47}, {0, 0, 61, 0, 61, 47, 0, 47}, {9, 7, 9, 30}, kWhole},
    {"inverted-destination",
     {0, 0, 61, 0, 61, 47, 0, 47},
     {0, 0, 61, 0, 61, 47, 0, 47},
     kWhole,
     {5, 30, 50, 9}},
    {"infinite", {0, 0, 61, 0, 61, 47, 0, 47}, {0, 0, kInfinity, 0, 61, 47, 0, 47}},
    {"nan", {0, 0, 61, kNaN, 61, 47, 0, 47}, {0, 0, 61, 0, 61, 47, 0, 47}},
};

struct Rule {
    const char* name;
    bool blend, keepSourceAlpha, featherOver;
};

constexpr Rule kRules[] = {{"replace", false, false, false},     {"keep-alpha", false, true, false},
                           {"blend", true, false, false},        {"blend-keep-alpha", true, true, false},
                           {"feather-over", false, false, true}, {"feather-over-blend", true, false, true}};

struct Warp {
    const Quads& quads;
    int32_t quality;
    Rule rule;
    float feather;
    PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
    int32_t opacity = 255;
    int32_t field = 0;
    bool ignoreFields = false;

    void Draw(Line& line) const {
        Image source(size_t{4} * kWidth, kHeight, {4, 8, false}, line.random);
        Image destination(size_t{4} * kWidth, kHeight, {12, 20, false}, line.random);
        for (int32_t row = 0; row < kHeight; ++row) // fully opaque and clear pixels, at which rules branch
            for (uint32_t i = 0; i < 20; ++i) {
                source.Row(row)[4 * line.random.Below(kWidth) + 3] = i % 2 == 0 ? 255 : 0;
                destination.Row(row)[4 * line.random.Below(kWidth) + 3] = i % 2 == 0 ? 255 : 0;
            }
        line.results.Add(PK_WarpAffineQuad(nullptr, nullptr, source.First(), source.Step(), &quads.sourceRect,
                                           quads.source, destination.First(), destination.Step(),
                                           &quads.destinationRect, quads.destination, quality, opacity,
                                           rule.blend, rule.keepSourceAlpha, format, field, ignoreFields,
                                           rule.featherOver, feather));
        destination.AddTo(line.results);
    }
};

/// All formats, opacities and fields.
void DrawAll(Line& line, const Warp& warp) {
    const auto drawFormat = [&](PK_PixelFormat format, int32_t opacity) {
        Warp drawn = warp;
        drawn.format = format;
        drawn.opacity = opacity;
        drawn.Draw(line);
    };
    for (const int32_t opacity : {255, 171, 1, 0, 300, -7}) drawFormat(PK_PixelFormat_BGRA_4444_8u, opacity);
    for (const int32_t opacity : {255, 171}) {
        drawFormat(PK_PixelFormat_VUYA_4444_8u, opacity);
        drawFormat(PK_PixelFormat_ARGB_4444_8u, opacity);
    }
    for (const int32_t field : {1, 2, 3, -1})
        for (const bool ignoreFields : {false, true}) {
            Warp drawn = warp;
            drawn.opacity = 171;
            drawn.field = field;
            drawn.ignoreFields = ignoreFields;
            drawn.Draw(line);
        }
}

void AddWarp(Lines& lines, const Warp& warp) {
    const std::string name = std::string(warp.quads.name) + "/q" + std::to_string(warp.quality) + "/" +
                             warp.rule.name + "/feather-" + std::to_string(warp.feather);
    lines.Add(name, [&](Line& line) { DrawAll(line, warp); });
}

void AddQuads(Lines& lines, const Quads& quads) {
    for (const int32_t quality : {2, 3})
        for (const float feather : {0.0f, 0.7f, 5.7f, 60.0f})
            for (const Rule& rule : kRules) AddWarp(lines, {quads, quality, rule, feather});
    lines.Add(std::string(quads.name) + "/down", [&](Line& line) {
        const Rounding rounding(RoundingMode::kDown);
        for (const int32_t quality : {2, 3})
            for (const float feather : {0.0f, 5.7f}) DrawAll(line, {quads, quality, kRules[2], feather});
    });
}

/// Qualities beyond the two that differ, and feathers that count as none.
void AddRest(Lines& lines) {
    constexpr float kNoNumber = std::numeric_limits<float>::quiet_NaN();
    const Quads& skew = kQuads[2];
    for (const int32_t quality : {-1, 0, 1, 4, 5}) AddWarp(lines, {skew, quality, kRules[2], 5.7f});
    for (const float feather : {-3.0f, kNoNumber, std::numeric_limits<float>::infinity()})
        for (const int32_t quality : {2, 3}) AddWarp(lines, {skew, quality, kRules[0], feather});
}

struct Given {
    const char* name;
    bool source = true, sourceRect = true, sourceQuad = true, destination = true, destinationRect = true,
         destinationQuad = true;
    int32_t sourceRowBytes = 4 * kWidth, destinationRowBytes = 4 * kWidth;
};

constexpr Given kGiven[] = {
    {"null-source", false},
    {"null-source-rectangle", true, false},
    {"null-source-quad", true, true, false},
    {"null-destination", true, true, true, false},
    {"null-destination-rectangle", true, true, true, true, false},
    {"null-destination-quad", true, true, true, true, true, false},
    {"null-images", false, true, true, false},
    {"no-source-step", true, true, true, true, true, true, 0},
    {"no-destination-step", true, true, true, true, true, true, 4 * kWidth, 0},
    {"negative-steps", true, true, true, true, true, true, -4 * kWidth, -4 * kWidth},
};

void AddOdd(Lines& lines) {
    for (const Given& given : kGiven)
        lines.Add(std::string("odd/") + given.name, [&](Line& line) {
            const Quads& quads = kQuads[2];
            Image source(size_t{4} * kWidth, kHeight, kTight, line.random);
            Image destination(size_t{4} * kWidth, kHeight, kTight, line.random);
            line.results.Add(PK_WarpAffineQuad(
                nullptr, nullptr, given.source ? source.First() : nullptr, given.sourceRowBytes,
                given.sourceRect ? &quads.sourceRect : nullptr, given.sourceQuad ? quads.source : nullptr,
                given.destination ? destination.First() : nullptr, given.destinationRowBytes,
                given.destinationRect ? &quads.destinationRect : nullptr,
                given.destinationQuad ? quads.destination : nullptr, 3, 255, false, false,
                PK_PixelFormat_BGRA_4444_8u, 0, false, false, 0));
            destination.AddTo(line.results);
        });
}

void AddWarps(Lines& lines) {
    for (const Quads& quads : kQuads) AddQuads(lines, quads);
    AddRest(lines);
    AddOdd(lines);
}

const Family sQuadWarp("quad-warp", AddWarps);

} // namespace
