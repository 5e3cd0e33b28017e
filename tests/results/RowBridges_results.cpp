// Bridges to codecs from image to image.

#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/CodecBridges.h>
#include <PixelKiln/Lifecycle.h>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Shape kShapes[] = {{1, 2, kTight, kTight},    {2, 2, kSpread, kSpread},  {5, 3, kTight, kSpread},
                             {6, 2, kTight, kTight},    {13, 3, kUpwards, kTight}, {17, 2, kSpread, kUpwards},
                             {31, 3, kTight, kUpwards}, {48, 2, kTight, kTight},   {101, 3, kSpread, kTight},
                             {323, 2, kTight, kSpread}};
constexpr Shape kOddShape = {kOddWidth, kOddHeight, kTight, kTight};

/// Bytes of a row: so many for a group of pixels.
struct Layout {
    int32_t pixels, bytes;

    size_t RowLength(int32_t width) const {
        return static_cast<size_t>((width + pixels - 1) / pixels * bytes);
    }
};

constexpr Layout kThreeBytes = {1, 3}, kFourBytes = {1, 4}, kThreeWords = {1, 6}, kFourWords = {1, 8},
                 kV210 = {6, 16};

struct Bridge {
    const char* name;
    decltype(&PK_ConvertRGB_444_8uToBGRA_4444_8u) convert;
    Layout from, to;
};

constexpr Bridge kBridges[] = {
    {"rgb-bgra", PK_ConvertRGB_444_8uToBGRA_4444_8u, kThreeBytes, kFourBytes},
    {"uyvy10-v210", PK_ConvertUYVY_422_10uToV210_422_10u, kFourBytes, kV210},
    {"j2k-v210-uyvy16", PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u, kV210, kFourBytes},
    {"j2k-bgr16-rgb10", PK_Convert_j2k_BGR16u_To_RGB_444_10u, kThreeWords, kFourBytes},
    {"j2k-rgb10-bgr16", PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u, kFourBytes, kThreeWords},
};

PK_Result ConvertRGB16(const void* source, void* destination, int32_t width, int32_t height) noexcept {
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, width, height);
    return PK_Success;
}

/// Rows follow each other without gaps.
struct TightBridge {
    const char* name;
    decltype(&PK_Convert_DNxHD16u_To_RGB_444_10u) convert;
    Layout from, to;
};

constexpr TightBridge kTightBridges[] = {
    {"dnxhd-rgb10", PK_Convert_DNxHD16u_To_RGB_444_10u, kFourWords, kFourBytes},
    {"rgb10-dnxhd", PK_Convert_RGB_444_10u_To_DNxHD16u, kFourBytes, kFourWords},
    {"rgb16-xrgb15", ConvertRGB16, kThreeWords, kFourWords},
};

struct Told {
    Nulls nulls;
    int32_t width, height;
};

void Convert(Line& line, const Bridge& bridge, const Shape& shape, const Told& told) {
    Image source(bridge.from.RowLength(shape.width), shape.height, shape.from, line.random);
    Image destination(bridge.to.RowLength(shape.width), shape.height, shape.to, line.random);
    line.results.Add(bridge.convert(told.nulls(0, source.First()), source.Step(),
                                    told.nulls(1, destination.First()), destination.Step(), told.width,
                                    told.height));
    destination.AddTo(line.results);
}

void Convert(Line& line, const TightBridge& bridge, const Shape& shape, const Told& told) {
    const Walk from = {shape.from.lead, 0, false}, to = {shape.to.lead, 0, false};
    Image source(bridge.from.RowLength(shape.width), shape.height, from, line.random);
    Image destination(bridge.to.RowLength(shape.width), shape.height, to, line.random);
    line.results.Add(bridge.convert(told.nulls(0, source.First()), told.nulls(1, destination.First()),
                                    told.width, told.height));
    destination.AddTo(line.results);
}

template <class AnyBridge>
void AddBridge(Lines& lines, const AnyBridge& bridge) {
    const std::string name = bridge.name;
    const auto all = [&](Line& line) {
        for (const Shape& shape : kShapes)
            Convert(line, bridge, shape, {Nulls::None(), shape.width, shape.height});
    };
    lines.Add(name, all);
    lines.Add(name + "/down", [&](Line& line) {
        const Rounding rounding(RoundingMode::kDown);
        all(line);
    });
    const auto odd = [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        Convert(line, bridge, kOddShape, {nulls, width, height});
    };
    AddOddCalls(lines, name, 2, odd);
    lines.Add(name + "/odd/too-wide", [&](Line& line) { odd(line, Nulls::None(), 134217728, 1); });
}

/// A last group that the rows have no room for.
void AddNarrowV210(Lines& lines) {
    for (const int32_t room : {0, 16, 28, 32, 47})
        for (const bool upwards : {false, true})
            lines.Add(
                "uyvy10-v210/narrow/" + std::to_string(room) + (upwards ? "/upwards" : ""), [&](Line& line) {
                    Image source(size_t{4} * 13, 2, kTight, line.random);
                    Image destination(size_t{48}, 4, {0, 0, upwards}, line.random);
                    line.results.Add(PK_ConvertUYVY_422_10uToV210_422_10u(
                        source.First(), source.Step(), destination.First(), upwards ? -room : room, 13, 2));
                    destination.AddTo(line.results);
                });
}

/// Which of two rules holds goes by two switches.
void AddSwitches(Lines& lines) {
    if (!__builtin_cpu_supports("avx2")) return;
    for (const bool sse41 : {false, true})
        for (const bool avx2 : {false, true})
            lines.Add(std::string("rgb16-xrgb15/switches/") + (sse41 ? "sse4.1" : "") + (avx2 ? "avx2" : ""),
                      [&](Line& line) {
                          const bool saved[] = {PK_hasSSE4(), PK_hasAVX2()};
                          PK_SetDebugFlag(6, sse41);
                          PK_SetDebugFlag(9, avx2);
                          Convert(line, kTightBridges[2], kShapes[8],
                                  {Nulls::None(), kShapes[8].width, kShapes[8].height});
                          PK_SetDebugFlag(6, saved[0]);
                          PK_SetDebugFlag(9, saved[1]);
                      });
}

void AddBridges(Lines& lines) {
    for (const Bridge& bridge : kBridges) AddBridge(lines, bridge);
    for (const TightBridge& bridge : kTightBridges) AddBridge(lines, bridge);
    AddNarrowV210(lines);
    AddSwitches(lines);
}

const Family sRowBridges("row-bridges", AddBridges);

} // namespace
