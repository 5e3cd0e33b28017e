#include "SharedWords.h"

#include <algorithm>
#include <thread>

namespace tool {
namespace {

constexpr const char* kNotes =
    R"(Files are named and read as by 'pixelkiln convert'. The work is done in the format of --from; a PNG
without it is BGRA, with 16 bits a sample as float. Directions and places are those of the picture as
one sees it, from its top left corner.
)";

void AddFormats(Words& words, PipeOptions& options) {
    AddQuality(words, options.quality);
    words.Take("--from", options.from, "Format to start from; needed for raw frames");
}

void AddFormatsOfOperation(Words& words, PipeOptions& options) {
    AddFormats(words, options);
    words.Take("--to", options.to, "Format to end in; without it, raw frames keep that of --from");
    words.Notes(kNotes);
}

} // namespace

void AddRawFrames(Words& words, PipeOptions& options) {
    words.Take("--size", options.size, "Width x height of raw input frames, such as 1920x1080");
    words.Flag("--packed", options.packed, "Rows of raw frames have no padding, in and out");
    words.Take("--matrix", options.matrix,
               "601 or 709, of Y4M, yuv420p and nv12; without it, 709 from 1280 columns or 577 rows on");
}

void AddQuality(Words& words, int32_t& quality) {
    words.Take("--quality,-q", quality, "Render quality, 0 to 5; above 1, chroma is interpolated")
        .Between(0, 5)
        .ShowDefault();
}

void AddListing(Words& words, ListOptions& options) {
    words.Flag("--csv", options.csv, "Comma-separated values");
}

void AddOutput(Words& words, PipeOptions& options) {
    words.Take("OUT", options.output, "PNG file, Y4M stream, raw frames, or -").Required();
    AddOutputForm(words, options);
}

void AddThreads(Words& words, int32_t& threads) {
    constexpr int32_t kMost = 256;
    threads = std::clamp(static_cast<int32_t>(std::thread::hardware_concurrency()), 1, kMost);
    words.Take("--threads", threads, "Threads that work at once, each on a frame")
        .Between(1, kMost)
        .ShowDefault();
}

void AddOutputForm(Words& words, PipeOptions& options) {
    words.Take("--png-depth", options.pngDepth, "Bits a sample of an output PNG, 8 or 16")
        .OneOf({8, 16})
        .ShowDefault();
    words.Flag("--quiet", options.quiet, "No summary");
}

void AddFrames(Words& words, PipeOptions& options) {
    words.Take("IN", options.input, "PNG file, Y4M stream, raw frames, or -").Required();
    AddOutput(words, options);
    AddRawFrames(words, options);
}

void AddPipe(Words& words, PipeOptions& options) {
    AddFrames(words, options);
    AddFormats(words, options);
}

void AddOperation(Words& words, PipeOptions& options) {
    AddFrames(words, options);
    AddFormatsOfOperation(words, options);
}

void AddMix(Words& words, PipeOptions& options, std::string& second) {
    words.Take("A", options.input, "PNG file, Y4M stream, raw frames, or -").Required();
    words.Take("B", second, "PNG file of the same size").Required();
    AddOutput(words, options);
    AddRawFrames(words, options);
    AddFormatsOfOperation(words, options);
}

} // namespace tool
