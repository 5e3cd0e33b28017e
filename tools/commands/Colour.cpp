// pixelkiln colour: from one colour space to another, and luminance bent into the range of standard video.

#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "Numbers.h"
#include "Operations.h"
#include "Png.h"
#include "SharedWords.h"
#include "Terminal.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <optional>

namespace tool {
namespace {

// The frames are BGRA_4444_32f on the way; from and to of PipeOptions stay empty.
struct Options : PipeOptions {
    std::string fromSpace;
    std::string toSpace;
    bool gamutClip = false;
    std::optional<float> exposure;
    std::optional<float> slope;
    std::optional<float> knee;
};

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
    const std::string text = Formatted("samples from %.6g to %.6g", static_cast<double>(samples.least),
                                       static_cast<double>(samples.greatest));
    if (!png || samples.beyond == 0) return text;
    return text + Formatted("; the PNG clips %.3g %% of them to 0 or 1",
                            100.0 * static_cast<double>(samples.beyond) / static_cast<double>(samples.count));
}

std::optional<ToneRange> ToneRangeOf(const Options& options) {
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

constexpr const char* kNotes =
    R"(Files are named and read as by 'pixelkiln convert'; raw frames are BGRA_4444_32f. Spaces:
  srgb           IEC 61966-2-1
  rec709         BT.709 primaries, power 2.4 (BT.1886): the hub, through which every conversion goes
  gamma:0.45     BT.709 primaries, a power law: the exponent from linear to encoded; 1 is linear light
  rec2020        BT.2020 primaries, power 2.4
  p3, p3-d65     P3 primaries, white D65, power 2.6
  p3-d60, p3-dci the same with white D60, and with the white of projection
  pq, pq-p3      SMPTE ST 2084 with BT.2020 or P3 primaries; the signal 1 is 10000 cd/m2
  pq-normalised, pq-p3-normalised
                 the same, scaled so that 1 is 100 cd/m2
  hlg            BT.2100 hybrid log-gamma on a display of 1000 cd/m2
In all others an encoded 1 is 100 cd/m2, and values above it are highlights. Raw frames keep them; a PNG
clips it, and the last line tells how much. A PNG takes up no note of its space. PQ and HLG want
--png-depth 16, since 8 bits show bands.

--gamut-clip works towards srgb, rec2020 and p3, and from those and pq towards srgb, rec709 and gamma.

--exposure, --slope and --knee, always together, first bend the luminance of the source into the range
of standard video: 10000 / exposure cd/m2 becomes white, slope is the gain around the centre, and at the
level of the knee the curve leaves the straight line. Only srgb, rec709, rec2020 and p3 have this. In
rec2020 and p3 the library leaves linear light, which the program encodes again before it goes on.

Examples:
  pixelkiln colour photo.png photo-pq.png --from srgb --to pq --png-depth 16
  pixelkiln colour clip.raw clip-709.raw --from pq --to rec709 --size 1920x1080
  pixelkiln colour clip-709.raw clip-%04d.png --from rec709 --to srgb --size 1920x1080 \
      --exposure 10 --slope 1.5 --knee 0.7
)";

void Declare(Words& words, Options& options) {
    AddFrames(words, options);
    words.Take("--from", options.fromSpace, "Space of the input, such as srgb").Required();
    words.Take("--to", options.toSpace, "Space of the output, such as pq").Required();
    words.Flag("--gamut-clip", options.gamutClip,
               "Pull colours that the output cannot show towards their luminance");
    words.Take("--exposure", options.exposure, "Tone range: factor on linear light, above 0");
    words.Take("--slope", options.slope, "Tone range: gain around the centre, above 0");
    words.Take("--knee", options.knee, "Tone range: where the curve bends, 0 to below 1");
    words.Notes(kNotes);
}

void Run(const Options& options) {
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
    const auto convert = [&](Frame& frame) {
        if (range) CompressToneRange(frame, from, *range);
        ConvertSpace(frame, from, to, options.gamutClip);
        ForColourSamples(frame, [&](float sample) { samples.Add(sample); });
    };
    PipeFrames(pipe, OnCopy(convert));
    if (!IsSilent(options)) Print(from.name + " to " + to.name + ": " + SamplesText(samples, png) + "\n");
}

const Command sColour(Group::Frames, "colour", "Convert frames from one colour space to another", Declare,
                      Run);

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

} // namespace tool
