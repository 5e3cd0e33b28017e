#include "ColourPictures.h"

#include "Drawing.h"
#include "Numbers.h"
#include "Operations.h"

#include <array>
#include <cmath>
#include <iterator>

namespace tool {
namespace {

constexpr PK_PixelFormat kFloatFormat = PK_PixelFormat_BGRA_4444_32f;
constexpr PK_PixelFormat kShownFormat = PK_PixelFormat_BGRA_4444_8u;

struct Stop {
    const char* space;
    const char* title;
    const char* caption;
};
constexpr Stop kStops[] = {
    {"srgb", "sRGB", "the photograph"},
    {"rec709", "Rec. 709", "power 2.4: the shadows are lighter"},
    {"rec2020", "Rec. 2020", "wider primaries: paler colours"},
    {"p3", "P3, D65", "power 2.6: lighter, a little paler"},
    {"pq", "PQ, Rec. 2020", "white at 0.51: 1.0 is 10000 cd/m\u00b2"},
    {"hlg", "HLG", "white at 0.63: 1.0 is 1000 cd/m\u00b2"},
};

// The ramp: bars of one chromaticity each, with luminance that grows by equal factors from left to right.
constexpr double kLeast = 0.1; // cd/m2
constexpr double kGreatest = 1000;
constexpr double kWhite = 100; // cd/m2 of linear 1.0
constexpr int32_t kRampWidth = 880;
constexpr int32_t kBarHeight = 36;
constexpr std::array<double, 3> kBars[] = {
    {1, 1, 1}, {0.90, 0.56, 0.42}, {1, 0.42, 0.08}, {0.25, 0.50, 0.95}, {0.30, 0.55, 0.15},
};
constexpr double kLuma[] = {0.2126, 0.7152, 0.0722};
constexpr ToneRange kToneRange = {10, 1.5F, 0.7F};

Frame Ramp(const Space& space) {
    Frame ramp(kFloatFormat, kRampWidth, kBarHeight * static_cast<int32_t>(std::size(kBars)));
    for (int32_t y = 0; y < ramp.Height(); ++y) {
        const auto& bar = kBars[y / kBarHeight];
        const double luminance = kLuma[0] * bar[0] + kLuma[1] * bar[1] + kLuma[2] * bar[2];
        auto* row = reinterpret_cast<float*>(ramp.Row(y));
        for (int32_t x = 0; x < kRampWidth; ++x) {
            const double along = static_cast<double>(x) / (kRampWidth - 1);
            const double light = kLeast / kWhite * std::pow(kGreatest / kLeast, along);
            for (int channel = 0; channel < 3; ++channel)
                row[4 * x + 2 - channel] =
                    space.conversion->LinearToEOTF(static_cast<float>(bar[channel] * light / luminance));
            row[4 * x + 3] = 1;
        }
    }
    return ramp;
}

Frame Shown(Frame frame, const Space& space) {
    ConvertSpace(frame, space, ParseSpace("srgb"), /*gamutClip=*/false);
    return Converted(frame, kShownFormat, kDefaultQuality);
}

void DrawLuminanceScale(cairo_t* context, double left, double top) {
    const double decades = std::log10(kGreatest / kLeast);
    for (int decade = 0; decade <= static_cast<int>(decades); ++decade) {
        const std::string label = Formatted("%g", kLeast * std::pow(10, decade));
        const double x = left + kRampWidth * decade / decades;
        SetColour(context, kInk);
        cairo_rectangle(context, x - 0.5, top, 1, 6);
        cairo_fill(context);
        DrawText(context, label, x, top + 20, {.size = 13, .align = Align::Centre});
    }
}

} // namespace

std::vector<Tile> ColourTiles(const Frame& picture) {
    const Space photograph = ParseSpace("srgb");
    std::vector<Tile> tiles;
    for (const Stop& stop : kStops) {
        Frame frame = Converted(picture, kFloatFormat, kDefaultQuality);
        ConvertSpace(frame, photograph, ParseSpace(stop.space), /*gamutClip=*/false);
        tiles.emplace_back(stop.title, stop.caption, Converted(frame, kShownFormat, kDefaultQuality));
    }
    return tiles;
}

void WriteToneRangePicture(const std::string& name) {
    constexpr double kMargin = 24;
    constexpr double kHeading = 48;
    constexpr double kCaption = 28;
    constexpr double kScale = 40;
    const Space space = ParseSpace("rec709");
    const Frame ramp = Ramp(space);
    Frame compressed = Copied(ramp);
    CompressToneRange(compressed, space, kToneRange);
    const Frame shown[] = {Shown(Copied(ramp), space), Shown(std::move(compressed), space)};
    const char* const captions[] = {
        "as it is: above 100 cd/m\u00b2 channels clip, one after the other, and colours turn",
        "compressed with exposure 10, slope 1.5 and knee 0.7: 1000 cd/m\u00b2 is white",
    };
    const double block = kCaption + ramp.Height() + kScale;
    const auto draw = [&](cairo_t* context) {
        DrawText(context, "A ramp from 0.1 to 1000 cd/m\u00b2 on a display of standard video", kMargin, 34,
                 {.size = 18, .bold = true});
        for (size_t i = 0; i < std::size(shown); ++i) {
            const double top = kHeading + static_cast<double>(i) * block;
            DrawText(context, captions[i], kMargin, top + 18, {.size = 14});
            DrawPicture(context, shown[i], kMargin, top + kCaption, kRampWidth, ramp.Height());
            DrawLuminanceScale(context, kMargin, top + kCaption + ramp.Height());
        }
    };
    WritePngDrawing(kRampWidth + 2 * static_cast<int32_t>(kMargin),
                    static_cast<int32_t>(kHeading + 2 * block), draw, name);
}

} // namespace tool
