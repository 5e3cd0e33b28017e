// pixelkiln blendsheet: two pictures by every blend mode.

#include "Blending.h"
#include "Command.h"
#include "Png.h"
#include "Sheet.h"
#include "Terminal.h"

#include <algorithm>
#include <cstring>
#include <filesystem>

namespace tool {
namespace {

/// The middle of a picture.
Frame Cropped(const Frame& picture, int32_t width, int32_t height) {
    const Frame whole = Converted(picture, PK_PixelFormat_BGRA_4444_8u, kDefaultQuality);
    Frame middle(whole.Format(), width, height);
    const int32_t left = (whole.Width() - width) / 2, above = (whole.Height() - height) / 2;
    for (int32_t row = 0; row < height; ++row)
        std::memcpy(middle.Row(row), whole.Row(above + row) + int64_t{4} * left,
                    size_t{4} * static_cast<size_t>(width));
    return middle;
}

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
    const Frame first = ReadPng(options.top), second = ReadPng(options.back);
    const int32_t width = std::min(first.Width(), second.Width());
    const int32_t height = std::min(first.Height(), second.Height());
    const Frame top = Cropped(first, width, height), back = Cropped(second, width, height);
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
