#pragma once

// What FFmpeg's codecs are held by.

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavutil/frame.h>
}

#include <memory>
#include <stdexcept>

namespace OperationBench {

struct FreeOfFFmpeg {
    void operator()(AVCodecContext* context) const { avcodec_free_context(&context); }
    void operator()(AVFrame* frame) const { av_frame_free(&frame); }
    void operator()(AVPacket* packet) const { av_packet_free(&packet); }
};

inline void CheckFFmpeg(int result) {
    if (result < 0) throw std::runtime_error("FFmpeg refuses the work");
}

/// One thread.
inline std::shared_ptr<AVCodecContext> ContextOf(const AVCodec* codec) {
    std::shared_ptr<AVCodecContext> context(avcodec_alloc_context3(codec), FreeOfFFmpeg());
    context->thread_count = 1;
    return context;
}
inline std::shared_ptr<AVFrame> MakeFrame() {
    return {av_frame_alloc(), FreeOfFFmpeg()};
}
inline std::shared_ptr<AVPacket> MakePacket() {
    return {av_packet_alloc(), FreeOfFFmpeg()};
}

} // namespace OperationBench
