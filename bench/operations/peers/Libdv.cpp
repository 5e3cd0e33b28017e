// libdv's decoder of DV25, at its best quality, to YUYV.

#include "operations/DVFrames.h"
#include "operations/Operation.h"

#include <libdv/dv.h>

#include <memory>

namespace OperationBench {
namespace {

Run Decode(const uint8_t*, uint8_t* destination) {
    constexpr int kNoGuard = 0, kNoClamp = 0;
    const std::shared_ptr<dv_decoder_t> decoder(dv_decoder_new(kNoGuard, kNoClamp, kNoClamp),
                                                dv_decoder_free);
    decoder->quality = DV_QUALITY_BEST;
    return [=, frame = EncodedFrame(kDV25)] {
        uint8_t* pixels[3] = {destination, nullptr, nullptr};
        int pitches[3] = {2 * kDV25.width, 0, 0};
        dv_parse_header(decoder.get(), frame.data());
        dv_decode_full_frame(decoder.get(), frame.data(), e_dv_color_yuv, pixels, pitches);
    };
}

const AddPeers add = {{kDV25.decodeName, "libdv", false, Decode}};

} // namespace
} // namespace OperationBench
