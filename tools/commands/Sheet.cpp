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
    std::string heading = "Contact sheet";
    int32_t columns = 0;
};

void Declare(Words& words, Options& options) {
    words.Take("OUT", options.output, "PNG file to write").Required();
    words.Take("IMAGE", options.images, "PNG files").Required();
    words.Take("--heading", options.heading, "Above them").ShowDefault();
    words.Take("--columns", options.columns, "Side by side; without it, as near to a square as they come")
        .Between(1, 100);
}

void Run(const Options& options) {
    std::vector<Tile> tiles;
    for (const std::string& image : options.images) {
        const Frame picture = ReadPng(image);
        tiles.emplace_back(std::filesystem::path(image).filename().string(),
                           std::to_string(picture.Width()) + " x " + std::to_string(picture.Height()),
                           Converted(picture, PK_PixelFormat_BGRA_4444_8u, kDefaultQuality));
    }
    WriteSheet(tiles, options.heading, options.output, options.columns);
    Print(options.output + ": " + std::to_string(tiles.size()) +
          (tiles.size() == 1 ? " picture\n" : " pictures\n"));
}

const Command sSheet(Group::Pictures, "sheet", "Draw pictures side by side", Declare, Run);

} // namespace
} // namespace tool
