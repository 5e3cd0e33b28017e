// pixelkiln sheet: pictures side by side in one.

#include "Sheet.h"

#include "Command.h"
#include "Png.h"
#include "Terminal.h"

#include <filesystem>

namespace tool {
namespace {

struct Options {
    std::string output;
    std::vector<std::string> images;
};

void Declare(Words& words, Options& options) {
    words.Take("OUT", options.output, "PNG file to write").Required();
    words.Take("IMAGE", options.images, "PNG files").Required();
}

void Run(const Options& options) {
    std::vector<Tile> tiles;
    for (const std::string& image : options.images) {
        const Frame picture = ReadPng(image);
        tiles.emplace_back(std::filesystem::path(image).filename().string(),
                           std::to_string(picture.Width()) + " x " + std::to_string(picture.Height()),
                           Converted(picture, PK_PixelFormat_BGRA_4444_8u, kDefaultQuality));
    }
    WriteSheet(tiles, "Contact sheet", options.output);
    Print(options.output + ": " + std::to_string(tiles.size()) +
          (tiles.size() == 1 ? " picture\n" : " pictures\n"));
}

const Command sSheet(Group::Pictures, "sheet", "Draw pictures side by side", Declare, Run);

} // namespace
} // namespace tool
