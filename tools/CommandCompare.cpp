// pixelkiln compare: how far two pictures are apart.

#include "Commands.h"
#include "Difference.h"
#include "Failure.h"
#include "Png.h"
#include "Terminal.h"

#include <algorithm>
#include <cstdio>

namespace tool {
namespace {

std::string SizeText(const Frame& picture) {
    return std::to_string(picture.Width()) + "x" + std::to_string(picture.Height());
}

std::string StepsText(double steps) {
    char text[32];
    std::snprintf(text, sizeof(text), "%.4g", steps);
    return text;
}

} // namespace

void RunCompare(const CompareOptions& options) {
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

} // namespace tool
