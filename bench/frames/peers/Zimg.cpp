// zimg. Depths change on all samples of a row as one plane, which is the work that we do; colour wants three
// planes and leaves alpha out, which for the matrix, where memory is what costs, is a quarter less work.
// "Approximate" allows its gamma by table.

#include "frames/Peer.h"
#include "frames/peers/Planes.h"

#include <zimg.h>

#include <cstdio>
#include <cstdlib>

namespace FrameBench {
namespace {

constexpr size_t kAlignment = 64;

struct Graph {
    Graph(const zimg_image_format& source, const zimg_image_format& destination, bool approximate) {
        zimg_graph_builder_params params;
        zimg_graph_builder_params_default(&params, ZIMG_API_VERSION);
        params.cpu_type = ZIMG_CPU_AUTO_64B;
        params.allow_approximate_gamma = approximate;
        graph.reset(zimg_filter_graph_build(&source, &destination, &params));
        if (!graph) {
            char message[256];
            zimg_get_last_error(message, sizeof message);
            std::fprintf(stderr, "zimg: %s\n", message);
            std::exit(1);
        }
        size_t bytes = 0;
        zimg_filter_graph_get_tmp_size(graph.get(), &bytes);
        scratch = Allocate(bytes + kAlignment);
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
};

template <class Buffer>
Buffer EmptyBuffer() {
    Buffer buffer = {};
    buffer.version = ZIMG_API_VERSION;
    for (auto& plane : buffer.plane) plane.mask = ZIMG_BUFFER_MAX;
    return buffer;
}

template <class Buffer>
Buffer BufferOf(const Image& image) {
    Buffer buffer = EmptyBuffer<Buffer>();
    buffer.plane[0].data = image.bytes.get();
    buffer.plane[0].stride = image.rowBytes;
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

zimg_image_format OfSize(uint32_t width, zimg_pixel_type_e type) {
    zimg_image_format format;
    zimg_image_format_default(&format, ZIMG_API_VERSION);
    format.width = width;
    format.height = kHeight;
    format.pixel_type = type;
    format.depth = type == ZIMG_PIXEL_BYTE ? 8 : type == ZIMG_PIXEL_WORD ? 15 : 32;
    format.pixel_range = ZIMG_RANGE_FULL;
    return format;
}

template <zimg_pixel_type_e kSource, zimg_pixel_type_e kDestination>
Run ChangeDepth(const Image& source, const Image& destination) {
    const auto graph =
        std::make_shared<Graph>(OfSize(4 * kWidth, kSource), OfSize(4 * kWidth, kDestination), false);
    return [graph, from = BufferOf<zimg_image_buffer_const>(source),
            to = BufferOf<zimg_image_buffer>(destination)] { graph->Process(from, to); };
}

zimg_image_format Colour(zimg_pixel_type_e type, zimg_transfer_characteristics_e transfer,
                         zimg_matrix_coefficients_e matrix) {
    zimg_image_format format = OfSize(kWidth, type);
    format.color_family = matrix == ZIMG_MATRIX_RGB ? ZIMG_COLOR_RGB : ZIMG_COLOR_YUV;
    format.matrix_coefficients = matrix;
    format.transfer_characteristics = transfer;
    format.color_primaries = ZIMG_PRIMARIES_BT709;
    return format;
}

constexpr int32_t RowBytes(zimg_pixel_type_e type) {
    return type == ZIMG_PIXEL_BYTE ? kWidth : 4 * kWidth;
}

Run BetweenPlanes(const zimg_image_format& source, const zimg_image_format& destination, bool approximate) {
    const int32_t fromBytes = RowBytes(source.pixel_type);
    const int32_t toBytes = RowBytes(destination.pixel_type);
    const auto from = std::make_shared<Planes>(3, fromBytes);
    const auto to = std::make_shared<Planes>(3, toBytes);
    if (source.pixel_type == ZIMG_PIXEL_BYTE)
        from->Fill<uint8_t>(kWidth, 0, 256);
    else
        from->Fill<float>(kWidth, 0, 1);
    const auto graph = std::make_shared<Graph>(source, destination, approximate);
    return [=] {
        graph->Process(BufferOf<zimg_image_buffer_const>(*from, fromBytes),
                       BufferOf<zimg_image_buffer>(*to, toBytes));
    };
}

template <zimg_pixel_type_e kGammaType, bool kApproximate>
Run ToLinear(const Image&, const Image&) {
    return BetweenPlanes(Colour(kGammaType, ZIMG_TRANSFER_BT709, ZIMG_MATRIX_RGB),
                         Colour(ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_LINEAR, ZIMG_MATRIX_RGB), kApproximate);
}

template <zimg_pixel_type_e kGammaType, bool kApproximate>
Run ToGamma(const Image&, const Image&) {
    return BetweenPlanes(Colour(ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_LINEAR, ZIMG_MATRIX_RGB),
                         Colour(kGammaType, ZIMG_TRANSFER_BT709, ZIMG_MATRIX_RGB), kApproximate);
}

template <zimg_matrix_coefficients_e kSource, zimg_matrix_coefficients_e kDestination>
Run ChangeMatrix(const Image&, const Image&) {
    return BetweenPlanes(Colour(ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_BT709, kSource),
                         Colour(ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_BT709, kDestination), false);
}

constexpr PK_PixelFormat kBGRA8 = PK_PixelFormat_BGRA_4444_8u;
constexpr PK_PixelFormat kBGRA15 = PK_PixelFormat_BGRA_4444_15u;
constexpr PK_PixelFormat kBGRA32f = PK_PixelFormat_BGRA_4444_32f;
constexpr PK_PixelFormat kLinear = PK_PixelFormat_BGRA_4444_32f_Linear;
constexpr PK_PixelFormat kVUYA32f = PK_PixelFormat_VUYA_4444_32f;

const AddPeers add = {
    {kBGRA8, kBGRA32f, "zimg", Likeness::Same, ChangeDepth<ZIMG_PIXEL_BYTE, ZIMG_PIXEL_FLOAT>},
    {kBGRA32f, kBGRA8, "zimg", Likeness::Same, ChangeDepth<ZIMG_PIXEL_FLOAT, ZIMG_PIXEL_BYTE>},
    {kBGRA8, kBGRA15, "zimg (to 32767)", Likeness::Same, ChangeDepth<ZIMG_PIXEL_BYTE, ZIMG_PIXEL_WORD>},
    {kBGRA15, kBGRA8, "zimg (from 32767)", Likeness::Same, ChangeDepth<ZIMG_PIXEL_WORD, ZIMG_PIXEL_BYTE>},
    {kBGRA32f, kVUYA32f, "zimg (planar, no alpha)", Likeness::Part,
     ChangeMatrix<ZIMG_MATRIX_RGB, ZIMG_MATRIX_BT470_BG>},
    {kVUYA32f, kBGRA32f, "zimg (planar, no alpha)", Likeness::Part,
     ChangeMatrix<ZIMG_MATRIX_BT470_BG, ZIMG_MATRIX_RGB>},
    {kBGRA8, kLinear, "zimg (planar, no alpha)", Likeness::OtherLayout, ToLinear<ZIMG_PIXEL_BYTE, false>},
    {kBGRA8, kLinear, "zimg (planar, no alpha, approximate)", Likeness::Part,
     ToLinear<ZIMG_PIXEL_BYTE, true>},
    {kLinear, kBGRA8, "zimg (planar, no alpha)", Likeness::OtherLayout, ToGamma<ZIMG_PIXEL_BYTE, false>},
    {kLinear, kBGRA8, "zimg (planar, no alpha, approximate)", Likeness::Part, ToGamma<ZIMG_PIXEL_BYTE, true>},
    {kBGRA32f, kLinear, "zimg (planar, no alpha)", Likeness::OtherLayout, ToLinear<ZIMG_PIXEL_FLOAT, false>},
    {kBGRA32f, kLinear, "zimg (planar, no alpha, approximate)", Likeness::Part,
     ToLinear<ZIMG_PIXEL_FLOAT, true>},
    {kLinear, kBGRA32f, "zimg (planar, no alpha)", Likeness::OtherLayout, ToGamma<ZIMG_PIXEL_FLOAT, false>},
    {kLinear, kBGRA32f, "zimg (planar, no alpha, approximate)", Likeness::Part,
     ToGamma<ZIMG_PIXEL_FLOAT, true>},
};

} // namespace
} // namespace FrameBench
