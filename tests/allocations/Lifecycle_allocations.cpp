// Start and stop, switches, queries, and what formats are.

#include "allocations/Call.h"

#include <PixelKiln/PixelKiln.h>

#include <cstdlib>
#include <cstring>

namespace {

using namespace PKAllocations;

constexpr Memory kFlags = TakesNone("reads or writes flags"),
                 kBits = TakesNone("goes by the bits of a format");

template <class Value>
PK_Result Answer(uint8_t* block, const Value& value) {
    std::memcpy(block, &value, sizeof value);
    return PK_Success;
}

/// With whatever threads it could get, the library works.
PK_Result StartConvertAndStop(uint8_t* pixel) {
    constexpr uint8_t kSource[4] = {10, 20, 30, 255};
    PK_Result result = PK_Initialize();
    if (result == PK_Success)
        result = PK_Convert(kSource, 4, PK_PixelFormat_BGRA_4444_8u, pixel, 4, PK_PixelFormat_ARGB_4444_8u, 1,
                            1, 2);
    return PK_Terminate() == PK_Success ? result : PK_ErrFailed;
}

PK_Result StartWithSettings(uint8_t* pixel) {
    setenv("PIXELKILN_SETTINGS", "PK.disableAVX2=true,PK.highestTarget=sse2,a.setting.of.a.longer.name=1", 1);
    return StartConvertAndStop(pixel);
}

void AddLifecycle(Calls& calls) {
    const std::vector<uint8_t> pixel(4);
    calls.push_back({{"PK_Initialize", "PK_Terminate"},
                     TakesOrDoesWithout("the pool of threads"),
                     pixel,
                     StartConvertAndStop,
                     PK_Success,
                     true});
    calls.push_back(
        {{"PK_Initialize"}, TakesOrDoesWithout("settings"), pixel, StartWithSettings, PK_Success, true});
    // Switch 10 tells itself by the origin of a format.
    calls.push_back({{"PK_SetDebugFlag", "PK_IsOriginTopLeft", "PK_IsOriginBottomLeft"},
                     kFlags,
                     std::vector<uint8_t>(1),
                     [](uint8_t* block) {
                         PK_SetDebugFlag(10, 1);
                         const bool isTop = PK_IsOriginTopLeft(PK_PixelFormat_BGRA_4444_8u);
                         PK_SetDebugFlag(10, 0);
                         return Answer(block, isTop && PK_IsOriginBottomLeft(PK_PixelFormat_BGRA_4444_8u));
                     }});
    calls.push_back(
        {{"PK_hasSSE4", "PK_hasAVX", "PK_hasAVX2"}, kFlags, std::vector<uint8_t>(1), [](uint8_t* block) {
             return Answer(block,
                           static_cast<uint8_t>(8 | PK_hasSSE4() | PK_hasAVX() << 1 | PK_hasAVX2() << 2));
         }});
}

void AddFormats(Calls& calls) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_V210_422_10u;
    calls.push_back({{"PK_ZEBPixelFormatToPKPixelFormat"}, kBits, Content(4), [](uint8_t* block) {
                         return Answer(block, PK_ZEBPixelFormatToPKPixelFormat({}));
                     }});
    calls.push_back({{"PK_PixelFormatSize"}, kBits, std::vector<uint8_t>(8), [](uint8_t* block) {
                         return Answer(block, PK_PixelFormatSize(kFormat, kWidth, kHeight));
                     }});
    calls.push_back({{"PK_PixelFormatRowBytes"}, kBits, std::vector<uint8_t>(4), [](uint8_t* block) {
                         return Answer(block, PK_PixelFormatRowBytes(kFormat, kWidth));
                     }});
    calls.push_back({{"PK_PixelFormatPackedRowBytes"}, kBits, std::vector<uint8_t>(4), [](uint8_t* block) {
                         return Answer(block, PK_PixelFormatPackedRowBytes(kFormat, kWidth));
                     }});
    calls.push_back({{"PK_PixelFormatName"}, kBits, std::vector<uint8_t>(8), [](uint8_t* block) {
                         return Answer(block, PK_PixelFormatName(kFormat));
                     }});
}

const Family sLifecycle(AddLifecycle), sFormats(AddFormats);

} // namespace
