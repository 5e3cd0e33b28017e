// pixelkiln blendsheet: two pictures by every blend mode.

#include "Blending.h"
#include "Centring.h"
#include "Command.h"
#include "Png.h"
#include "Sheet.h"
#include "Terminal.h"

#include <algorithm>
#include <filesystem>

namespace tool {
namespace {

struct Options {
    std::string top, back, output;
};

void Declare(Words& words, Options& options) {
    words.Take("TOP", options.top, "PNG file").Required();
    words.Take("BACK", options.back, "PNG file").Required();
    words.Take("OUT", options.output, "PNG file to write").Required();
}

std::string FileName(const std::string& path) {
    return std::filesystem::path(path).filename().string();
}

void Run(const Options& options) {
    const Frame first = Converted(ReadPng(options.top), PK_PixelFormat_BGRA_4444_8u, kDefaultQuality);
    const Frame second = Converted(ReadPng(options.back), PK_PixelFormat_BGRA_4444_8u, kDefaultQuality);
    const int32_t width = std::min(first.Width(), second.Width());
    const int32_t height = std::min(first.Height(), second.Height());
    const Frame top = Centred(first, width, height), back = Centred(second, width, height);
    std::vector<Tile> tiles;
    tiles.emplace_back("the top", FileName(options.top), Copied(top));
    tiles.emplace_back("the back", FileName(options.back), Copied(back));
    for (PK_BlendMode mode = 0; const char* const name : ModeNames()) {
        const Blend blend = {mode,
                             mode == PK_BlendMode_Normal || mode == PK_BlendMode_Dissolve ? 0.5F : 1.0F};
        tiles.emplace_back(name, blend.opacity < 1 ? "at half its opacity" : "", Blended(top, back, blend));
        ++mode;
    }
    WriteSheet(tiles, FileName(options.top) + " over " + FileName(options.back) + " by every blend mode",
               options.output);
    Print(options.output + ": " + std::to_string(ModeNames().size()) + " modes\n");
}

const Command sBlendSheet(Group::Pictures, "blendsheet", "Draw two pictures by every blend mode", Declare,
                          Run);

} // namespace
} // namespace tool
