#include "Y4M.h"

#include "Numbers.h"

namespace tool {
namespace {

PK_PixelFormat FormatOf(const Frame& frame) {
    const bool isHD = frame.Width() >= 1280 || frame.Height() > 576;
    return isHD ? PK_PixelFormat_VUYX_4444_8u_709 : PK_PixelFormat_VUYX_4444_8u;
}

} // namespace

Y4MWriter::Y4MWriter(const std::string& name, const Y4MShape& shape) : fFile(name) {
    constexpr char kInterlacing[] = {'p', 't', 'b'};
    const std::string head =
        Formatted("YUV4MPEG2 W%d H%d F%d:1 I%c A1:1 C444 XCOLORRANGE=LIMITED\n", shape.width, shape.height,
                  shape.framesASecond, kInterlacing[shape.field]);
    fFile.Write(head.data(), head.size());
}

void Y4MWriter::Write(const Frame& frame) {
    const Frame pixels = Converted(frame, FormatOf(frame), kDefaultQuality);
    std::string bytes = "FRAME\n";
    bytes.reserve(bytes.size() +
                  size_t{3} * static_cast<size_t>(pixels.Width()) * static_cast<size_t>(pixels.Height()));
    constexpr int kPlanes[] = {2, 1, 0}; // Y, U, V of V, U, Y, X
    for (const int plane : kPlanes)
        for (int32_t y = 0; y < pixels.Height(); ++y) {
            const uint8_t* const from = pixels.Row(y) + plane;
            for (int32_t x = 0; x < pixels.Width(); ++x) bytes += static_cast<char>(from[4 * x]);
        }
    fFile.Write(bytes.data(), bytes.size());
}

} // namespace tool
