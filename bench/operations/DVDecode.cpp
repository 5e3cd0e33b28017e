// Frames of DV, decoded to pairs of pixels, and to reduced sizes.

#include "operations/DVFrames.h"
#include "operations/Operation.h"

#include <PixelKiln/Convert.h>

namespace OperationBench {
namespace {

/// At a size that is the whole's shifted, below quality 3.
template <const DVFrame& kFrame, PK_PixelFormat kPixels, int32_t kPixelBytes, int32_t kShift = 0>
Run Decode(const uint8_t*, uint8_t* destination) {
    return [=, frame = EncodedFrame(kFrame)] {
        constexpr int32_t kColumns = kFrame.width >> kShift;
        PK_Convert(frame.data(), 0, kFrame.stream, destination, kPixelBytes * kColumns, kPixels, kColumns,
                   kFrame.height >> kShift, 2);
    };
}

constexpr size_t BytesOf(const DVFrame& frame, size_t pixelBytes, int32_t shift = 0) {
    return pixelBytes * static_cast<size_t>(frame.width >> shift) *
           static_cast<size_t>(frame.height >> shift);
}

constexpr PK_PixelFormat kUYVY = PK_PixelFormat_UYVY_422_8u, kBGRA = PK_PixelFormat_BGRA_4444_8u;
constexpr PK_PixelFormat kVUYA = PK_PixelFormat_VUYA_4444_8u, kVUYA709 = PK_PixelFormat_VUYA_4444_8u_709;
constexpr double kAim = 1.5;

const AddOperations add = {
    {kDV25.decodeName, 144000, BytesOf(kDV25, 2), Samples::Bytes, Against::Peer, kAim,
     Decode<kDV25, kUYVY, 2>},
    {kDV50.decodeName, 288000, BytesOf(kDV50, 2), Samples::Bytes, Against::Peer, kAim,
     Decode<kDV50, kDV50.pixels, 2>},
    {kDV100.decodeName, 576000, BytesOf(kDV100, 2), Samples::Bytes, Against::Peer, kAim,
     Decode<kDV100, kDV100.pixels, 2>},
    {"DV25 decode, 625 lines, to BGRA", 144000, BytesOf(kDV25, 4), Samples::Bytes, Against::Nothing, 0,
     Decode<kDV25, kBGRA, 4>},
    {"DV25 decode, 625 lines, a quarter", 144000, BytesOf(kDV25, 4, 2), Samples::Bytes, Against::Nothing, 0,
     Decode<kDV25, kVUYA, 4, 2>},
    {"DV25 decode, 625 lines, an eighth", 144000, BytesOf(kDV25, 4, 3), Samples::Bytes, Against::Nothing, 0,
     Decode<kDV25, kVUYA, 4, 3>},
    {"DV50 decode, 625 lines, half", 288000, BytesOf(kDV50, 4, 1), Samples::Bytes, Against::Nothing, 0,
     Decode<kDV50, kVUYA, 4, 1>},
    {"DV100 decode, 1080i50, half", 576000, BytesOf(kDV100, 4, 1), Samples::Bytes, Against::Nothing, 0,
     Decode<kDV100, kVUYA709, 4, 1>},
};

} // namespace
} // namespace OperationBench
