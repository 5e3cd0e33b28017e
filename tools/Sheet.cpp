#include "Sheet.h"

#include "Failure.h"
#include "OutputFile.h"
#include "Png.h"

#include <algorithm>
#include <cairo.h>
#include <cmath>
#include <memory>

namespace tool {
namespace {

constexpr double kPictureSide = 256;
constexpr double kGap = 16;
constexpr double kBetweenPictures = 4;
constexpr double kLineHeight = 20;
constexpr double kHeadingHeight = 44;
constexpr int kMaximalWidth = 2000;

struct DestroyCairo {
    void operator()(cairo_surface_t* surface) const { cairo_surface_destroy(surface); }
    void operator()(cairo_t* context) const { cairo_destroy(context); }
};
using Surface = std::unique_ptr<cairo_surface_t, DestroyCairo>;
using Context = std::unique_ptr<cairo_t, DestroyCairo>;

struct Grid {
    int columns;
    int rows;
    double tileWidth;
    double tileHeight;
    double Width() const { return kGap + columns * (tileWidth + kGap); }
    double Height() const { return kHeadingHeight + rows * (tileHeight + kGap); }
};

// As near to a square as the words allow, and no wider than a screen.
Grid ChooseGrid(size_t tileCount, size_t picturesInTile) {
    Grid grid{};
    const auto pictures = static_cast<double>(picturesInTile);
    grid.tileWidth = pictures * kPictureSide + (pictures - 1) * kBetweenPictures;
    grid.tileHeight = kPictureSide + 2 * kLineHeight + 8;
    const auto count = static_cast<double>(tileCount);
    const double square = std::ceil(std::sqrt(count * grid.tileHeight / grid.tileWidth));
    const double fitting = std::floor((kMaximalWidth - kGap) / (grid.tileWidth + kGap));
    grid.columns = static_cast<int>(std::max(1.0, std::min(square, fitting)));
    grid.rows = static_cast<int>(std::ceil(count / grid.columns));
    return grid;
}

Surface SurfaceOver(Frame& frame, cairo_format_t format) {
    return Surface(cairo_image_surface_create_for_data(frame.Pixels(), format, frame.Width(), frame.Height(),
                                                       frame.RowBytes()));
}

// Between the rows of cairo, from the top, and those of the four-channel formats, from the bottom.
void Flip(Frame& frame) {
    PK_FlipInPlace(frame.Pixels(), frame.RowBytes(), frame.Width(), frame.Height(), frame.Format());
}

void DrawPicture(cairo_t* context, const Frame& picture, double x, double y) {
    Frame premultiplied = Converted(picture, PK_PixelFormat_BGRP_4444_8u, kDefaultQuality);
    Flip(premultiplied);
    const Surface surface = SurfaceOver(premultiplied, CAIRO_FORMAT_ARGB32);
    const double scale = kPictureSide / std::max(picture.Width(), picture.Height());
    cairo_save(context);
    cairo_translate(context, x + (kPictureSide - scale * picture.Width()) / 2,
                    y + (kPictureSide - scale * picture.Height()) / 2);
    cairo_scale(context, scale, scale);
    cairo_set_source_surface(context, surface.get(), 0, 0);
    cairo_pattern_set_filter(cairo_get_source(context), CAIRO_FILTER_GOOD);
    cairo_pattern_set_extend(cairo_get_source(context), CAIRO_EXTEND_PAD);
    cairo_rectangle(context, 0, 0, picture.Width(), picture.Height());
    cairo_fill(context);
    cairo_restore(context);
}

void DrawText(cairo_t* context, const std::string& text, double x, double baseline, double size, bool bold) {
    cairo_select_font_face(context, "sans-serif", CAIRO_FONT_SLANT_NORMAL,
                           bold ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL);
    cairo_set_font_size(context, size);
    cairo_set_source_rgb(context, 0.12, 0.13, 0.15);
    cairo_move_to(context, x, baseline);
    cairo_show_text(context, text.c_str());
}

void DrawTile(cairo_t* context, const Tile& tile, double x, double y) {
    for (size_t i = 0; i < tile.pictures.size(); ++i)
        DrawPicture(context, tile.pictures[i], x + static_cast<double>(i) * (kPictureSide + kBetweenPictures),
                    y);
    DrawText(context, tile.title, x, y + kPictureSide + kLineHeight, 15, true);
    DrawText(context, tile.caption, x, y + kPictureSide + 2 * kLineHeight, 13, false);
}

} // namespace

void WriteSheet(const std::vector<Tile>& tiles, const std::string& heading, const std::string& name) {
    OutputFile file(name);
    const Grid grid = ChooseGrid(tiles.size(), tiles.front().pictures.size());
    Frame sheet(PK_PixelFormat_BGRX_4444_8u, static_cast<int32_t>(grid.Width()),
                static_cast<int32_t>(grid.Height()));
    {
        const Surface surface = SurfaceOver(sheet, CAIRO_FORMAT_RGB24);
        const Context context(cairo_create(surface.get()));
        cairo_set_source_rgb(context.get(), 0.96, 0.96, 0.95);
        cairo_paint(context.get());
        DrawText(context.get(), heading, kGap, kHeadingHeight - 16, 18, true);
        for (size_t i = 0; i < tiles.size(); ++i) {
            const auto columns = static_cast<size_t>(grid.columns);
            DrawTile(context.get(), tiles[i],
                     kGap + static_cast<double>(i % columns) * (grid.tileWidth + kGap),
                     kHeadingHeight + static_cast<double>(i / columns) * (grid.tileHeight + kGap));
        }
        if (cairo_status(context.get()) != CAIRO_STATUS_SUCCESS)
            throw Failure(kExitFailed, std::string("cannot draw the sheet: ") +
                                           cairo_status_to_string(cairo_status(context.get())));
    }
    Flip(sheet);
    WritePng(Converted(sheet, PK_PixelFormat_BGRA_4444_8u, kDefaultQuality), file);
    file.Commit();
}

} // namespace tool
