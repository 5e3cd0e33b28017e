// Frames of DV, encoded plainly, and DV25 well, as it is from quality 3 on.

#include "operations/DVFrames.h"
#include "operations/Operation.h"

#include <PixelKiln/Convert.h>

namespace OperationBench {
namespace {

template <const DVFrame& kFrame>
Run Encode(const uint8_t*, uint8_t* destination) {
    const auto bytes = static_cast<int32_t>(PK_PixelFormatSize(kFrame.stream, 0, 0));
    return [=, picture = PictureOf(kFrame)] {
        PK_Convert(picture.data(), 2 * kFrame.width, kFrame.pixels, destination, bytes, kFrame.stream,
                   kFrame.width, kFrame.height, 4);
    };
}

constexpr size_t BytesOf(const DVFrame& frame) {
    return size_t{2} * static_cast<size_t>(frame.width) * static_cast<size_t>(frame.height);
}

constexpr double kAim = 2;

const AddOperations add = {
    {kDV25.name, BytesOf(kDV25), 144000, Samples::Bytes, Against::Peer, kAim, Encode<kDV25>},
    {kDV50.name, BytesOf(kDV50), 288000, Samples::Bytes, Against::Peer, kAim, Encode<kDV50>},
    {kDV100.name, BytesOf(kDV100), 576000, Samples::Bytes, Against::Peer, kAim, Encode<kDV100>},
};

} // namespace
} // namespace OperationBench
