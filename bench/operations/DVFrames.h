#pragma once

// What the codecs of DV are measured on: pictures with slopes, edges and some grain, as a camera's.

#include <PixelKiln/Convert.h>
#include <PixelKiln/PixelFormat.h>

#include <cmath>
#include <cstdint>
#include <vector>

namespace OperationBench {

struct DVFrame {
    const char* name; ///< of the row that encodes it
    const char* decodeName;
    PK_PixelFormat stream, pixels;
    int32_t width, height;
    int32_t chromaColumns, chromaLines; ///< samples of luma to one of chroma, as coded
};

inline constexpr DVFrame kDV25 = {"DV25 encode, 625 lines",
                                  "DV25 decode, 625 lines",
                                  PK_PixelFormat_PALDV25,
                                  PK_PixelFormat_YUYV_422_8u,
                                  720,
                                  576,
                                  2,
                                  2};
inline constexpr DVFrame kDV50 = {"DV50 encode, 625 lines",
                                  "DV50 decode, 625 lines",
                                  PK_PixelFormat_PALDV50,
                                  PK_PixelFormat_YUYV_422_8u,
                                  720,
                                  576,
                                  2,
                                  1};
inline constexpr DVFrame kDV100 = {"DV100 encode, 1080i50",
                                   "DV100 decode, 1080i50",
                                   PK_PixelFormat_PAL_DV100_1080i,
                                   PK_PixelFormat_YUYV_422_8u_709,
                                   1440,
                                   1080,
                                   2,
                                   1};

/// Pairs of YUYV without gaps.
inline std::vector<uint8_t> PictureOf(const DVFrame& frame) {
    std::vector<uint8_t> bytes;
    uint32_t grain = 1;
    for (int32_t y = 0; y < frame.height; ++y)
        for (int32_t x = 0; x < frame.width; ++x) {
            grain = grain * 1664525 + 1013904223;
            const double wave = std::sin(0.021 * x + 0.00004 * x * y) + std::cos(0.034 * y);
            const int32_t edge = (x / 53 + y / 41) % 3 * 16;
            bytes.push_back(static_cast<uint8_t>(100 + 30 * wave + edge + (grain >> 30)));
            bytes.push_back(static_cast<uint8_t>(128 + 20 * std::sin(0.01 * (x - x % 2) + 0.02 * y + x % 2)));
        }
    return bytes;
}

/// The picture as a frame, by the best that the encoder has.
inline std::vector<uint8_t> EncodedFrame(const DVFrame& frame) {
    std::vector<uint8_t> bytes(static_cast<size_t>(PK_PixelFormatSize(frame.stream, 0, 0)));
    PK_Convert(PictureOf(frame).data(), 2 * frame.width, frame.pixels, bytes.data(),
               static_cast<int32_t>(bytes.size()), frame.stream, frame.width, frame.height, 5);
    return bytes;
}

} // namespace OperationBench
