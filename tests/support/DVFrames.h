#pragma once

// The frames of DV in media/dv/.

#include <PixelKiln/PixelFormat.h>

#include <cstdint>
#include <string>
#include <vector>

namespace PKTest {

struct DVFrame {
    const char* name;
    PK_PixelFormat format;
    int32_t width, height;
    bool isPhotograph; ///< else it is noise of coefficients
};

inline constexpr DVFrame kDVFrames[] = {
    {"dv25_525_411_astronaut", PK_PixelFormat_NTSCDV25, 720, 480, true},
    {"dv25_625_420_coffee", PK_PixelFormat_PALDV25, 720, 576, true},
    {"dv25_625_411_chelsea", PK_PixelFormat_PALDV25, 720, 576, true},
    {"dv50_525_coffee", PK_PixelFormat_NTSCDV50, 720, 480, true},
    {"dv50_625_astronaut", PK_PixelFormat_PALDV50, 720, 576, true},
    {"dv100_720p60_chelsea", PK_PixelFormat_NTSC_DV100_720p, 960, 720, true},
    {"dv100_720p60_chelsea_second", PK_PixelFormat_NTSC_DV100_720p, 960, 720, true},
    {"dv100_720p50_astronaut", PK_PixelFormat_PAL_DV100_720p, 960, 720, true},
    {"dv100_1080i60_coffee", PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, true},
    {"dv100_1080i50_astronaut", PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, true},
    {"stress_dv25_525_411", PK_PixelFormat_NTSCDV25, 720, 480, false},
    {"stress_dv25_625_420", PK_PixelFormat_PALDV25, 720, 576, false},
    {"stress_dv50_525", PK_PixelFormat_NTSCDV50, 720, 480, false},
};

/// The bytes of one of them. Throws if it cannot be read.
std::vector<uint8_t> ReadDVFrame(const std::string& name);

} // namespace PKTest
