// pixelkiln dv merge: two raw files of DV to one, a field of each.

#include "Command.h"
#include "DVFile.h"
#include "Failure.h"
#include "Formats.h"
#include "Frame.h"
#include "FramesInOrder.h"
#include "OutputFile.h"
#include "SharedWords.h"
#include "Terminal.h"

namespace tool {
namespace {

struct Options {
    std::string first, second, output, from;
    int32_t quality = kDefaultQuality;
    int32_t threads = 1;
    bool quiet = false;
};

constexpr const char* kNotes =
    R"(Frame by frame, both files are decoded, and what comes out of their joined fields is encoded. Of DV25 and
DV50 it has rows 1, 3, 5 ... of A and rows 0, 2, 4 ... of B, and of DV100 the other way round. What A says
of the shape of the picture goes on; audio and time code do not.

Example:
  pixelkiln dv merge first.dv second.dv merged.dv
)";

void Declare(Words& words, Options& options) {
    words.Take("A", options.first, "Raw file of DV, or -").Required();
    words.Take("B", options.second, "Raw file of DV of the same format and length").Required();
    words.Take("OUT", options.output, "Raw file of DV, or -").Required();
    words.Take("--from", options.from,
               "Format of both, such as PALDV25, where their first frames do not tell");
    AddQuality(words, options.quality);
    AddThreads(words, options.threads);
    words.Flag("--quiet", options.quiet, "No summary");
    words.Notes(kNotes);
}

using Bytes = std::vector<uint8_t>;

struct Pair {
    Bytes first, second;
};

std::optional<Pair> NextPair(DVFile& first, DVFile& second) {
    std::optional<Bytes> a = first.Next(), b = second.Next();
    if (a.has_value() != b.has_value())
        throw Failure(kExitFile, "'" + (a ? second : first).Name() + "' has fewer frames than '" +
                                     (a ? first : second).Name() + "'; both must have as many");
    if (!a) return std::nullopt;
    return Pair{std::move(*a), std::move(*b)};
}

Bytes Merged(const DVKind& kind, const Pair& pair, int32_t quality) {
    Bytes frame(static_cast<size_t>(kind.Bytes()));
    const PK_Result result =
        PK_MergeDVCPRO(pair.first.data(), pair.second.data(), frame.data(), kind.format, quality);
    if (result != PK_Success)
        throw Failure(kExitFailed, "cannot merge frames of " + FormatName(kind.format) + ": " +
                                       ResultText(result) + " (result " + std::to_string(result) + ")");
    return frame;
}

void Run(const Options& options) {
    DVFile first(options.first, options.from), second(options.second, options.from);
    const DVKind& kind = first.Kind();
    if (&second.Kind() != &kind)
        throw Failure(kExitFailed, "'" + first.Name() + "' is " + FormatName(kind.format) + " and '" +
                                       second.Name() + "' is " + FormatName(second.Kind().format) +
                                       "; both must be of one format");
    OutputFile output(options.output);
    Progress progress("frames", first.FrameCount());
    int64_t count = 0;
    RunInOrder(
        options.threads, [&] { return NextPair(first, second); },
        [&](const Pair& pair) { return Merged(kind, pair, options.quality); },
        [&](const Bytes& frame) {
            output.Write(frame.data(), frame.size());
            ++count;
            progress.Advance();
        });
    output.Commit();
    if (options.quiet || options.output == "-") return;
    Print(options.first + " and " + options.second + " -> " + options.output + ": " + std::to_string(count) +
          (count == 1 ? " frame of " : " frames of ") + DVKindText(kind) + "\n");
}

const Command sDVMerge(Group::Frames, "dv merge", "Make one raw file of DV of two, a field of each", Declare,
                       Run);

} // namespace
} // namespace tool
