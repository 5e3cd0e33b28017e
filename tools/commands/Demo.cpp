// pixelkiln demo: one photograph through a dozen formats and back, and what that did to it; and what the
// operations on frames and the colour spaces make of it.

#include "Chains.h"
#include "ColourPictures.h"
#include "Command.h"
#include "Difference.h"
#include "Failure.h"
#include "Formats.h"
#include "Numbers.h"
#include "OperationsSheet.h"
#include "Png.h"
#include "Sheet.h"
#include "Terminal.h"

#include <filesystem>

namespace tool {
namespace {

constexpr PK_PixelFormat kPictureFormat = PK_PixelFormat_BGRA_4444_8u;
constexpr int kAmplification = 32; // makes a difference of a few steps visible

constexpr PK_PixelFormat kStops[] = {
    PK_PixelFormat_VUYA_4444_8u,      PK_PixelFormat_VUYA_4444_8u_709, PK_PixelFormat_UYVY_422_8u,
    PK_PixelFormat_YUYV_422_8u_709,   PK_PixelFormat_V210_422_10u,     PK_PixelFormat_V210_422_10u_709,
    PK_PixelFormat_RGB_444_10u,       PK_PixelFormat_BGRA_4444_15u,    PK_PixelFormat_PRGB_4444_32f,
    PK_PixelFormat_VUYA_4444_32f_709, PK_PixelFormat_UYVY_422_32f,     PK_PixelFormat_BGRA_4444_32f_Linear,
};

std::string ChainText(PK_PixelFormat from, PK_PixelFormat to, const std::vector<ChainStep>& chain) {
    std::string text = FormatName(from);
    for (const ChainStep& step : chain)
        text += Dim(" -" + step.kernel + "-> ") +
                (step.leaves == to ? Bold(FormatName(to)) : FormatName(step.leaves));
    return "  " + text + "\n";
}

void MakeFolder(const std::string& folder) {
    std::error_code error;
    std::filesystem::create_directories(folder, error);
    if (error) ThrowFileFailure("cannot make the folder '" + folder + "'", error.value());
}

std::string DifferenceText(const Difference& difference) {
    if (difference.differingPixels == 0) return "identical";
    return Formatted("largest difference %.0f of 255, PSNR ", difference.largestColour) +
           PsnrText(difference.psnr);
}

// Takes the picture to a format and back; writes what came back and tells of the way.
Tile Visit(const Frame& picture, PK_PixelFormat stop, const std::filesystem::path& folder, size_t number) {
    const Frame there = Converted(picture, stop, kDefaultQuality);
    Frame back = Converted(there, kPictureFormat, kDefaultQuality);
    WritePng(back, (folder / (Formatted("%02zu-", number) + FormatName(stop) + ".png")).string());

    const auto chainThere = DescribeChain(kPictureFormat, stop, kDefaultQuality);
    const auto chainBack = DescribeChain(stop, kPictureFormat, kDefaultQuality);
    const std::string caption = DifferenceText(MeasureDifference(picture, back)) +
                                "; steps: " + std::to_string(chainThere.size()) + " there, " +
                                std::to_string(chainBack.size()) + " back";
    Print(Bold(FormatName(stop)) + "  " + caption + "\n" + ChainText(kPictureFormat, stop, chainThere) +
          ChainText(stop, kPictureFormat, chainBack));

    Tile tile(FormatName(stop), caption, std::move(back));
    tile.pictures.push_back(DifferencePicture(picture, tile.pictures.front(), kAmplification));
    return tile;
}

struct Options {
    std::string image;
    std::string folder;
};

void Declare(Words& words, Options& options) {
    words.Take("IMAGE", options.image, "PNG file").Required();
    words.Take("OUTDIR", options.folder, "Folder for the pictures, made if it is missing").Required();
}

void Run(const Options& options) {
    const Frame picture = Converted(ReadPng(options.image), kPictureFormat, kDefaultQuality);
    MakeFolder(options.folder);
    const std::filesystem::path folder(options.folder);
    std::vector<Tile> tiles;
    for (const PK_PixelFormat stop : kStops) tiles.push_back(Visit(picture, stop, folder, tiles.size() + 1));
    const std::string sheet = (folder / "sheet.png").string();
    const std::string name = std::filesystem::path(options.image).filename().string();
    WriteSheet(tiles,
               name + " to each format and back; on the right the difference, " +
                   std::to_string(kAmplification) + " times as bright",
               sheet);
    Print("\n" + sheet + " shows all " + std::to_string(tiles.size()) + " side by side\n");
    const std::string operations = (folder / "operations.png").string();
    WriteSheet(OperationTiles(picture), name + " filled over, turned, blurred, warped and stamped",
               operations);
    Print(operations + " shows what the operations do\n");
    const std::string colour = (folder / "colour.png").string();
    WriteSheet(ColourTiles(picture), name + ", the encoded values of each space shown as they are", colour);
    Print(colour + " shows what colour spaces do\n");
    const std::string toneRange = (folder / "tone-range.png").string();
    WriteToneRangePicture(toneRange);
    Print(toneRange + " shows what tone-range compression does\n");
}

const Command sDemo(Group::Pictures, "demo",
                    "Take a picture through formats, operations and colour spaces, and draw what they do",
                    Declare, Run);

} // namespace
} // namespace tool
