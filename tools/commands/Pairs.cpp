// pixelkiln pairs: every raster format by way of every other, as a picture or as numbers.

#include "Chains.h"
#include "Command.h"
#include "Difference.h"
#include "Failure.h"
#include "Formats.h"
#include "Numbers.h"
#include "OutputFile.h"
#include "PairsPicture.h"
#include "Png.h"
#include "SharedWords.h"
#include "Terminal.h"

#include <filesystem>

namespace tool {
namespace {

// Differences are measured here: gamma-coded RGB, where a step is the same for every format.
constexpr PK_PixelFormat kCommonGround = PK_PixelFormat_BGRA_4444_32f;

// Without a photograph: ramps of all three colours, gentle from pixel to pixel as in a photograph.
Frame Ramps() {
    constexpr int32_t kSide = 256;
    Frame picture(PK_PixelFormat_BGRA_4444_8u, kSide, kSide);
    for (int32_t y = 0; y < kSide; ++y)
        for (int32_t x = 0; x < kSide; ++x) {
            const int32_t pixel[4] = {(x + y) / 2, y, x, 255};
            for (int32_t channel = 0; channel < 4; ++channel)
                picture.Row(y)[4 * x + channel] = static_cast<uint8_t>(pixel[channel]);
        }
    return picture;
}

Pair Measure(const Frame& source, const Frame& sourceOnGround, PK_PixelFormat by, int32_t quality) {
    Pair pair;
    const size_t there = DescribeChain(source.Format(), by, quality).size();
    const size_t back = DescribeChain(by, source.Format(), quality).size();
    if (there == 0 || back == 0) return pair;
    pair.stepsThere = there;
    pair.stepsBack = back;
    const Frame returned = Converted(Converted(source, by, quality), source.Format(), quality);
    pair.largestDifference =
        MeasureDifference(sourceOnGround, Converted(returned, kCommonGround, quality)).largestColour;
    return pair;
}

PairTable MeasureAll(const Frame& picture, int32_t quality) {
    PairTable table(RasterFormats());
    Progress progress("pairs", static_cast<int64_t>(table.pairs.size()));
    for (size_t from = 0; from < table.formats.size(); ++from) {
        const Frame source = Converted(picture, table.formats[from], quality);
        const Frame ground = Converted(source, kCommonGround, quality);
        for (size_t by = 0; by < table.formats.size(); ++by) {
            table.At(from, by) = Measure(source, ground, table.formats[by], quality);
            progress.Advance();
        }
    }
    return table;
}

std::string PairsCSV(const PairTable& table) {
    Table text({"format", "by way of", "steps there", "steps back", "largest difference"});
    for (size_t from = 0; from < table.formats.size(); ++from)
        for (size_t by = 0; by < table.formats.size(); ++by) {
            const Pair& pair = table.At(from, by);
            text.Add({FormatName(table.formats[from]), FormatName(table.formats[by]),
                      std::to_string(pair.stepsThere), std::to_string(pair.stepsBack),
                      Formatted("%.6g", pair.largestDifference)});
        }
    return text.CSV();
}

struct Options {
    std::string output;
    std::string image;
    int32_t quality = kDefaultQuality;
};

void Declare(Words& words, Options& options) {
    words.Take("OUT", options.output, "SVG file for the picture, CSV file for the numbers").Required();
    words.Take("--image", options.image, "PNG file to send; without it, colour ramps");
    AddQuality(words, options.quality);
}

void Run(const Options& options) {
    const std::string ending = std::filesystem::path(options.output).extension().string();
    if (ending != ".svg" && ending != ".csv")
        throw Failure(kExitUsage,
                      "'" + options.output + "' must end in .svg for the picture or .csv for the numbers");
    OutputFile file(options.output);
    const Frame picture = options.image.empty() ? Ramps() : ReadPng(options.image);
    const PairTable table = MeasureAll(picture, options.quality);
    const std::string subject =
        options.image.empty() ? "colour ramps" : std::filesystem::path(options.image).filename().string();
    const std::string text = ending == ".svg" ? PairsSVG(table, subject) : PairsCSV(table);
    file.Write(text.data(), text.size());
    file.Commit();
    Print(options.output + ": " + std::to_string(table.pairs.size()) + " pairs of " +
          std::to_string(table.formats.size()) + " formats\n");
}

const Command sPairs(Group::Pictures, "pairs",
                     "Draw what a picture loses from every raster format to every other and back", Declare,
                     Run);

} // namespace
} // namespace tool
