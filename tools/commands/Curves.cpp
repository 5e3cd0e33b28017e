// pixelkiln curves: the transfer functions of the colour spaces and the tone curve, as a picture.

#include "ColourSpaces.h"
#include "Command.h"
#include "Failure.h"
#include "Numbers.h"
#include "Operations.h"
#include "Plot.h"
#include "Png.h"
#include "Terminal.h"

#include <cmath>
#include <filesystem>

namespace tool {
namespace {

constexpr int32_t kWidth = 1160;
constexpr int32_t kHeight = 1000;
constexpr double kMargin = 20;
constexpr double kWhite = 100; // cd/m2 of linear 1.0

// Told apart by those, too, who do not see all colours.
constexpr Colour kBlack = {0.1, 0.1, 0.1};
constexpr Colour kOrange = {0.84, 0.37, 0.0};
constexpr Colour kSkyBlue = {0.34, 0.71, 0.91};
constexpr Colour kGreen = {0.0, 0.62, 0.45};
constexpr Colour kBlue = {0.0, 0.35, 0.70};
constexpr Colour kPurple = {0.80, 0.47, 0.65};
const std::vector<double> kDashed = {7, 4};

// A function of one linear value, for spaces whose curve needs no more.
std::function<double(double)> Encoding(const Space& space) {
    return [conversion = space.conversion](double linear) {
        return static_cast<double>(conversion->LinearToEOTF(static_cast<float>(linear)));
    };
}

// The signal of grey: that of a space whose curve depends on all channels lives in its pixels alone.
std::function<double(double)> GreyEncoding(const Space& space) {
    const Space hub = ParseSpace("rec709");
    return [conversion = space.conversion, hub](double linear) {
        const float encoded = hub.conversion->LinearToEOTF(static_cast<float>(linear));
        float pixel[4] = {encoded, encoded, encoded, 1};
        conversion->ConvertPixelsFromRec709(pixel, pixel, 1, false);
        return static_cast<double>(pixel[1]);
    };
}

// The Rec. 709 signal that becomes of grey.
std::function<double(double)> ToneCurve(const ToneRange& range) {
    return [range, space = ParseSpace("rec709")](double luminance) {
        const float encoded = space.conversion->LinearToEOTF(static_cast<float>(luminance / kWhite));
        float pixel[4] = {encoded, encoded, encoded, 1};
        space.conversion->CompressPixelsToSDR(pixel, pixel, 1, range.exposure, range.slope, range.knee);
        return static_cast<double>(pixel[1]);
    };
}

std::vector<Curve> TransferCurves() {
    std::vector<Curve> curves;
    const auto add = [&](const char* name, const char* label, Colour colour, std::vector<double> dashes) {
        curves.push_back({label, colour, std::move(dashes), Encoding(ParseSpace(name))});
    };
    add("rec709", "Rec. 709, Rec. 2020: 1/2.4", kBlack, {});
    add("p3", "P3 with any white: 1/2.6", kOrange, {});
    add("gamma:0.45", "gamma 0.45", kPurple, kDashed);
    add("srgb", "sRGB", kSkyBlue, kDashed);
    curves.push_back({"HLG, grey", kGreen, {}, GreyEncoding(ParseSpace("hlg"))});
    add("pq", "PQ, Rec. 2020 and P3", kBlue, {});
    add("pq-normalised", "PQ, normalised", kBlue, kDashed);
    return curves;
}

// The curves as functions of luminance instead of linear values.
std::vector<Curve> OverLuminance(std::vector<Curve> curves) {
    for (Curve& curve : curves)
        curve.value = [of = std::move(curve.value)](double luminance) { return of(luminance / kWhite); };
    return curves;
}

std::string Short(double value) {
    return Formatted("%g", value);
}

std::vector<Tick> Ticks(const std::vector<double>& values) {
    std::vector<Tick> ticks;
    for (const double value : values) ticks.push_back({value, Short(value)});
    return ticks;
}

Axis LuminanceAxis(double first, double last) {
    Axis axis = {"luminance of the display, cd/m\u00b2", first, last, true, {}};
    for (double value = first; value < 1.5 * last; value *= 10) axis.ticks.push_back({value, Short(value)});
    return axis;
}

Plot StandardRange() {
    return {"Standard range",
            "encoded over linear value; linear 1.0 is 100 cd/m\u00b2",
            {"linear value", 0, 1, false, Ticks({0, 0.2, 0.4, 0.6, 0.8, 1})},
            {"encoded value", 0, 1.4, false, Ticks({0, 0.2, 0.4, 0.6, 0.8, 1})},
            TransferCurves()};
}

Plot WholeRange() {
    return {"High dynamic range",
            "power laws reach 1.0 at 100 cd/m\u00b2, HLG at 1000, PQ at 10000",
            LuminanceAxis(0.01, 10000),
            {"encoded value", 0, 2, false, Ticks({0, 0.5, 1, 1.5, 2})},
            OverLuminance(TransferCurves())};
}

Plot TonePlot(const std::string& title, const std::vector<ToneRange>& ranges) {
    static constexpr Colour kColours[] = {kSkyBlue, kGreen, kBlue, kOrange};
    Plot plot = {title,
                 "exposure 10, which brings 1000 cd/m\u00b2 to white; dashed: no compression",
                 LuminanceAxis(0.1, 10000),
                 {"encoded value, Rec. 709", 0, 1.2, false, Ticks({0, 0.2, 0.4, 0.6, 0.8, 1})},
                 {}};
    plot.curves.push_back({"no compression", kBlack, kDashed,
                           OverLuminance({{"", kBlack, {}, Encoding(ParseSpace("rec709"))}})[0].value});
    for (const ToneRange& range : ranges)
        plot.curves.push_back({"slope " + Short(static_cast<double>(range.slope)) + ", knee " +
                                   Short(static_cast<double>(range.knee)),
                               kColours[plot.curves.size() - 1],
                               {},
                               ToneCurve(range)});
    return plot;
}

void DrawAll(cairo_t* context) {
    const Plot plots[] = {
        StandardRange(),
        WholeRange(),
        TonePlot("Tone curve: slope", {{10, 1, 0.7F}, {10, 1.5F, 0.7F}, {10, 2, 0.7F}, {10, 3, 0.7F}}),
        TonePlot("Tone curve: knee", {{10, 2, 0.2F}, {10, 2, 0.5F}, {10, 2, 0.7F}, {10, 2, 0.9F}}),
    };
    constexpr double kPlotWidth = (kWidth - 3 * kMargin) / 2;
    constexpr double kPlotHeight = (kHeight - 3 * kMargin) / 2;
    for (size_t i = 0; i < std::size(plots); ++i)
        DrawPlot(context, plots[i],
                 {kMargin + static_cast<double>(i % 2) * (kPlotWidth + kMargin),
                  kMargin + static_cast<double>(i / 2) * (kPlotHeight + kMargin), kPlotWidth, kPlotHeight});
}

struct Options {
    std::string output;
};

constexpr const char* kNotes =
    R"(Four plots: encoded over linear value up to 100 cd/m2 and over luminance up to 10000 cd/m2, and the tone
curve of some slopes and knees. Every point is what the library computes.

Example:
  pixelkiln curves curves.svg
)";

void Declare(Words& words, Options& options) {
    words.Take("OUT", options.output, "SVG or PNG file to write").Required();
    words.Notes(kNotes);
}

void Run(const Options& options) {
    const bool svg = std::filesystem::path(options.output).extension() == ".svg";
    if (!svg && !IsPngName(options.output))
        throw Failure(kExitUsage, "'" + options.output + "' must end in .svg or .png");
    const auto write = svg ? WriteSvgDrawing : WritePngDrawing;
    write(kWidth, kHeight, DrawAll, options.output);
    Print(options.output + ": transfer functions and tone curves\n");
}

const Command sCurves(Group::Pictures, "curves", "Draw the transfer functions and the tone curve", Declare,
                      Run);

} // namespace
} // namespace tool
