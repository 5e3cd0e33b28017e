#pragma once

// What the benchmarks share to run zimg.

#include "frames/peers/Planes.h"

#include <zimg.h>

#include <cstdio>
#include <cstdlib>

namespace FrameBench {

inline zimg_graph_builder_params ParamsOfZimg() {
    zimg_graph_builder_params params;
    zimg_graph_builder_params_default(&params, ZIMG_API_VERSION);
    params.cpu_type = ZIMG_CPU_AUTO_64B;
    return params;
}

/// A conversion of zimg with its scratch memory.
struct Graph {
    Graph(const zimg_image_format& source, const zimg_image_format& destination, bool approximate) {
        zimg_graph_builder_params params = ParamsOfZimg();
        params.allow_approximate_gamma = approximate;
        Build(source, destination, params);
    }

    Graph(const zimg_image_format& source, const zimg_image_format& destination,
          const zimg_graph_builder_params& params) {
        Build(source, destination, params);
    }

    void Process(const zimg_image_buffer_const& source, const zimg_image_buffer& destination) const {
        zimg_filter_graph_process(graph.get(), &source, &destination, scratch.get(), nullptr, nullptr,
                                  nullptr, nullptr);
    }

    struct FreeGraph {
        void operator()(zimg_filter_graph* each) const { zimg_filter_graph_free(each); }
    };
    std::unique_ptr<zimg_filter_graph, FreeGraph> graph;
    Bytes scratch;

private:
    void Build(const zimg_image_format& source, const zimg_image_format& destination,
               const zimg_graph_builder_params& params) {
        graph.reset(zimg_filter_graph_build(&source, &destination, &params));
        if (!graph) {
            char message[256];
            zimg_get_last_error(message, sizeof message);
            std::fprintf(stderr, "zimg: %s\n", message);
            std::exit(1);
        }
        constexpr size_t kAlignment = 64;
        size_t bytes = 0;
        zimg_filter_graph_get_tmp_size(graph.get(), &bytes);
        scratch = Allocate(bytes + kAlignment);
    }
};

template <class Buffer>
Buffer EmptyBuffer() {
    Buffer buffer = {};
    buffer.version = ZIMG_API_VERSION;
    for (auto& plane : buffer.plane) plane.mask = ZIMG_BUFFER_MAX;
    return buffer;
}

template <class Buffer>
Buffer BufferOf(const Planes& planes, int32_t rowBytes) {
    Buffer buffer = EmptyBuffer<Buffer>();
    for (int i = 0; i < 3; ++i) {
        buffer.plane[i].data = planes.Plane(i);
        buffer.plane[i].stride = rowBytes;
    }
    return buffer;
}

/// Depth and range go with the type.
inline zimg_image_format OfSize(int32_t width, int32_t height, zimg_pixel_type_e type) {
    zimg_image_format format;
    zimg_image_format_default(&format, ZIMG_API_VERSION);
    format.width = static_cast<unsigned>(width);
    format.height = static_cast<unsigned>(height);
    format.pixel_type = type;
    format.depth = type == ZIMG_PIXEL_BYTE ? 8 : type == ZIMG_PIXEL_WORD ? 15 : 32;
    format.pixel_range = ZIMG_RANGE_FULL;
    return format;
}

} // namespace FrameBench
