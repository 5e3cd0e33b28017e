// pixelkiln accumulate: pictures added up, each with a weight.

#include "Command.h"
#include "Failure.h"
#include "Numbers.h"
#include "Operations.h"
#include "Png.h"
#include "SharedWords.h"

namespace tool {
namespace {

struct Options : PipeOptions {
    std::vector<std::string> files; // the last is the output
    std::string weights;
};

constexpr const char* kNotes =
    R"(Colours are added premultiplied, and at the default quality, 5, as linear light: what one would see of
pictures shown in quick succession. At a lower quality the codes of the samples are added.

Weights need not add up to 1; but a sum with alpha of its own, as in a PNG without --to, is divided by that
alpha in the end. A weight that is 0 or less leaves its picture out.

Examples:
  pixelkiln accumulate shot-1.png shot-2.png shot-3.png mean.png
  pixelkiln accumulate day.png night.png dusk.png --weights 0.25,0.75 --quality 4
  pixelkiln accumulate a.png b.png sum.raw --to BGRA_4444_32f --weights 1,1
)";

void Declare(Words& words, Options& options) {
    words.Take("FILE", options.files, "PNG files of one size, then the output: PNG file, raw frame, or -")
        .Required();
    AddOutputForm(words, options);
    AddQuality(words, options.quality);
    words.Take("--weights", options.weights,
               "A number for each picture with commas between; without it, that of the mean");
    words.Take("--to", options.to, "Format of the sum; needed for a raw frame");
    words.Flag("--packed", options.packed, "Rows of a raw frame have no padding");
    words.Notes(kNotes);
}

void RequireOneSize(const std::vector<Frame>& pictures, const std::vector<std::string>& names) {
    for (size_t i = 1; i < pictures.size(); ++i)
        if (SizeText(pictures[i]) != SizeText(pictures[0]))
            throw Failure(kExitFailed, "the pictures differ in size: '" + names[0] + "' has " +
                                           SizeText(pictures[0]) + " and '" + names[i] + "' has " +
                                           SizeText(pictures[i]));
}

void Run(const Options& given) {
    Options options = given;
    options.output = options.files.back();
    options.files.pop_back();
    const size_t count = options.files.size();
    if (count == 0) throw Failure(kExitUsage, "name the pictures to add up, and then the output");
    const std::vector<double> weights =
        options.weights.empty() ? std::vector<double>(count, 1.0 / static_cast<double>(count))
                                : ParseNumbers(options.weights, count, "a weight for each picture");
    std::vector<Frame> pictures;
    for (const std::string& file : options.files) pictures.push_back(ReadPng(file));
    RequireOneSize(pictures, options.files);
    options.size = SizeText(pictures[0]);
    WriteMadeFrame(options, [&](Frame& sum) { AddUp(pictures, weights, options.quality, sum); });
}

const Command sAccumulate(Group::Operations, "accumulate", "Add up pictures, each with a weight", Declare,
                          Run);

} // namespace

void AddUp(const std::vector<Frame>& pictures, const std::vector<double>& weights, int32_t quality,
           Frame& sum) {
    std::vector<const void*> pixels;
    std::vector<int32_t> rowBytes;
    std::vector<PK_PixelFormat> formats;
    for (const Frame& picture : pictures) {
        pixels.push_back(picture.Pixels());
        rowBytes.push_back(picture.RowBytes());
        formats.push_back(picture.Format());
    }
    const PK_Result result = PK_Accumulate(pixels.data(), rowBytes.data(), formats.data(), weights.data(),
                                           static_cast<int32_t>(pictures.size()), sum.Pixels(),
                                           sum.RowBytes(), sum.Format(), sum.Width(), sum.Height(), quality);
    Require(result, "add up pictures to", sum);
}

} // namespace tool
