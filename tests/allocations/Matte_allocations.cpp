// Images over black, and without the share of a matte.

#include "allocations/Call.h"

#include <PixelKiln/Matte.h>

namespace {

using namespace PKAllocations;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kFloats = PK_PixelFormat_BGRA_4444_32f;
constexpr Memory kNone = TakesNone("its images are in the working format");
constexpr Memory kRows = TakesOrRefuses("rows that are converted");

Call ToBlack(PK_PixelFormat from, PK_PixelFormat to, Memory memory) {
    return {{"PK_CompositeToBlack"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [source = Image(from), to](uint8_t* block) {
                return PK_CompositeToBlack(source.bytes.data(), source.rowBytes, source.format, block,
                                           PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, 0.5f, 4);
            }};
}

Call ToBlackAndTest(PK_PixelFormat from, PK_PixelFormat to, Memory memory) {
    return {{"PK_CompositeToBlackAndTestSourceAlpha"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [source = Image(from), to](uint8_t* block) {
                uint32_t told = 0;
                return PK_CompositeToBlackAndTestSourceAlpha(
                    source.bytes.data(), source.rowBytes, source.format, block,
                    PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, &told, 4);
            }};
}

Call Without(PK_PixelFormat format) {
    return {{"PK_UnPremultiplyAgainstMatteColor"},
            TakesOrRefuses("the rows of the matte's share"),
            std::vector<uint8_t>(Image(format).bytes.size()),
            [source = Image(format)](uint8_t* block) {
                const uint8_t matte[4] = {10, 20, 30, 255};
                return PK_UnPremultiplyAgainstMatteColor(source.bytes.data(), source.rowBytes, block,
                                                         source.rowBytes, source.format, kWidth, kHeight,
                                                         matte, kBGRA, 4);
            }};
}

void AddMattes(Calls& calls) {
    calls.push_back(ToBlack(kBGRA, kBGRA, kNone));
    calls.push_back(ToBlack(PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u, kRows));
    calls.push_back(ToBlackAndTest(kBGRA, kBGRA, kNone));
    calls.push_back(ToBlackAndTest(kFloats, kBGRA, kRows));
    calls.push_back(Without(kBGRA));
    calls.push_back(Without(PK_PixelFormat_PRGB_4444_15u));
}

const Family sMattes(AddMattes);

} // namespace
