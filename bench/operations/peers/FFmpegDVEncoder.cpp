// FFmpeg's encoder of DV, on one thread, from planes.

#include "operations/DVFrames.h"
#include "operations/Operation.h"
#include "operations/peers/FFmpegCodec.h"

namespace OperationBench {
namespace {

class Encoder {
public:
    explicit Encoder(const DVFrame& format) : fContext(ContextOf(avcodec_find_encoder(AV_CODEC_ID_DVVIDEO))) {
        fContext->width = format.width;
        fContext->height = format.height;
        fContext->pix_fmt = format.chromaLines == 2 ? AV_PIX_FMT_YUV420P : AV_PIX_FMT_YUV422P;
        fContext->time_base = {1, 25};
        fContext->flags |= AV_CODEC_FLAG_INTERLACED_DCT;
        CheckFFmpeg(avcodec_open2(fContext.get(), nullptr, nullptr));
        fFrame->format = fContext->pix_fmt;
        fFrame->width = format.width;
        fFrame->height = format.height;
        CheckFFmpeg(av_frame_get_buffer(fFrame.get(), 64));
        const std::vector<uint8_t> picture = PictureOf(format);
        Fill(0, picture.data(), 2, format.width, format.height, 2 * format.width);
        for (int i = 0; i < 2; ++i)
            Fill(1 + i, picture.data() + 1 + 2 * i, 2 * format.chromaColumns,
                 format.width / format.chromaColumns, format.height / format.chromaLines,
                 2 * format.width * format.chromaLines);
    }

    void Run() {
        ++fFrame->pts;
        CheckFFmpeg(avcodec_send_frame(fContext.get(), fFrame.get()));
        CheckFFmpeg(avcodec_receive_packet(fContext.get(), fPacket.get()));
        av_packet_unref(fPacket.get());
    }

private:
    /// A plane from samples that are `apart` bytes apart.
    void Fill(int plane, const uint8_t* samples, int32_t apart, int32_t width, int32_t height,
              int32_t rowBytes) {
        for (int32_t y = 0; y < height; ++y)
            for (int32_t x = 0; x < width; ++x)
                fFrame->data[plane][y * fFrame->linesize[plane] + x] = samples[y * rowBytes + x * apart];
    }

    std::shared_ptr<AVCodecContext> fContext;
    std::shared_ptr<AVFrame> fFrame = MakeFrame();
    std::shared_ptr<AVPacket> fPacket = MakePacket();
};

template <const DVFrame& kFrame>
Run Encode(const uint8_t*, uint8_t*) {
    return [encoder = Encoder(kFrame)]() mutable { encoder.Run(); };
}

const AddPeers add = {
    {kDV25.name, "FFmpeg", false, Encode<kDV25>},
    {kDV50.name, "FFmpeg", false, Encode<kDV50>},
    {kDV100.name, "FFmpeg", false, Encode<kDV100>},
};

} // namespace
} // namespace OperationBench
