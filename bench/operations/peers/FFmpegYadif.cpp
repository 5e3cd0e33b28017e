// FFmpeg's yadif, which interpolates along edges too, of planes. It looks at the frames before and behind as well; all
// are the same here.

#include "operations/Operation.h"

extern "C" {
#include <libavfilter/avfilter.h>
#include <libavfilter/buffersink.h>
#include <libavfilter/buffersrc.h>
#include <libavutil/frame.h>
#include <libavutil/pixdesc.h>
}

#include <algorithm>
#include <memory>
#include <stdexcept>
#include <string>

namespace OperationBench {
namespace {

struct Free {
    void operator()(AVFilterGraph* graph) const { avfilter_graph_free(&graph); }
    void operator()(AVFrame* frame) const { av_frame_free(&frame); }
};

void Check(int result) {
    if (result < 0) throw std::runtime_error("FFmpeg refuses to deinterlace");
}

/// A chain of source, filter and sink on one thread.
class Yadif {
public:
    Yadif(AVPixelFormat format, const uint8_t* bytes)
        : fGraph(avfilter_graph_alloc(), Free()), fFrame(av_frame_alloc(), Free()) {
        fGraph->nb_threads = 1;
        const std::string size = std::to_string(kWidth) + "x" + std::to_string(kHeight);
        fSource = Add("buffer",
                      "video_size=" + size + ":pix_fmt=" + av_get_pix_fmt_name(format) + ":time_base=1/25");
        AVFilterContext* const filter = Add("yadif", "mode=send_frame:parity=tff:deint=all");
        fSink = Add("buffersink", "");
        Check(avfilter_link(fSource, 0, filter, 0));
        Check(avfilter_link(filter, 0, fSink, 0));
        Check(avfilter_graph_config(fGraph.get(), nullptr));
        fFrame->format = format;
        fFrame->width = kWidth;
        fFrame->height = kHeight;
        fFrame->pts = 0;
        Check(av_frame_get_buffer(fFrame.get(), 64));
        for (int plane = 0; plane < av_pix_fmt_count_planes(format); ++plane)
            std::copy_n(bytes, fFrame->linesize[plane] * kHeight, fFrame->data[plane]);
        Push(); // the filter is one frame behind
    }

    void Run() {
        Push();
        const std::unique_ptr<AVFrame, Free> result(av_frame_alloc());
        Check(av_buffersink_get_frame(fSink, result.get()));
    }

private:
    AVFilterContext* Add(const char* name, const std::string& arguments) {
        AVFilterContext* filter = nullptr;
        Check(avfilter_graph_create_filter(&filter, avfilter_get_by_name(name), name, arguments.c_str(),
                                           nullptr, fGraph.get()));
        return filter;
    }

    void Push() {
        ++fFrame->pts;
        Check(av_buffersrc_write_frame(fSource, fFrame.get()));
    }

    std::shared_ptr<AVFilterGraph> fGraph;
    std::shared_ptr<AVFrame> fFrame;
    AVFilterContext *fSource = nullptr, *fSink = nullptr;
};

template <AVPixelFormat kFormat>
Run Deinterlace(const uint8_t* source, uint8_t*) {
    return [yadif = std::make_shared<Yadif>(kFormat, source)] { yadif->Run(); };
}

const AddPeers add = {
    {"Deinterlacing of BGRP 8u along edges, copied", "FFmpeg yadif", false, Deinterlace<AV_PIX_FMT_GBRAP>},
    {"Deinterlacing of UYVY 8u along edges, copied", "FFmpeg yadif", false, Deinterlace<AV_PIX_FMT_YUV422P>},
};

} // namespace
} // namespace OperationBench
