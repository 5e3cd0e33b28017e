#include "Y4M.h"

namespace tool {

Y4MWriter::Y4MWriter(const std::string& name, int32_t width, int32_t height, int32_t framesASecond)
    : fFile(name) {
    const std::string head = "YUV4MPEG2 W" + std::to_string(width) + " H" + std::to_string(height) + " F" +
                             std::to_string(framesASecond) + ":1 Ip A1:1 C444 XCOLORRANGE=LIMITED\n";
    fFile.Write(head.data(), head.size());
}

void Y4MWriter::Write(const Frame& frame) {
    const Frame pixels = Converted(frame, PK_PixelFormat_VUYX_4444_8u_709, kDefaultQuality);
    const std::string head = "FRAME\n";
    fFile.Write(head.data(), head.size());
    constexpr int kPlanes[] = {2, 1, 0}; // Y, U, V of V, U, Y, X
    std::string row(static_cast<size_t>(pixels.Width()), 0);
    for (const int plane : kPlanes)
        for (int32_t y = 0; y < pixels.Height(); ++y) {
            const uint8_t* const from = pixels.Row(y) + plane;
            for (size_t x = 0; x < row.size(); ++x) row[x] = static_cast<char>(from[4 * x]);
            fFile.Write(row.data(), row.size());
        }
}

} // namespace tool
