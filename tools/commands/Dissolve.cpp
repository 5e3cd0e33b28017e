// pixelkiln dissolve: two pictures mixed by a ratio.

#include "Command.h"
#include "Failure.h"
#include "Operations.h"
#include "Png.h"
#include "SharedWords.h"

namespace tool {
namespace {

struct Options : PipeOptions {
    std::string second;
    float ratio = 0;
};

void Declare(Words& words, Options& options) {
    AddMix(words, options, options.second);
    words.Take("--ratio", options.ratio, "How far on the way from A to B, 0 to 1")
        .Required()
        .Between(0.0, 1.0);
}

void Run(const Options& options) {
    const Frame second = ReadPng(options.second);
    PipeFramesInTheirFormat(options, [&](const Frame& frame) {
        return Dissolved(frame, second, options.ratio, options.quality);
    });
}

const Command sDissolve(Group::Operations, "dissolve", "Mix frames with a picture", Declare, Run);

} // namespace

Frame Dissolved(const Frame& first, const Frame& second, float ratio, int32_t quality) {
    if (first.Width() != second.Width() || first.Height() != second.Height())
        throw Failure(kExitFailed, "the pictures differ in size: one has " + SizeText(first) +
                                       " and the other has " + SizeText(second));
    Frame mixed(first.Format(), first.Width(), first.Height());
    const PK_Result result = PK_CrossDissolve(
        first.Pixels(), first.RowBytes(), first.Format(), second.Pixels(), second.RowBytes(), second.Format(),
        mixed.Pixels(), mixed.RowBytes(), mixed.Format(), mixed.Width(), mixed.Height(), ratio, quality);
    Require(result, "dissolve", first);
    return mixed;
}

} // namespace tool
