#include "DVDrawings.h"

#include "DVDrawingParts.h"
#include "Numbers.h"

#include "dv/DVPlacement.h"

#include <iterator>
#include <vector>

namespace tool {
namespace {

// A frame of DV50 in 525 lines: two channels of ten sequences.
void DrawFrame(cairo_t* context, double top) {
    constexpr int32_t kChannels = 2, kSequences = 10;
    const double width = (kWidth - 2 * kMargin) / (kChannels * kSequences);
    for (int32_t i = 0; i < kChannels * kSequences; ++i) {
        const Colour colour = i == 0 ? kHeader : i < kSequences ? kWhite : Mixed(kPaleInk, 0.75);
        DrawBox(context, kMargin + i * width, top, width, 34, colour, std::to_string(i % kSequences));
    }
    DrawNote(context, "channel 0", kMargin, top + 52);
    DrawNote(context, "channel 1", kMargin + kSequences * width, top + 52);
}

void DrawSequence(cairo_t* context, double top) {
    constexpr int32_t kGroups = 9, kBlocksOfGroup = 16, kSegmentsOfGroup = 3;
    const double width = (kWidth - 2 * kMargin) / kBlocksOfGroup, height = 22;
    const auto box = [&](int32_t row, double column, const Colour& colour, const std::string& text) {
        DrawBox(context, kMargin + column * width, top + row * height, width, height, colour, text, 10);
    };
    constexpr const char* kFirst[] = {"header", "subcode 0", "subcode 1", "VAUX 0", "VAUX 1", "VAUX 2"};
    constexpr Colour kFirstColours[] = {kHeader, kSubcode, kSubcode, kVAUX, kVAUX, kVAUX};
    for (size_t i = 0; i < std::size(kFirst); ++i)
        box(0, static_cast<double>(i), kFirstColours[i], kFirst[i]);
    for (int32_t group = 0; group < kGroups; ++group) {
        box(1 + group, 0, kAudio, "audio " + std::to_string(group));
        for (int32_t i = 0; i + 1 < kBlocksOfGroup; ++i) {
            const int32_t segment = kSegmentsOfGroup * group + i / PK::kMacroblocksOfSegment;
            const int32_t macroblock = i % PK::kMacroblocksOfSegment;
            const double white = segment % 2 == 0 ? 0.55 : 0.75;
            box(1 + group, 1 + i, Mixed(kMacroblocks[macroblock], white),
                std::to_string(segment) + "abcde"[macroblock]);
        }
    }
}

/// The areas of a macroblock by their bytes.
struct Areas {
    const char* format;
    std::vector<std::pair<const char*, int32_t>> areas;
};

void DrawVideoBlock(cairo_t* context, double top, const Areas& areas) {
    constexpr double kByte = 10;
    const double left = kWidth - kMargin - 80 * kByte;
    DrawText(context, areas.format, kMargin, top + 21, {12});
    DrawBox(context, left, top, 3 * kByte, 32, Mixed(kPaleInk, 0.7), "ID");
    DrawBox(context, left + 3 * kByte, top, kByte, 32, kHeader, "Q", 10);
    double x = left + 4 * kByte;
    for (const auto& [name, bytes] : areas.areas) {
        const Colour colour = name[0] == 'Y'   ? kWhite
                              : name[0] == 'C' ? Mixed(kMacroblocks[3], 0.7)
                                               : Mixed(kPaleInk, 0.75);
        DrawBox(context, x, top, bytes * kByte, 32, colour, Formatted("%s, %d", name, bytes));
        x += bytes * kByte;
    }
}

// Which macroblocks a sequence carries, and one segment of it.
struct Panel {
    const PK::DVFormat& format;
    const char* name;
};

void DrawMacroblock(cairo_t* context, const PK::DVPlace& place, double scale, const Colour& colour) {
    const auto fill = [&](int32_t width, int32_t height) {
        FillBox(context, place.x * scale, place.y * scale, width * scale, height * scale, colour);
    };
    switch (place.shape) {
    case PK::DVShape::k411:
        return fill(32, 8);
    case PK::DVShape::k422:
        return fill(16, 8);
    case PK::DVShape::kHDSideBySide:
        return fill(32, 8);
    default:
        return fill(16, 16);
    }
}

void DrawPanel(cairo_t* context, const Panel& panel, double x, double y, double width) {
    constexpr int32_t kChosen = 7;
    const double scale = width / panel.format.width;
    cairo_save(context);
    cairo_translate(context, x, y);
    FillBox(context, 0, 0, width, panel.format.height * scale, kWhite);
    PK::DVPlace places[PK::kMacroblocksOfSegment];
    for (const bool isChosen : {false, true})
        for (int32_t segment = 0; segment < PK::kSegmentsOfSequence; ++segment) {
            if (isChosen && segment != kChosen) continue;
            PK::PlaceSegment(panel.format, 0, 0, segment, places);
            for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i)
                DrawMacroblock(context, places[i], scale, isChosen ? kInk : Mixed(kMacroblocks[i], 0.35));
        }
    for (int32_t i = 0; i < PK::kMacroblocksOfSegment; ++i)
        DrawText(context, std::string(1, "abcde"[i]), (places[i].x + 40) * scale, places[i].y * scale,
                 {13, true});
    StrokeBox(context, 0, 0, width, panel.format.height * scale, kPaleInk);
    cairo_restore(context);
    DrawText(context, panel.name, x, y + panel.format.height * scale + 18, {12});
}

} // namespace

