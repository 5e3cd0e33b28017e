#include "Reductions.h"

#include "Charts.h"
#include "LargePictures.h"
#include "Reducer.h"

#include "Drawing.h"
#include "Numbers.h"
#include "frames/Timing.h"

#include <algorithm>
#include <cstdio>

namespace Scaling {
namespace {

constexpr int kRounds = 3;
constexpr int32_t kCell = 160, kGap = 8, kHeading = 30, kCaption = 20, kColumns = 7;

/// A square part of a half picture, as many times as large.
struct Part {
    int32_t left, top, times;
};
constexpr Part kPartOfPlates = {3 * kSide, 3 * kSide / 2, 1}; // one of them
constexpr Part kPartOfPhotographs = {718, 16, 2};             // a cat's eye, and its fur

/// Opaque, as not all ways scale alpha.
tool::Frame Cut(const tool::Frame& half, const Part& part) {
    tool::Frame cell(kPixels, kCell, kCell);
    for (int32_t y = 0; y < kCell; ++y)
        for (int32_t x = 0; x < kCell; ++x) {
            std::copy_n(half.Row(part.top + y / part.times) + 4 * (part.left + x / part.times), 3,
                        cell.Row(y) + 4 * x);
            cell.Row(y)[4 * x + 3] = 255;
        }
    return cell;
}

/// What is reduced, and what should become of it.
struct Case {
    Case(tool::Frame thePicture, const Part& thePart)
        : picture(std::move(thePicture)), part(thePart), ofCodes(IdealHalf(picture, false)),
          ofLight(IdealHalf(picture, true)) {}

    tool::Frame picture;
    Part part;
    Ideal ofCodes, ofLight;
};

struct Cells {
    std::string name;
    tool::Frame plates, photographs;
};
struct Group {
    const char* name;
    std::vector<Cells> cells;
};

struct Format {
    PK_PixelFormat format;
    const char* name;
};
constexpr Format kFormats[] = {{kPixels, "BGRA 8u"}, {kPairs, "UYVY 8u"}, {kPlanes, "planar 4:2:0"}};

std::vector<Reducer> ReducersOf(PK_PixelFormat format) {
    std::vector<Reducer> reducers;
    std::ranges::copy_if(AllReducers(), std::back_inserter(reducers),
                         [=](const Reducer& reducer) { return reducer.from == format; });
    return reducers;
}

std::vector<Reduction> PrepareAll(const std::vector<Reducer>& reducers, const tool::Frame& source) {
    std::vector<Reduction> reductions;
    for (const Reducer& reducer : reducers) reductions.push_back(reducer.prepare(source));
    return reductions;
}

void Finish(const Reduction& reduction) {
    if (reduction.finish) reduction.finish();
}

std::string Row(const Reduction& ofPhotographs, const Case& photographs, const Reduction& ofPlates,
                const Case& plates) {
    return tool::Formatted(
        "%.2f | %.2f | %.2f | %.2f", SignalToNoise(*ofPhotographs.result, photographs.ofCodes),
        SignalToNoise(*ofPhotographs.result, photographs.ofLight),
        SignalToNoise(*ofPlates.result, plates.ofCodes), SignalToNoise(*ofPlates.result, plates.ofLight));
}

/// Prints a table, and gives back what is shown.
Group Measure(const Format& format, const Case& photographs, const Case& plates) {
    const std::vector<Reducer> reducers = ReducersOf(format.format);
    const tool::Frame photographSource =
        tool::Converted(photographs.picture, format.format, tool::kDefaultQuality);
    const tool::Frame plateSource = tool::Converted(plates.picture, format.format, tool::kDefaultQuality);
    const std::vector<Reduction> ofPhotographs = PrepareAll(reducers, photographSource);
    std::vector<std::function<void()>> runs;
    for (const Reduction& reduction : ofPhotographs) runs.push_back(reduction.run);
    const std::vector<double> seconds = FrameBench::MeasureInTurns(runs, kRounds);

    std::printf("\n### 3840 x 2160 to 1920 x 1080, from %s\n\n"
                "| | ms | Photographs, dB | of light, dB | Plates, dB | of light, dB |\n"
                "|---|--:|--:|--:|--:|--:|\n",
                format.name);
    Group group = {format.name, {}};
    for (size_t i = 0; i < reducers.size(); ++i) {
        const Reduction ofPlates = reducers[i].prepare(plateSource);
        ofPlates.run();
        Finish(ofPlates);
        Finish(ofPhotographs[i]);
        std::printf("| %s | %.1f | %s |\n", reducers[i].name, seconds[i] * 1e3,
                    Row(ofPhotographs[i], photographs, ofPlates, plates).c_str());
        if (reducers[i].isShown)
            group.cells.push_back({reducers[i].name, Cut(*ofPlates.result, plates.part),
                                   Cut(*ofPhotographs[i].result, photographs.part)});
    }
    return group;
}

int32_t LinesOf(const Group& group) {
    return (static_cast<int32_t>(group.cells.size()) + kColumns - 1) / kColumns;
}

constexpr int32_t kLine = kCaption + 2 * kCell + 2 * kGap;

int32_t HeightOf(const Group& group) {
    return kHeading + LinesOf(group) * kLine;
}

void DrawGroup(cairo_t* context, const Group& group, int32_t top) {
    tool::DrawText(context, group.name, kGap, top + kHeading - 8, {.size = 15, .bold = true});
    for (size_t i = 0; i < group.cells.size(); ++i) {
        const Cells& cells = group.cells[i];
        const double x = kGap + static_cast<double>(i % kColumns) * (kCell + kGap);
        const double y = top + kHeading + static_cast<double>(i / kColumns) * kLine;
        tool::DrawText(context, cells.name, x, y + kCaption - 6, {.size = 11.5});
        tool::DrawPicture(context, cells.plates, x, y + kCaption, kCell, kCell);
        tool::DrawPicture(context, cells.photographs, x, y + kCaption + kCell + kGap / 2, kCell, kCell);
    }
}

void Draw(const std::vector<Group>& groups, const std::string& name) {
    int32_t height = kGap;
    for (const Group& group : groups) height += HeightOf(group);
    const auto draw = [&](cairo_t* context) {
        int32_t top = 0;
        for (const Group& group : groups) {
            DrawGroup(context, group, top);
            top += HeightOf(group);
        }
    };
    tool::WritePngDrawing(kGap + kColumns * (kCell + kGap), height, draw, name);
}

} // namespace

void MeasureAndDrawReductions(const std::vector<std::string>& names, const std::string& name) {
    const Case photographs(LargePhotographs(names), kPartOfPhotographs);
    const Case plates(LargePlates(), kPartOfPlates);
    const auto ideal = [&](const char* title, const Ideal& ofPlates, const Ideal& ofPhotographs) {
        return Cells{title, Cut(Rounded(ofPlates), plates.part),
                     Cut(Rounded(ofPhotographs), photographs.part)};
    };
    std::vector<Group> groups;
    for (const Format& format : kFormats) groups.push_back(Measure(format, photographs, plates));
    std::vector<Cells>& first = groups.front().cells;
    first.insert(first.begin(), ideal("ideal, of light", plates.ofLight, photographs.ofLight));
    first.insert(first.begin(), ideal("ideal, of codes", plates.ofCodes, photographs.ofCodes));
    Draw(groups, name);
}

} // namespace Scaling
