#pragma once

// FFmpeg's V210 codec on one thread. It knows planar pictures only: its decoder writes 10-bit 4:2:2 planes,
// its encoder reads 10-bit or 8-bit ones. Pictures and packets are taken once and used again for every frame.

#include "frames/Image.h"

extern "C" {
#include <libavcodec/avcodec.h>
}

#include <memory>

namespace FrameBench {

template <auto kFunction>
struct FreeBy {
    template <class Thing>
    void operator()(Thing* thing) const {
        kFunction(&thing);
    }
};
using CodecContext = std::unique_ptr<AVCodecContext, FreeBy<avcodec_free_context>>;
using Frame = std::unique_ptr<AVFrame, FreeBy<av_frame_free>>;
using Packet = std::unique_ptr<AVPacket, FreeBy<av_packet_free>>;

/// Decodes an image of V210 again and again.
class V210Decoder {
public:
    explicit V210Decoder(const Image& source);

    /// The frame stays valid until the next call.
    const AVFrame& Decode();

private:
    Frame fPicture; // what the codec writes to
    Frame fFrame;
    Packet fPacket;
    CodecContext fContext; // last, so that it goes first
};

/// Encodes random planes in video range.
class V210Encoder {
public:
    V210Encoder(AVPixelFormat format, Size size);

    void Encode();

private:
    Packet fBlock; // what the codec writes to
    Packet fPacket;
    Frame fFrame;
    CodecContext fContext;
};

} // namespace FrameBench
