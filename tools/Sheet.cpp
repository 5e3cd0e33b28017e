#include "Sheet.h"

#include "Drawing.h"

#include <algorithm>
#include <cmath>

namespace tool {
namespace {

constexpr double kPictureSide = 256;
constexpr double kGap = 16;
constexpr double kBetweenPictures = 4;
constexpr double kLineHeight = 20;
constexpr double kHeadingHeight = 44;
constexpr int kMaximalWidth = 2000;

struct Grid {
    int columns;
    int rows;
    double tileWidth;
    double tileHeight;
    double Width() const { return kGap + columns * (tileWidth + kGap); }
    double Height() const { return kHeadingHeight + rows * (tileHeight + kGap); }
};

Grid ChooseGrid(size_t tileCount, size_t picturesInTile, int32_t columns) {
    Grid grid{};
    const auto pictures = static_cast<double>(picturesInTile);
    grid.tileWidth = pictures * kPictureSide + (pictures - 1) * kBetweenPictures;
    grid.tileHeight = kPictureSide + 2 * kLineHeight + 8;
    const auto count = static_cast<double>(tileCount);
    const double square = std::ceil(std::sqrt(count * grid.tileHeight / grid.tileWidth));
    const double fitting = std::floor((kMaximalWidth - kGap) / (grid.tileWidth + kGap));
    grid.columns = columns > 0 ? columns : static_cast<int>(std::max(1.0, std::min(square, fitting)));
    grid.rows = static_cast<int>(std::ceil(count / grid.columns));
    return grid;
}

// As large as it fits into the square of a picture, in its middle.
void DrawFitted(cairo_t* context, const Frame& picture, double x, double y) {
    const double scale = kPictureSide / std::max(picture.Width(), picture.Height());
    const double width = scale * picture.Width();
    const double height = scale * picture.Height();
    DrawPicture(context, picture, x + (kPictureSide - width) / 2, y + (kPictureSide - height) / 2, width,
                height);
}

void DrawTile(cairo_t* context, const Tile& tile, double x, double y) {
    for (size_t i = 0; i < tile.pictures.size(); ++i)
        DrawFitted(context, tile.pictures[i], x + static_cast<double>(i) * (kPictureSide + kBetweenPictures),
                   y);
    DrawText(context, tile.title, x, y + kPictureSide + kLineHeight, {.size = 15, .bold = true});
    DrawText(context, tile.caption, x, y + kPictureSide + 2 * kLineHeight, {.size = 13});
}

} // namespace

void WriteSheet(const std::vector<Tile>& tiles, const std::string& heading, const std::string& name,
                int32_t columns) {
    const Grid grid = ChooseGrid(tiles.size(), tiles.front().pictures.size(), columns);
    const auto draw = [&](cairo_t* context) {
        DrawText(context, heading, kGap, kHeadingHeight - 16, {.size = 18, .bold = true});
        for (size_t i = 0; i < tiles.size(); ++i) {
            const auto inRow = static_cast<size_t>(grid.columns);
            DrawTile(context, tiles[i], kGap + static_cast<double>(i % inRow) * (grid.tileWidth + kGap),
                     kHeadingHeight + static_cast<double>(i / inRow) * (grid.tileHeight + kGap));
        }
    };
    WritePngDrawing(static_cast<int32_t>(grid.Width()), static_cast<int32_t>(grid.Height()), draw, name);
}

} // namespace tool
