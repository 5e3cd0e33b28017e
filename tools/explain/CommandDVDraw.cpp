// pixelkiln dv draw: how a frame of DV is built, in drawings for docs/dv.md.

#include "Command.h"
#include "DVDrawings.h"
#include "Failure.h"

#include <filesystem>

namespace tool {
namespace {

struct Options {
    std::string folder;
};

void Declare(Words& words, Options& options) {
    words.Take("OUTDIR", options.folder, "Folder for the drawings, made if it is missing").Required();
}

void Run(const Options& options) {
    const std::filesystem::path folder(options.folder);
    std::error_code error;
    std::filesystem::create_directories(folder, error);
    if (error) ThrowFileFailure("cannot make the folder '" + options.folder + "'", error.value());
    DrawDVSequence((folder / "dv-sequence.png").string());
    DrawDVPlacement((folder / "dv-placement.png").string());
    DrawDVPasses((folder / "dv-passes.png").string());
}

const Command sDVDraw(Group::Frames, "dv draw", "Draw how a frame of DV is built", Declare, Run);

} // namespace
} // namespace tool
