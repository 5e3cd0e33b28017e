// FFmpeg's swscale, which is told where chroma lies; fields are given to it one by one.

#include "Way.h"

extern "C" {
#include <libavutil/opt.h>
#include <libavutil/pixfmt.h>
#include <libswscale/swscale.h>
}

#include <memory>
#include <stdexcept>
#include <string>

namespace ChromaBench {
namespace {

/// In 256ths of a pixel from the top of the picture, or of a line of the field.
int ChromaRow(const Kind& kind, int32_t field) {
    if (!kind.areFields) return 128;
    return field == 0 ? 64 : 192;
}

void Run(const Video& from, AVPixelFormat source, Video& to, AVPixelFormat destination, const Kind& kind,
         int32_t field) {
    const std::unique_ptr<SwsContext, void (*)(SwsContext*)> context(sws_alloc_context(), sws_freeContext);
    const auto set = [&](const char* name, int64_t value) { av_opt_set_int(context.get(), name, value, 0); };
    set("srcw", from.y.width);
    set("srch", from.y.height);
    set("src_format", source);
    set("dstw", to.y.width);
    set("dsth", to.y.height);
    set("dst_format", destination);
    set("sws_flags", SWS_BICUBIC | SWS_ACCURATE_RND | SWS_FULL_CHR_H_INT);
    const char* const side = source == AV_PIX_FMT_YUV420P ? "src" : "dst";
    set((std::string(side) + "_h_chr_pos").c_str(), kind.isCentred ? 128 : 0);
    set((std::string(side) + "_v_chr_pos").c_str(), ChromaRow(kind, field));
    if (sws_init_context(context.get(), nullptr, nullptr) < 0)
        throw std::runtime_error("swscale refuses the planes");
    const uint8_t* const planes[] = {from.y.Row(0), from.u.Row(0), from.v.Row(0)};
    const int rowBytes[] = {from.y.width, from.u.width, from.v.width};
    uint8_t* const targets[] = {to.y.Row(0), to.u.Row(0), to.v.Row(0)};
    const int targetBytes[] = {to.y.width, to.u.width, to.v.width};
    sws_scale(context.get(), planes, rowBytes, 0, from.y.height, targets, targetBytes);
}

Video DecodeRows(const Video& planes, const Kind& kind, int32_t field) {
    Video pixels = EmptyPixels(planes.y.width, planes.y.height);
    Run(planes, AV_PIX_FMT_YUV420P, pixels, AV_PIX_FMT_YUV444P, kind, field);
    return pixels;
}

Video EncodeRows(const Video& pixels, const Kind& kind, int32_t field) {
    Video planes = EmptyPlanes(pixels.y.width, pixels.y.height);
    Run(pixels, AV_PIX_FMT_YUV444P, planes, AV_PIX_FMT_YUV420P, kind, field);
    return planes;
}

const AddWays add = {{"swscale bicubic", ByFields<DecodeRows>, ByFields<EncodeRows>}};

} // namespace
} // namespace ChromaBench
