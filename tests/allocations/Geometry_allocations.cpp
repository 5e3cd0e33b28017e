// Images that are turned, deinterlaced, warped, blurred, placed and stamped.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

#include <array>
#include <optional>

namespace {

using namespace PKAllocations;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
constexpr Memory kBlocks = TakesNone("turns blocks in registers");
constexpr Memory kBundles = TakesOrDoesWithout("lines side by side");

void AddTurns(Calls& calls) {
    const Image source(kBGRA);
    const std::vector<uint8_t> turned(source.bytes.size());
    constexpr int32_t kTurnedRowBytes = 4 * kHeight;
    calls.push_back({{"PK_Transpose"}, kBlocks, turned, [source](uint8_t* block) {
                         return PK_Transpose(source.bytes.data(), source.rowBytes, block, kTurnedRowBytes,
                                             kWidth, kHeight, 4);
                     }});
    for (const int32_t degrees : {90, 180, 270})
        calls.push_back({{"PK_RotateImage"}, kBlocks, turned, [=](uint8_t* block) {
                             const int32_t rowBytes = degrees == 180 ? source.rowBytes : kTurnedRowBytes;
                             return PK_RotateImage(source.bytes.data(), source.rowBytes, block, rowBytes,
                                                   kWidth, kHeight, kBGRA, degrees);
                         }});
}

void AddFields(Calls& calls) {
    struct Rebuilding {
        PK_PixelFormat format;
        int32_t quality;
        Memory memory;
    };
    constexpr Rebuilding kRebuildings[] = {
        {PK_PixelFormat_BGRP_4444_8u, 4, TakesNone("works on the rows themselves")},
        {PK_PixelFormat_BGRP_4444_8u, 3, TakesNone("mixes the rows themselves")},
        {PK_PixelFormat_UYVY_422_8u, 4, TakesOrRefuses("rows that are converted")},
        {PK_PixelFormat_UYVY_422_8u, 3, TakesOrRefuses("rows that are converted")},
    };
    for (const Rebuilding& rebuilding : kRebuildings) {
        const Image image(rebuilding.format);
        calls.push_back({{"PK_Deinterlace"},
                         rebuilding.memory,
                         image.bytes,
                         [=, rowBytes = image.rowBytes](uint8_t* block) {
                             return PK_Deinterlace(block, rowBytes, rebuilding.format, kWidth, kHeight, 0,
                                                   rebuilding.quality);
                         }});
        calls.push_back(
            {{"PK_DeinterlaceCopy"},
             TakesOrRefuses("rows that are converted"),
             image.bytes,
             [=, source = Image(PK_PixelFormat_V210_422_10u), rowBytes = image.rowBytes](uint8_t* block) {
                 return PK_DeinterlaceCopy(source.bytes.data(), source.rowBytes, source.format, block,
                                           rowBytes, rebuilding.format, kWidth, kHeight, 1,
                                           rebuilding.quality);
             }});
    }
}

void AddWarps(Calls& calls) {
    constexpr int32_t kSide = 300;
    for (const int32_t quality : {2, 3})
        for (const float feather : {0.0f, 7.5f})
            calls.push_back({{"PK_WarpAffineQuad"},
                             TakesNone("has its polygons on the stack"),
                             Content(4 * kSide * kSide),
                             [=, source = Content(4 * kSide * kSide)](uint8_t* block) {
                                 constexpr PK_Rect kRect = {0, 0, kSide, kSide};
                                 constexpr double kFrom[8] = {0, 0, kSide, 0, kSide, kSide, 0, kSide};
                                 constexpr double kTo[8] = {20, 9, 291, 33.5, 260, 288, 5, 240};
                                 return PK_WarpAffineQuad(nullptr, nullptr, source.data(), 4 * kSide, &kRect,
                                                          kFrom, block, 4 * kSide, &kRect, kTo, quality, 200,
                                                          true, false, kBGRA, 0, true, false, feather);
                             }});
}

void AddBlurs(Calls& calls) {
    constexpr int32_t kLong = 4001, kShort = 37;
    for (const bool areColumns : {false, true}) {
        const int32_t width = areColumns ? kShort : kLong, height = areColumns ? kLong : kShort;
        calls.push_back({{"PK_BoxBlur"},
                         kBundles,
                         Content(4 * kLong * kShort),
                         [=, room = std::vector<uint8_t>(4 * (2 * kLong + kShort))](uint8_t* block) mutable {
                             std::array<double, 3> radii = {3.1, 12, 1.7};
                             const int32_t flags =
                                 7 | PK_BoxBlur_Renormalise | (areColumns ? int32_t{PK_BoxBlur_Columns} : 0);
                             PK_BoxBlur(3, radii.data(), flags, room.data(), block, 4 * width, width, height);
                             return PK_Success;
                         }});
    }
}

void AddGaussianBlurs(Calls& calls) {
    struct Blurring {
        PK_PixelFormat format;
        int32_t width, height, direction;
        Memory memory;
    };
    constexpr int32_t kLong = 9001, kShort = 5, kSide = 40;
    constexpr Memory kLines = TakesOrRefuses("lines above 256 KiB");
    constexpr Blurring kBlurrings[] = {
        {kBGRA, kSide, kShort, 1, TakesNone("has short lines on the stack")},
        {kBGRA, kSide, kShort, 2, TakesNone("has short lines on the stack")},
        {kBGRA, kSide, kShort, 3, TakesOrRefuses("the rows that wait for their columns")},
        {kBGRA, kLong, kShort, 1, kLines},
        {kBGRA, kShort, kLong, 2, kLines},
        {PK_PixelFormat_BGRP_4444_32f, kLong, kShort, 3, TakesOrRefuses("rows that wait, and lines")},
        {PK_PixelFormat_ARGB_4444_15u, kShort, kLong, 3, TakesOrRefuses("rows that wait, and lines")},
    };
    for (const Blurring& job : kBlurrings) {
        const int32_t rowBytes = PK_PixelFormatRowBytes(job.format, job.width);
        const size_t bytes = static_cast<size_t>(rowBytes) * static_cast<size_t>(job.height);
        calls.push_back({{"PK_GaussianBlur"},
                         job.memory,
                         std::vector<uint8_t>(bytes),
                         [=, source = Content(bytes)](uint8_t* block) {
                             return PK_GaussianBlur(source.data(), rowBytes, job.width, job.height,
                                                    job.format, block, rowBytes, job.width, job.height,
                                                    job.format, 3, 2, true, false, job.direction, 4);
                         }});
    }
}

struct Placing {
    PK_PixelFormat source, destination;
    int32_t width, height, quality;
    PK_Point position, scale;
    Memory memory;
    int32_t sourceField = 0, destinationField = 0;
    std::optional<PK_BlendMode> mode = {}; ///< else in the destination's place
};

/// Of images of one size. Where there are more rows than one band has, or both fields of a progressive source that was
/// interlaced, a part is drawn before there is no memory for the rest.
void AddPlacings(Calls& calls) {
    constexpr int32_t kLong = 9001, kShort = 5, kSide = 30;
    constexpr PK_PixelFormat kLinear = PK_PixelFormat_BGRP_4444_32f_Linear,
                             kUYVY = PK_PixelFormat_UYVY_422_8u;
    constexpr PK_Point kMiddle = {0.5f, 0.5f}, kMoved = {0.48f, 0.51f}, kWhole = {1, 1},
                       kLarge = {1.5f, 1.2f}, kSmall = {0.7f, 0.4f};
    constexpr Memory kShortRows = TakesNone("has short rows on the stack"),
                     kRows = TakesOrRefuses("rows above 256 KiB"),
                     kBlurred = TakesOrRefuses("the blurred source"),
                     kWeights = TakesOrRefuses("tables of weights"),
                     kProgressive = TakesOrRefuses("the progressive source, and tables of weights");
    const Placing placings[] = {
        {kBGRA, kBGRA, kWidth, kHeight, 2, kMiddle, kWhole, TakesNone("copies pixels themselves")},
        {kBGRA, kBGRA, kSide, kSide, 2, kMoved, kSmall, kShortRows},
        {kBGRA, kUYVY, kSide, kSide, 4, kMoved, kLarge, kShortRows},
        {kBGRA, kBGRA, kSide, kSide, 2, kMoved, kWhole, kShortRows, 1, 2},
        {kLinear, kBGRA, kSide, kSide, 5, kMoved, kSmall, kWeights},
        {kBGRA, kUYVY, kSide, kSide, 2, kMoved, kLarge, kShortRows, 0, 0, PK_BlendMode_Multiply},
        {kBGRA, kBGRA, kLong, kShort, 2, kMoved, kLarge, kRows},
        {kBGRA, kUYVY, kLong, kShort, 2, kMoved, kLarge, kRows, 1, 2},
        {kBGRA, kBGRA, kLong, kShort, 2, kMoved, kWhole, kRows, 0, 0, PK_BlendMode_Multiply},
        {kLinear, kBGRA, kLong, kShort, 5, kMoved, kLarge, TakesOrRefuses("tables of weights, and rows")},
        {kBGRA, kBGRA, kSide, kSide, 4, kMoved, kSmall, kBlurred},
        {kBGRA, kUYVY, kSide, kSide, 3, kMoved, kSmall, kBlurred, 2, 1},
        {kBGRA, kBGRA, kLong, kShort, 4, kMoved, kSmall,
         TakesOrRefuses("the blurred source, lines and rows")},
        {kBGRA, kUYVY, kSide, kSide, 4, kMoved, kSmall, kBlurred, 0, 0, PK_BlendMode_Screen},
        {kLinear, kBGRA, kSide, kSide, 5, kMoved, kSmall, kProgressive, 1},
        {kLinear, kUYVY, kSide, kSide, 5, kMoved, kWhole, kProgressive, 2},
        {kLinear, kBGRA, kSide, kSide, 5, kMoved, kLarge, kProgressive, 1, 0, PK_BlendMode_Screen},
    };
    for (const Placing& job : placings) {
        const auto rowBytes = [&](PK_PixelFormat format) {
            return PK_PixelFormatRowBytes(format, job.width);
        };
        const auto bytes = [&](PK_PixelFormat format) {
            return Content(static_cast<size_t>(PK_PixelFormatSize(format, job.width, job.height)));
        };
        const auto place = [=, step = rowBytes(job.source), to = rowBytes(job.destination),
                            source = bytes(job.source)](uint8_t* block) {
            if (job.mode)
                return PK_MotionWithBlendMode(
                    source.data(), step, job.width, job.height, job.source, job.sourceField, nullptr, block,
                    to, job.width, job.height, job.destination, job.destinationField, 1, 1, job.position,
                    kMiddle, job.scale, 0, 0.9f, 0, false, 0, *job.mode, job.quality, false);
            return PK_Motion(source.data(), step, job.width, job.height, job.source, job.sourceField, nullptr,
                             block, to, job.width, job.height, job.destination, job.destinationField, 1, 1,
                             job.position, kMiddle, job.scale, 0, 1, false, 0, false, 0, job.quality, false);
        };
        calls.push_back({{job.mode ? "PK_MotionWithBlendMode" : "PK_Motion"},
                         job.memory,
                         std::vector<uint8_t>(bytes(job.destination).size(), 99),
                         place});
    }
}

void AddStamps(Calls& calls) {
    constexpr int32_t kStampWidth = 900, kStampHeight = 300;
    calls.push_back({{"PK_PrintNum"},
                     TakesNone("draws digits of seven strokes"),
                     Content(4 * kStampWidth * kStampHeight),
                     [](uint8_t* block) {
                         return PK_PrintNum(block, 4 * kStampWidth, kBGRA, kStampWidth, kStampHeight,
                                            -1234567890, 0.08f, {0, 0}, true);
                     }});
}

const Family sTurns(AddTurns), sFields(AddFields), sWarps(AddWarps), sBlurs(AddBlurs),
    sGaussianBlurs(AddGaussianBlurs), sPlacings(AddPlacings), sStamps(AddStamps);

} // namespace
