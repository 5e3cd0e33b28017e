#include "Pictures.h"

#include "Library.h"
#include "Rules.h"
#include "Scenes.h"
#include "Way.h"

#include "Drawing.h"

#include <algorithm>

namespace ChromaBench {
namespace {

constexpr int32_t kGap = 8, kHeading = 28;

/// A part of a picture, each pixel so many times as large.
tool::Frame Enlarged(const tool::Frame& picture, int32_t left, int32_t top, int32_t width, int32_t height,
                     int32_t times) {
    tool::Frame enlarged(PK_PixelFormat_BGRA_4444_8u, width * times, height * times);
    for (int32_t y = 0; y < enlarged.Height(); ++y)
        for (int32_t x = 0; x < enlarged.Width(); ++x)
            std::copy_n(picture.Row(top + y / times) + 4 * (left + x / times), 4, enlarged.Row(y) + 4 * x);
    return enlarged;
}

tool::Frame GreyOf(const Plane& plane) {
    tool::Frame grey(PK_PixelFormat_BGRA_4444_8u, plane.width, plane.height);
    for (int32_t y = 0; y < plane.height; ++y)
        for (int32_t x = 0; x < plane.width; ++x) {
            std::fill_n(grey.Row(y) + 4 * x, 3, plane.Row(y)[x]);
            grey.Row(y)[4 * x + 3] = 255;
        }
    return grey;
}

/// Columns with headings, all cells of a row of one size.
class Grid {
public:
    using Cells = std::vector<tool::Frame>;

    void AddColumn(const std::string& heading, Cells cells) {
        fHeadings.push_back(heading);
        fColumns.push_back(std::move(cells));
    }

    /// \param rows  what stands on the left of each.
    void Write(const std::vector<std::string>& rows, int32_t left, const std::string& name) const {
        const auto draw = [&](cairo_t* context) {
            double x = left;
            for (size_t column = 0; column < fColumns.size(); ++column) {
                tool::DrawText(context, fHeadings[column], x, kHeading - 10, {.size = 13, .bold = true});
                double y = kHeading;
                for (size_t row = 0; row < rows.size(); ++row) {
                    const tool::Frame& cell = fColumns[column][row];
                    if (column == 0)
                        tool::DrawText(context, rows[row], kGap, y + cell.Height() / 2.0, {.size = 13});
                    tool::DrawPicture(context, cell, x, y, cell.Width(), cell.Height());
                    y += cell.Height() + kGap;
                }
                x += fColumns[column][0].Width() + kGap;
            }
        };
        int32_t width = left, height = kHeading;
        for (const Cells& column : fColumns) width += column[0].Width() + kGap;
        for (const tool::Frame& cell : fColumns[0]) height += cell.Height() + kGap;
        tool::WritePngDrawing(width, height, draw, name);
    }

private:
    std::vector<std::string> fHeadings;
    std::vector<Cells> fColumns;
};

/// Of a chart all, or of the disc a part of its edge.
void AddChart(const Video& pixels, bool isDisc, Grid::Cells& cells) {
    const tool::Frame grey = GreyOf(pixels.u);
    cells.push_back(isDisc ? Enlarged(grey, 24, 24, kSide / 5, kSide / 5, 5)
                           : Enlarged(grey, 0, 0, kSide, kSide, 1));
}

/// The lines of the first field, each twice.
tool::Frame FirstField(const tool::Frame& frame) {
    tool::Frame field(frame.Format(), frame.Width(), frame.Height());
    for (int32_t y = 0; y < frame.Height(); ++y)
        std::copy_n(frame.Row(y / 2 * 2), 4 * frame.Width(), field.Row(y));
    return field;
}

Grid::Cells CellsOf(const Video& pixels) {
    constexpr int32_t kTimes = 3, kDetail = 32;
    const tool::Frame rgb = ToRGB(pixels);
    Grid::Cells cells;
    cells.push_back(Enlarged(rgb, 0, 0, kMovingWidth, kMovingHeight, kTimes));
    cells.push_back(Enlarged(FirstField(rgb), 0, 0, kMovingWidth, kMovingHeight, kTimes));
    cells.push_back(
        Enlarged(rgb, kMovingWidth - kDetail, 0, kDetail, kDetail / 2, kTimes * kMovingWidth / kDetail));
    return cells;
}

} // namespace

void DrawCharts(const std::string& name) {
    constexpr Kind kKinds[] = {kLeft, kCentred, kFields};
    Grid grid;
    const auto add = [&](const std::string& heading, auto change) {
        Grid::Cells cells;
        for (const bool isDisc : {false, true})
            for (const Kind& kind : kKinds) {
                const Scene scene = isDisc ? Disc() : ZonePlate(kind);
                AddChart(change(PixelsOf(scene, kSide, kSide, kind), kind), isDisc, cells);
            }
        grid.AddColumn(heading, std::move(cells));
    };
    add("exact", [](const Video& pixels, const Kind&) { return pixels; });
    for (const Way& way : AllWays())
        if (way.isShown)
            add(way.name, [&](const Video& pixels, const Kind& kind) {
                return way.decode(way.encode(pixels, kind), kind);
            });
    grid.Write({"left", "centred", "fields", "left", "centred", "fields"}, 64, name);
}

void DrawRules(const std::string& name) {
    Grid grid;
    grid.AddColumn("exact", CellsOf(PixelsOf(MovingDisc, kMovingWidth, kMovingHeight, kFields)));
    const Video planes = PlanesOf(MovingDisc, kMovingWidth, kMovingHeight, kFields);
    for (const Rule& rule : AllRules()) grid.AddColumn(rule.name, CellsOf(rule.decode(planes)));
    grid.Write({"frame", "field", "bars"}, 56, name);
}

} // namespace ChromaBench
