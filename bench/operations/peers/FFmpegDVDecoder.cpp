// FFmpeg's decoder of DV, on one thread, to planes.

#include "operations/DVFrames.h"
#include "operations/Operation.h"
#include "operations/peers/FFmpegCodec.h"

namespace OperationBench {
namespace {

class Decoder {
public:
    explicit Decoder(const DVFrame& format) : fContext(ContextOf(avcodec_find_decoder(AV_CODEC_ID_DVVIDEO))) {
        CheckFFmpeg(avcodec_open2(fContext.get(), nullptr, nullptr));
        const std::vector<uint8_t> frame = EncodedFrame(format);
        CheckFFmpeg(av_new_packet(fPacket.get(), static_cast<int>(frame.size())));
        std::copy(frame.begin(), frame.end(), fPacket->data);
    }

    void Run() {
        CheckFFmpeg(avcodec_send_packet(fContext.get(), fPacket.get()));
        CheckFFmpeg(avcodec_receive_frame(fContext.get(), fFrame.get()));
    }

private:
    std::shared_ptr<AVCodecContext> fContext;
    std::shared_ptr<AVFrame> fFrame = MakeFrame();
    std::shared_ptr<AVPacket> fPacket = MakePacket();
};

template <const DVFrame& kFrame>
Run Decode(const uint8_t*, uint8_t*) {
    return [decoder = Decoder(kFrame)]() mutable { decoder.Run(); };
}

const AddPeers add = {
    {kDV25.decodeName, "FFmpeg", false, Decode<kDV25>},
    {kDV50.decodeName, "FFmpeg", false, Decode<kDV50>},
    {kDV100.decodeName, "FFmpeg", false, Decode<kDV100>},
};

} // namespace
} // namespace OperationBench
