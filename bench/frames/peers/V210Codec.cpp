#include "frames/peers/V210Codec.h"

#include "frames/RandomSamples.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace FrameBench {
namespace {

void Require(bool condition, const char* what) {
    if (condition) return;
    std::fprintf(stderr, "V210 codec: %s\n", what);
    std::exit(1);
}

CodecContext MakeContext(const AVCodec* codec, AVPixelFormat format, Size size, void* owner) {
    CodecContext context(avcodec_alloc_context3(codec));
    context->width = size.width;
    context->height = size.height;
    context->pix_fmt = format;
    context->time_base = {1, 25};
    context->thread_count = 1;
    context->thread_type = FF_THREAD_SLICE;
    context->opaque = owner;
    return context;
}

Frame AllocatePicture(AVPixelFormat format, Size size) {
    Frame frame(av_frame_alloc());
    frame->width = size.width;
    frame->height = size.height;
    frame->format = format;
    Require(av_frame_get_buffer(frame.get(), 64) == 0, "no picture");
    return frame;
}

// The one picture, handed to the decoder for every frame.
int GetPicture(AVCodecContext* context, AVFrame* frame, int) {
    const AVFrame* const picture = static_cast<AVFrame*>(context->opaque);
    for (int i = 0; picture->buf[i] != nullptr; ++i) frame->buf[i] = av_buffer_ref(picture->buf[i]);
    for (int i = 0; i < 3; ++i) {
        frame->data[i] = picture->data[i];
        frame->linesize[i] = picture->linesize[i];
    }
    frame->extended_data = frame->data;
    return 0;
}

// The one block, handed to the encoder for every frame.
int GetBlock(AVCodecContext* context, AVPacket* packet, int) {
    const AVPacket* const block = static_cast<AVPacket*>(context->opaque);
    if (packet->size + AV_INPUT_BUFFER_PADDING_SIZE > static_cast<int>(block->buf->size))
        return AVERROR(ENOMEM);
    packet->buf = av_buffer_ref(block->buf);
    packet->data = block->data;
    return 0;
}

template <class Sample>
void FillPlanes(const AVFrame& frame, float low, float high) {
    std::mt19937 random(1);
    for (int i = 0; i < 3; ++i)
        for (int row = 0; row < frame.height; ++row)
            FillRandom(
                random,
                reinterpret_cast<Sample*>(frame.data[i] + static_cast<ptrdiff_t>(row) * frame.linesize[i]),
                static_cast<size_t>(i == 0 ? frame.width : frame.width / 2), low, high);
}

} // namespace

V210Decoder::V210Decoder(const Image& source)
    : fPicture(AllocatePicture(AV_PIX_FMT_YUV422P10, source.size)), fFrame(av_frame_alloc()),
      fPacket(av_packet_alloc()), fContext(MakeContext(avcodec_find_decoder(AV_CODEC_ID_V210),
                                                       AV_PIX_FMT_YUV422P10, source.size, fPicture.get())) {
    fContext->get_buffer2 = GetPicture;
    Require(avcodec_open2(fContext.get(), nullptr, nullptr) == 0, "no decoder");
    const size_t bytes = source.packedBytes;
    Require(av_new_packet(fPacket.get(), static_cast<int>(bytes)) == 0, "no packet");
    std::copy_n(source.bytes.get(), bytes, fPacket->data);
}

const AVFrame& V210Decoder::Decode() {
    Require(avcodec_send_packet(fContext.get(), fPacket.get()) == 0, "the decoder takes nothing");
    Require(avcodec_receive_frame(fContext.get(), fFrame.get()) == 0, "the decoder gives nothing");
    return *fFrame;
}

V210Encoder::V210Encoder(AVPixelFormat format, Size size)
    : fBlock(av_packet_alloc()), fPacket(av_packet_alloc()), fFrame(AllocatePicture(format, size)),
      fContext(MakeContext(avcodec_find_encoder(AV_CODEC_ID_V210), format, size, fBlock.get())) {
    Require(av_new_packet(fBlock.get(), size.width / 6 * 16 * size.height) == 0, "no packet");
    fContext->get_encode_buffer = GetBlock;
    Require(avcodec_open2(fContext.get(), nullptr, nullptr) == 0, "no encoder");
    if (format == AV_PIX_FMT_YUV422P)
        FillPlanes<uint8_t>(*fFrame, 16, 236);
    else
        FillPlanes<uint16_t>(*fFrame, 64, 941);
}

void V210Encoder::Encode() {
    Require(avcodec_send_frame(fContext.get(), fFrame.get()) == 0, "the encoder takes nothing");
    Require(avcodec_receive_packet(fContext.get(), fPacket.get()) == 0, "the encoder gives nothing");
}

} // namespace FrameBench
