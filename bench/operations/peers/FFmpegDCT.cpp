// FFmpeg's integer cosine transforms. They work in place, so that each block is copied first; they keep it in the
// cache.

#include "operations/Operation.h"

extern "C" {
#include <libavcodec/avdct.h>
#include <libavutil/mem.h>
}

#include <cstring>
#include <memory>

namespace OperationBench {
namespace {

struct FreeDCT {
    void operator()(AVDCT* dct) const { av_free(dct); }
};

std::shared_ptr<AVDCT> MakeDCT() {
    std::shared_ptr<AVDCT> dct(avcodec_dct_alloc(), FreeDCT());
    avcodec_dct_init(dct.get());
    return dct;
}

template <void (*AVDCT::*kTransform)(int16_t*)>
Run Transform(const uint8_t* source, uint8_t* destination) {
    return [=, dct = MakeDCT()] {
        constexpr int32_t kBlockBytes = 128;
        for (int32_t i = 0; i < 2 * kPixels; i += kBlockBytes) {
            std::memcpy(destination + i, source + i, kBlockBytes);
            (dct.get()->*kTransform)(reinterpret_cast<int16_t*>(destination + i));
        }
    };
}

const AddPeers add = {
    {"Forward 8 x 8 transform", "FFmpeg fdct", false, Transform<&AVDCT::fdct>},
    {"Inverse 8 x 8 transform", "FFmpeg idct", false, Transform<&AVDCT::idct>},
};

} // namespace
} // namespace OperationBench