void DrawDVSequence(const std::string& name) {
    const Areas areas[] = {
        {"DV25", {{"Y0", 14}, {"Y1", 14}, {"Y2", 14}, {"Y3", 14}, {"Cr", 10}, {"Cb", 10}}},
        {"DV50", {{"Y0", 14}, {"none", 14}, {"Y1", 14}, {"none", 14}, {"Cr", 10}, {"Cb", 10}}},
        {"DV100",
         {{"Y0", 10}, {"Y1", 10}, {"Y2", 10}, {"Y3", 10}, {"Cr0", 10}, {"Cr1", 10}, {"Cb0", 8}, {"Cb1", 8}}}};
    WritePngDrawing(
        kWidth, 612,
        [&](cairo_t* context) {
            DrawHeading(context, "A frame: channel after channel, each of 10 or 12 sequences", 34);
            DrawFrame(context, 46);
            DrawHeading(context, "A sequence: 150 blocks of 80 bytes", 138);
            DrawRemark(context, "27 segments of five macroblocks, a to e", 138);
            DrawSequence(context, 150);
            DrawHeading(context, "A video block: one macroblock, in bytes", 420);
            DrawNote(context, "Q is the quantiser; each area begins with DC, mode and class of its block",
                     350, 420);
            for (size_t i = 0; i < std::size(areas); ++i)
                DrawVideoBlock(context, 436 + 44 * static_cast<double>(i), areas[i]);
            DrawNote(context, "Bits that an area does not need are filled by blocks that need more.", kMargin,
                     590);
        },
        name);
}

void DrawDVPlacement(const std::string& name) {
    const Panel panels[] = {
        {*PK::FindDVFormat(PK_PixelFormat_NTSCDV25), "NTSCDV25, 4:1:1, 720 x 480"},
        {*PK::FindDVFormat(PK_PixelFormat_PALDV25), "PALDV25, 4:2:0, 720 x 576"},
        {*PK::FindDVFormat(PK_PixelFormat_NTSCDV50), "NTSCDV50, 4:2:2, 720 x 480"},
        {*PK::FindDVFormat(PK_PixelFormat_NTSC_DV100_720p), "NTSC_DV100_720p, 960 x 720"},
        {*PK::FindDVFormat(PK_PixelFormat_NTSC_DV100_1080i), "NTSC_DV100_1080i, 1280 x 1080"},
        {*PK::FindDVFormat(PK_PixelFormat_PAL_DV100_1080i), "PAL_DV100_1080i, 1440 x 1080"}};
    constexpr double kGap = 18, kPanel = (kWidth - 2 * kMargin - 2 * kGap) / 3;
    WritePngDrawing(
        kWidth, 620,
        [&](cairo_t* context) {
            DrawHeading(context, "Where the first sequence of the first channel lies", 34);
            DrawNote(context, "In black, its segment 7: five macroblocks, one in each column of the picture",
                     420, 34);
            for (size_t i = 0; i < std::size(panels); ++i) {
                const double column = static_cast<double>(i % 3), row = i < 3 ? 0 : 1;
                DrawPanel(context, panels[i], kMargin + column * (kPanel + kGap), 52 + row * 290, kPanel);
            }
        },
        name);
}

} // namespace tool
