// pixelkiln stamp: a number burnt into every frame.

#include "Command.h"
#include "Numbers.h"
#include "Operations.h"
#include "SharedWords.h"

namespace tool {
namespace {

struct Options : PipeOptions {
    Stamp stamp;
    std::string at = "0.02,0.02";
};

void Declare(Words& words, Options& options) {
    AddOperation(words, options);
    words.Take("--number", options.stamp.number, "Number of the first frame").Required();
    words.Flag("--hex", options.stamp.hex, "Hexadecimal digits");
    words.Take("--digit", options.stamp.digit, "Width of a digit, as a fraction of the width")
        .Between(0.0, 1.0)
        .ShowDefault();
    words.Take("--at", options.at, "X,Y of the top left corner, as fractions of width and height")
        .ShowDefault();
}

void Run(const Options& options) {
    const std::vector<double> at = ParseNumbers(options.at, 2, "a place X,Y");
    Stamp stamp = options.stamp;
    stamp.at = {static_cast<float>(at[0]), static_cast<float>(at[1])};
    const auto burn = [&](Frame& frame) {
        Burn(frame, stamp);
        // Each frame counts on, from the greatest number to the least.
        stamp.number = static_cast<int32_t>(static_cast<uint32_t>(stamp.number) + 1);
    };
    PipeFramesInTheirFormat(options, OnCopy(burn));
}

const Command sStamp(Group::Operations, "stamp", "Burn a number into frames, counting up from frame to frame",
                     Declare, Run);

} // namespace

void Burn(Frame& frame, const Stamp& stamp) {
    const PK_Result result = PK_PrintNum(frame.Pixels(), frame.RowBytes(), frame.Format(), frame.Width(),
                                         frame.Height(), stamp.number, stamp.digit, stamp.at, !stamp.hex);
    Require(result, "stamp", frame);
}

} // namespace tool
