// pixelkiln explain: the chain of kernels between two formats.

#include "Chains.h"
#include "Command.h"
#include "Failure.h"
#include "Formats.h"
#include "SharedWords.h"
#include "Terminal.h"

namespace tool {
namespace {

struct Options {
    std::string source;
    std::string destination;
    int32_t quality = kDefaultQuality;
};

void Declare(Words& words, Options& options) {
    words.Take("SRC", options.source, "Format to start from").Required();
    words.Take("DST", options.destination, "Format to end in").Required();
    AddQuality(words, options.quality);
}

void Run(const Options& options) {
    const PK_PixelFormat source = ParseFormat(options.source);
    const PK_PixelFormat destination = ParseFormat(options.destination);
    for (const PK_PixelFormat format : {source, destination})
        if (!IsRaster(format))
            throw Failure(kExitFailed, FormatName(format) +
                                           " is a stream: it is decoded or encoded as a whole "
                                           "and no chain of row kernels leads through it");
    const std::vector<ChainStep> steps = DescribeChain(source, destination, options.quality);
    if (steps.empty())
        throw Failure(kExitFailed, "no chain of kernels leads from " + FormatName(source) + " to " +
                                       FormatName(destination));

    Table table({"step", "kernel", "body", "leaves", "pass"});
    int step = 0;
    for (const ChainStep& each : steps)
        table.Add({std::to_string(++step), each.kernel, each.body, FormatName(each.leaves),
                   std::to_string(each.pass)});
    const int passes = steps.back().pass;
    Print(FormatName(source) + " to " + FormatName(destination) + " at quality " +
          std::to_string(options.quality) + ": " + std::to_string(steps.size()) +
          (steps.size() == 1 ? " step" : " steps") + " in " + std::to_string(passes) +
          (passes == 1 ? " pass" : " passes") + " over the row\n" + table.Aligned());
}

const Command sExplain(Group::Listings, "explain", "Show the chain of kernels between two formats", Declare,
                       Run);

} // namespace
} // namespace tool
