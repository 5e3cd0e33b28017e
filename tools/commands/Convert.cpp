// pixelkiln convert: PNG files and raw frames from one format to another.

#include "Command.h"
#include "SharedWords.h"

namespace tool {
namespace {

constexpr const char* kNotes =
    R"(A name that ends in .png is a PNG file, one that ends in .y4m a Y4M stream; all others hold raw frames,
and - stands for standard input or output, which --from y4m and --to y4m make streams. Raw frames follow each other with nothing between. Their rows are padded as in memory, or have
no padding with --packed, and the first row in the file is the first in memory: for a format that
'pixelkiln formats' lists with first row 'bottom', the bottom row of the picture.
A PNG is taken in BGRA, with 16 bits a sample as float, and --from takes it on to that format first. On
the way to a PNG the picture goes through the format of --to, so that its losses show. Profiles and
gamma notes of a PNG are not applied.

yuv420p, yuvj420p (of the full range) and nv12 are the planes that FFmpeg has by these names, without
padding. What they leave open may stand behind them, as in nv12:center:fields: chroma :left as in MPEG-2
or in the :center, progressive :frames or interlaced :fields. What is still open is as in the input, else
left, frames and the matrix of the size. A Y4M stream tells all but the matrix. It is read from planes of
4:2:0, 4:2:2 (as UYVY_422_8u) or 4:4:4 (as VUYX_4444_8u), and written with those of 4:2:0 or 4:2:2 that
the input or --to has, or else with planes of 4:4:4.

Examples:
  pixelkiln convert photo.png photo.v210 --to V210_422_10u
  pixelkiln convert photo.v210 photo.png --from V210_422_10u --size 512x512
  pixelkiln convert clip.yuv frame-%04d.png --from UYVY_422_8u --size 720x576 --packed
  ffmpeg -i clip.mp4 -f yuv4mpegpipe - | pixelkiln convert - frame-%04d.png --from y4m
)";

void Declare(Words& words, PipeOptions& options) {
    AddPipe(words, options);
    words.Take("--to", options.to, "Format to end in; needed for raw frames");
    words.Notes(kNotes);
}

void Run(const PipeOptions& options) {
    PipeFrames(options, nullptr);
}

const Command sConvert(Group::Frames, "convert", "Convert a PNG, a stream or raw frames to another format",
                       Declare, Run);

} // namespace
} // namespace tool
