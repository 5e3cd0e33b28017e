// pixelkiln colour: from one colour space to another, and luminance bent into the range of standard video.

#include "Commands.h"
#include "Failure.h"
#include "Formats.h"
#include "Operations.h"
#include "Png.h"
#include "Terminal.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <limits>

namespace tool {
namespace {

constexpr PK_PixelFormat kWorkingFormat = PK_PixelFormat_BGRA_4444_32f;

// Calls take(row, pixels) for every row.
template <typename Take>
void ForRows(Frame& frame, Take take) {
    for (int32_t y = 0; y < frame.Height(); ++y) take(reinterpret_cast<float*>(frame.Row(y)), frame.Width());
}

// Calls take(sample) for red, green and blue of every pixel.
template <typename Take>
void ForColourSamples(Frame& frame, Take take) {
    ForRows(frame, [&](float* row, int32_t pixels) {
        for (int32_t i = 0; i < 4 * pixels; ++i)
            if (i % 4 != 3) take(row[i]);
    });
}

constexpr float kTolerance = 1.0F / 1024; // an error of the bulk arithmetic is no colour out of range

// What the samples turned out to be, so that nobody is surprised by what a PNG clips.
struct Samples {
    float least = std::numeric_limits<float>::infinity();
    float greatest = -std::numeric_limits<float>::infinity();
    int64_t count = 0;
    int64_t beyond = 0; // outside 0 to 1, or not a number

    void Add(float sample) {
        least = std::fmin(least, sample);
        greatest = std::fmax(greatest, sample);
        ++count;
        if (!(sample >= -kTolerance && sample <= 1 + kTolerance)) ++beyond;
    }
};

std::string SamplesText(const Samples& samples, bool png) {
    char text[160];
    std::snprintf(text, sizeof(text), "samples from %.6g to %.6g", static_cast<double>(samples.least),
                  static_cast<double>(samples.greatest));
    if (!png || samples.beyond == 0) return text;
    char clipped[96];
    std::snprintf(clipped, sizeof(clipped), "; the PNG clips %.3g %% of them to 0 or 1",
                  100.0 * static_cast<double>(samples.beyond) / static_cast<double>(samples.count));
    return std::string(text) + clipped;
}

std::optional<ToneRange> ToneRangeOf(const ColourOptions& options) {
    const int given = options.exposure.has_value() + options.slope.has_value() + options.knee.has_value();
    if (given == 0) return {};
    if (given < 3)
        throw Failure(kExitUsage,
                      "--exposure, --slope and --knee belong together; try --exposure 10 --slope 1.5 "
                      "--knee 0.7");
    const ToneRange range = {*options.exposure, *options.slope, *options.knee};
    if (!(range.exposure > 0 && std::isfinite(range.exposure)))
        throw Failure(kExitUsage, "--exposure must be a number above 0");
    if (!(range.slope > 0 && std::isfinite(range.slope)))
        throw Failure(kExitUsage, "--slope must be a number above 0");
    if (!(range.knee >= 0 && range.knee < 1)) throw Failure(kExitUsage, "--knee must be from 0 to below 1");
    return range;
}

void RequireGamutClip(const Space& from, const Space& to) {
    if (to.clipsGamutFromHub || (to.hasHubPrimaries && from.clipsGamutToHub)) return;
    throw Failure(kExitFailed, "nothing clips the gamut from " + from.name + " to " + to.name +
                                   "; leave --gamut-clip away, or go by way of srgb, rec2020 or p3");
}

} // namespace

void RequireToneRange(const Space& space) {
    if (space.toneRange != ToneRangeOutput::None) return;
    throw Failure(kExitFailed, "tone-range compression does nothing in " + space.name +
                                   "; take the picture to raw frames of rec709 first and compress those");
}

void ConvertSpace(Frame& frame, const Space& from, const Space& to, bool gamutClip) {
    ForRows(frame, [&](float* row, int32_t pixels) {
        from.conversion->ConvertPixelsToRec709(row, row, pixels, gamutClip && to.hasHubPrimaries);
        to.conversion->ConvertPixelsFromRec709(row, row, pixels, gamutClip);
    });
}

void CompressToneRange(Frame& frame, const Space& space, const ToneRange& range) {
    RequireToneRange(space);
    ForRows(frame, [&](float* row, int32_t pixels) {
        space.conversion->CompressPixelsToSDR(row, row, pixels, range.exposure, range.slope, range.knee);
    });
    if (space.toneRange == ToneRangeOutput::Linear)
        ForColourSamples(frame, [&](float& sample) { sample = space.conversion->LinearToEOTF(sample); });
}

void RunColour(const ColourOptions& options) {
    const Space from = ParseSpace(options.fromSpace);
    const Space to = ParseSpace(options.toSpace);
    const std::optional<ToneRange> range = ToneRangeOf(options);
    if (range) RequireToneRange(from);
    if (options.gamutClip) RequireGamutClip(from, to);

    PipeOptions pipe = options;
    const bool png = IsPngName(options.output);
    pipe.from = FormatName(kWorkingFormat);
    if (!png) pipe.to = pipe.from;
    Samples samples;
    PipeFrames(pipe, [&](const Frame& frame) {
        Frame converted = Copied(frame);
        if (range) CompressToneRange(converted, from, *range);
        ConvertSpace(converted, from, to, options.gamutClip);
        ForColourSamples(converted, [&](float sample) { samples.Add(sample); });
        return converted;
    });
    if (!IsSilent(options)) Print(from.name + " to " + to.name + ": " + SamplesText(samples, png) + "\n");
}

} // namespace tool
