// One image over another, plainly and by a blend mode.

#include "allocations/Call.h"

#include <PixelKiln/Composite.h>

namespace {

using namespace PKAllocations;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kFloats = PK_PixelFormat_BGRA_4444_32f,
                         kV210 = PK_PixelFormat_V210_422_10u;

Call Composite(PK_PixelFormat top, PK_PixelFormat back, PK_PixelFormat to, Memory memory) {
    return {{"PK_Composite"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [s = Image(top), b = Image(back), to](uint8_t* block) {
                return PK_Composite(s.bytes.data(), s.rowBytes, s.format, b.bytes.data(), b.rowBytes,
                                    b.format, block, PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight,
                                    0.5f, 4, false);
            }};
}

Call Blend(PK_PixelFormat top, PK_PixelFormat back, PK_PixelFormat to, PK_BlendMode mode, Memory memory) {
    return {{"PK_CompositeWithBlendMode"},
            memory,
            std::vector<uint8_t>(Image(to).bytes.size()),
            [s = Image(top), b = Image(back), to, mode](uint8_t* block) {
                return PK_CompositeWithBlendMode(
                    s.bytes.data(), s.rowBytes, s.format, b.bytes.data(), b.rowBytes, b.format, block,
                    PK_PixelFormatRowBytes(to, kWidth), to, kWidth, kHeight, 0.5f, mode, 4, false);
            }};
}

void AddComposites(Calls& calls) {
    constexpr Memory kNone = TakesNone("its images are in the working format");
    constexpr Memory kRows = TakesOrRefuses("rows that are converted");
    calls.push_back(Composite(kBGRA, kBGRA, kBGRA, kNone));
    calls.push_back(Composite(kV210, kBGRA, kBGRA, kRows));
    calls.push_back(Composite(kFloats, kBGRA, kV210, kRows));
    calls.push_back(Blend(kFloats, kFloats, kFloats, PK_BlendMode_Screen, kNone));
    calls.push_back(Blend(kBGRA, kFloats, kFloats, PK_BlendMode_Screen, kRows));
    calls.push_back(Blend(kBGRA, kFloats, kV210, PK_BlendMode_Dissolve, kRows));
}

const Family sComposites(AddComposites);

} // namespace
