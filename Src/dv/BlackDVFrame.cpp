#include "dv/BlackDVFrame.h"

#include "dv/EncodeDV.h"
#include "primitives/FirstUse.h"

#include <array>

namespace PK {
namespace {

constexpr PK_PixelFormat k525 = PK_PixelFormat_NTSCDV25, k625 = PK_PixelFormat_PALDV25;

template <PK_PixelFormat kStream>
using Frame = std::array<uint8_t, static_cast<size_t>(FindDVFormat(kStream)->FrameBytes())>;

template <PK_PixelFormat kStream>
Frame<kStream> Encode() {
    constexpr const DVFormat& kFormat = *FindDVFormat(kStream);
    std::array<uint8_t, static_cast<size_t>(2 * kFormat.width)> row;
    for (size_t i = 0; i < row.size(); i += 2) {
        row[i] = 16;
        row[i + 1] = 128;
    }
    constexpr int64_t kSameRowAgain = 0;
    Frame<kStream> frame;
    EncodeDV(kFormat, {row.data(), kSameRowAgain, true}, 0, kBestDVPolicy, frame.data());
    return frame;
}

constinit FirstUse<Frame<k525>> sBlack525;
constinit FirstUse<Frame<k625>> sBlack625;

} // namespace

std::span<const uint8_t> BlackDVFrame(PK_PixelFormat stream) {
    if (stream == k525) return sBlack525.Get(Encode<k525>);
    return sBlack625.Get(Encode<k625>);
}

} // namespace PK
