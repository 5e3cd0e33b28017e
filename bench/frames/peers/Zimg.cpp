// zimg. Depths change on all samples of a row as one plane, which is the work that we do; colour wants three
// planes and leaves alpha out, which for the matrix, where memory is what costs, is a quarter less work.
// "Approximate" allows its gamma by table.

#include "frames/Peer.h"
#include "frames/peers/ZimgGraph.h"

namespace FrameBench {
namespace {

template <class Buffer>
Buffer BufferOf(const Image& image) {
    Buffer buffer = EmptyBuffer<Buffer>();
    buffer.plane[0].data = image.bytes.get();
    buffer.plane[0].stride = image.rowBytes;
    return buffer;
}

template <zimg_pixel_type_e kSource, zimg_pixel_type_e kDestination>
Run ChangeDepth(const Image& source, const Image& destination) {
    const auto [width, height] = source.size;
    const auto graph = std::make_shared<Graph>(OfSize(4 * width, height, kSource),
                                               OfSize(4 * width, height, kDestination), false);
    return [graph, from = BufferOf<zimg_image_buffer_const>(source),
            to = BufferOf<zimg_image_buffer>(destination)] { graph->Process(from, to); };
}

zimg_image_format Colour(Size size, zimg_pixel_type_e type, zimg_transfer_characteristics_e transfer,
                         zimg_matrix_coefficients_e matrix) {
    zimg_image_format format = OfSize(size.width, size.height, type);
    format.color_family = matrix == ZIMG_MATRIX_RGB ? ZIMG_COLOR_RGB : ZIMG_COLOR_YUV;
    format.matrix_coefficients = matrix;
    format.transfer_characteristics = transfer;
    format.color_primaries = ZIMG_PRIMARIES_BT709;
    return format;
}

int32_t RowBytes(const zimg_image_format& format) {
    return static_cast<int32_t>(format.pixel_type == ZIMG_PIXEL_BYTE ? format.width : 4 * format.width);
}

Run BetweenPlanes(const zimg_image_format& source, const zimg_image_format& destination, bool approximate) {
    const auto width = static_cast<int32_t>(source.width), height = static_cast<int32_t>(source.height);
    const int32_t fromBytes = RowBytes(source);
    const int32_t toBytes = RowBytes(destination);
    const auto from = std::make_shared<Planes>(3, fromBytes, height);
    const auto to = std::make_shared<Planes>(3, toBytes, height);
    if (source.pixel_type == ZIMG_PIXEL_BYTE)
        from->Fill<uint8_t>(width, 0, 256);
    else
        from->Fill<float>(width, 0, 1);
    const auto graph = std::make_shared<Graph>(source, destination, approximate);
    return [=] {
        graph->Process(BufferOf<zimg_image_buffer_const>(*from, fromBytes),
                       BufferOf<zimg_image_buffer>(*to, toBytes));
    };
}

template <zimg_pixel_type_e kGammaType, bool kApproximate>
Run ToLinear(const Image& source, const Image&) {
    return BetweenPlanes(Colour(source.size, kGammaType, ZIMG_TRANSFER_BT709, ZIMG_MATRIX_RGB),
                         Colour(source.size, ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_LINEAR, ZIMG_MATRIX_RGB),
                         kApproximate);
}

template <zimg_pixel_type_e kGammaType, bool kApproximate>
Run ToGamma(const Image& source, const Image&) {
    return BetweenPlanes(Colour(source.size, ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_LINEAR, ZIMG_MATRIX_RGB),
                         Colour(source.size, kGammaType, ZIMG_TRANSFER_BT709, ZIMG_MATRIX_RGB), kApproximate);
}

template <zimg_matrix_coefficients_e kSource, zimg_matrix_coefficients_e kDestination>
Run ChangeMatrix(const Image& source, const Image&) {
    return BetweenPlanes(Colour(source.size, ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_BT709, kSource),
                         Colour(source.size, ZIMG_PIXEL_FLOAT, ZIMG_TRANSFER_BT709, kDestination), false);
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
