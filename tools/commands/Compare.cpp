// pixelkiln compare: how far two pictures are apart.

#include "Command.h"
#include "Difference.h"
#include "Failure.h"
#include "Numbers.h"
#include "Png.h"
#include "Terminal.h"

#include <algorithm>
#include <optional>

namespace tool {
namespace {

std::string StepsText(double steps) {
    return Formatted("%.4g", steps);
}

struct Options {
    std::string first;
    std::string second;
    std::optional<double> limit; // steps of 8 bits
};

void Declare(Words& words, Options& options) {
    words.Take("A", options.first, "PNG file").Required();
    words.Take("B", options.second, "PNG file").Required();
    words.Take("--limit", options.limit, "Fail if any sample differs by more, in steps of 1/255")
        .NotNegative();
}

void Run(const Options& options) {
    Frame first = ReadPng(options.first);
    Frame second = ReadPng(options.second);
    if (first.Width() != second.Width() || first.Height() != second.Height())
        throw Failure(kExitFailed, "the pictures differ in size: '" + options.first + "' has " +
                                       SizeText(first) + " and '" + options.second + "' has " +
                                       SizeText(second));
    // One of them may have 16 bits a sample.
    if (first.Format() != second.Format()) {
        Frame& narrow = first.Format() == PK_PixelFormat_BGRA_4444_8u ? first : second;
        narrow = Converted(narrow, PK_PixelFormat_BGRA_4444_32f, kDefaultQuality);
    }
    const Difference difference = MeasureDifference(first, second);
    const int64_t pixels = int64_t{first.Width()} * first.Height();
    Print("size                " + SizeText(first) + "\nPSNR                " + PsnrText(difference.psnr) +
          "\nlargest difference  " + StepsText(difference.largestColour) + " of 255" +
          "\n  in alpha          " + StepsText(difference.largestAlpha) + " of 255\ndiffering pixels    " +
          std::to_string(difference.differingPixels) + " of " + std::to_string(pixels) +
          (difference.differingPixels == 0 ? ", identical\n" : "\n"));
    const double largest = std::max(difference.largestColour, difference.largestAlpha);
    if (options.limit && !(largest <= *options.limit)) // a limit that is no number is never kept
        throw Failure(kExitFailed, "the largest difference is " + StepsText(largest) +
                                       ", above the limit of " + StepsText(*options.limit));
}

const Command sCompare(Group::Pictures, "compare", "Tell how far two PNG files are apart", Declare, Run);

} // namespace
} // namespace tool
