// pixelkiln sheet: pictures side by side in one.

#include "Commands.h"
#include "Png.h"
#include "Sheet.h"
#include "Terminal.h"

#include <filesystem>

namespace tool {

void RunSheet(const SheetOptions& options) {
    std::vector<Tile> tiles;
    for (const std::string& image : options.images) {
        Tile tile;
        const Frame picture = ReadPng(image);
        tile.title = std::filesystem::path(image).filename().string();
        tile.caption = std::to_string(picture.Width()) + " x " + std::to_string(picture.Height());
        tile.pictures.push_back(Converted(picture, PK_PixelFormat_BGRA_4444_8u, kDefaultQuality));
        tiles.push_back(std::move(tile));
    }
    WriteSheet(tiles, "Contact sheet", options.output);
    Print(options.output + ": " + std::to_string(tiles.size()) +
          (tiles.size() == 1 ? " picture\n" : " pictures\n"));
}

} // namespace tool
