// Bridges to codecs that work in their one buffer.

#include "results/Image.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/Rounding.h"

#include <PixelKiln/CodecBridges.h>
#include <PixelKiln/PixelFormat.h>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk walk;
};

constexpr Shape kShapes[] = {{1, 2, kTight},   {2, 2, kSpread}, {5, 3, kUpwards},   {16, 2, kTight},
                             {17, 3, kSpread}, {48, 2, kTight}, {101, 3, kUpwards}, {323, 2, kTight}};

template <bool kByteSwap>
PK_Result Scale16uTo15u(void* buffer, int32_t rowBytes, int32_t width, int32_t height) noexcept {
    return PK_Scale16uBufferTo15uSIMD(buffer, rowBytes, width, height, kByteSwap);
}

struct Bridge {
    const char* name;
    PK_Result (*convert)(void*, int32_t, int32_t, int32_t) noexcept;
    int32_t pixelBytes;
    PK_PixelFormat samples; ///< of which depth they are
};

constexpr Bridge kBridges[] = {
    {"j2k-uyvy-offset", PK_Convert_j2k_UYVY_422_32f_Offset_In_Place, 8, PK_PixelFormat_UYVY_422_32f},
    {"j2k-zyx-bgr", PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place, 16, PK_PixelFormat_BGRX_4444_32f},
    {"scale-16-15", Scale16uTo15u<false>, 8, PK_PixelFormat_BGRA_4444_8u}, // any words
    {"scale-16-15-swapped", Scale16uTo15u<true>, 8, PK_PixelFormat_BGRA_4444_8u},
};

struct Variant {
    const char* name;
    Content content;
    RoundingMode rounding = RoundingMode::kNearest;
    bool unitesNaNs = false;
};

constexpr Variant kVariants[] = {
    {"ordinary", Content::kOrdinary},
    {"edges", Content::kEdges},
    {"down", Content::kEdges, RoundingMode::kDown},
    {"nan", Content::kNaNs, RoundingMode::kNearest, true},
    {"nan-bits", Content::kNaNs},
};

void AddBridge(Lines& lines, const Bridge& bridge) {
    const std::string name = bridge.name;
    for (const Variant& variant : kVariants)
        lines.Add(name + "/" + variant.name, [&](Line& line) {
            const Rounding rounding(variant.rounding);
            for (const Shape& shape : kShapes) {
                const auto length = static_cast<size_t>(shape.width * bridge.pixelBytes);
                Image image(length, shape.height, shape.walk, line.random);
                image.Fill(bridge.samples, variant.content, line.random);
                line.results.Add(bridge.convert(image.First(), image.Step(), shape.width, shape.height));
                if (variant.unitesNaNs) image.UniteNaNs();
                image.AddTo(line.results);
            }
        });
    const auto odd = [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        Image image(static_cast<size_t>(kOddWidth * bridge.pixelBytes), kOddHeight, kTight, line.random);
        line.results.Add(bridge.convert(nulls(0, image.First()), image.Step(), width, height));
        image.AddTo(line.results);
    };
    AddOddCalls(lines, name, 1, odd);
    lines.Add(name + "/odd/too-wide", [&](Line& line) { odd(line, Nulls::None(), 134217728, 1); });
}

/// Every 16-bit sample.
void AddAllWords(Lines& lines) {
    for (const bool byteSwap : {false, true})
        lines.Add(std::string("scale-16-15/all-words") + (byteSwap ? "/swapped" : ""), [&](Line& line) {
            std::vector<uint16_t> words(0x10000);
            for (size_t i = 0; i < words.size(); ++i) words[i] = static_cast<uint16_t>(i);
            line.results.Add(PK_Scale16uBufferTo15uSIMD(words.data(), 8 * 64, 64, 256, byteSwap));
            line.results.AddBytes(words.data(), words.size() * sizeof(uint16_t));
        });
}

void AddBridges(Lines& lines) {
    for (const Bridge& bridge : kBridges) AddBridge(lines, bridge);
    AddAllWords(lines);
}

const Family sInPlaceBridges("in-place-bridges", AddBridges);

} // namespace
