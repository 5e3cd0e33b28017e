// zimg, which is told where chroma lies and which field it is given.

#include "Way.h"

#include <zimg.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>

namespace ChromaBench {
namespace {

struct Free {
    void operator()(void* memory) const { std::free(memory); }
};

/// Rows that begin where zimg wants them to.
class AlignedPlane {
public:
    AlignedPlane(int32_t width, int32_t height)
        : fStride((width + 63) / 64 * 64),
          fMemory(static_cast<uint8_t*>(
              std::aligned_alloc(64, static_cast<size_t>(fStride) * static_cast<size_t>(height)))) {}
    explicit AlignedPlane(const Plane& plane) : AlignedPlane(plane.width, plane.height) {
        for (int32_t row = 0; row < plane.height; ++row) std::copy_n(plane.Row(row), plane.width, Row(row));
    }

    uint8_t* Row(int32_t row) const { return fMemory.get() + ptrdiff_t{row} * fStride; }
    ptrdiff_t Stride() const { return fStride; }

private:
    ptrdiff_t fStride;
    std::unique_ptr<uint8_t, Free> fMemory;
};

void Require(bool isDone) {
    if (isDone) return;
    char words[256] = "";
    zimg_get_last_error(words, sizeof words);
    throw std::runtime_error(std::string("zimg: ") + words);
}

zimg_image_format FormatOf(const Video& video, const Kind& kind, int32_t field) {
    zimg_image_format format;
    zimg_image_format_default(&format, ZIMG_API_VERSION);
    format.width = static_cast<unsigned>(video.y.width);
    format.height = static_cast<unsigned>(video.y.height);
    format.pixel_type = ZIMG_PIXEL_BYTE;
    format.subsample_w = video.u.width == video.y.width ? 0 : 1;
    format.subsample_h = format.subsample_w;
    format.color_family = ZIMG_COLOR_YUV;
    format.matrix_coefficients = ZIMG_MATRIX_BT470_BG;
    format.pixel_range = ZIMG_RANGE_LIMITED;
    format.chroma_location = kind.isCentred ? ZIMG_CHROMA_CENTER : ZIMG_CHROMA_LEFT;
    if (kind.areFields) format.field_parity = field == 0 ? ZIMG_FIELD_TOP : ZIMG_FIELD_BOTTOM;
    return format;
}

template <zimg_resample_filter_e kFilter>
void Run(const Video& from, Video& to, const Kind& kind, int32_t field) {
    const zimg_image_format source = FormatOf(from, kind, field), destination = FormatOf(to, kind, field);
    zimg_graph_builder_params parameters;
    zimg_graph_builder_params_default(&parameters, ZIMG_API_VERSION);
    parameters.resample_filter_uv = kFilter;
    const std::unique_ptr<zimg_filter_graph, void (*)(zimg_filter_graph*)> graph(
        zimg_filter_graph_build(&source, &destination, &parameters), zimg_filter_graph_free);
    Require(graph != nullptr);
    size_t bytes = 0;
    Require(zimg_filter_graph_get_tmp_size(graph.get(), &bytes) == 0);
    const AlignedPlane scratch(static_cast<int32_t>(bytes + 64), 1);
    const AlignedPlane planes[] = {AlignedPlane(from.y), AlignedPlane(from.u), AlignedPlane(from.v)};
    Plane* const results[] = {&to.y, &to.u, &to.v};
    const AlignedPlane targets[] = {
        {to.y.width, to.y.height}, {to.u.width, to.u.height}, {to.v.width, to.v.height}};
    zimg_image_buffer_const input = {};
    zimg_image_buffer output = {};
    input.version = output.version = ZIMG_API_VERSION;
    for (int i = 0; i < 3; ++i) {
        input.plane[i] = {planes[i].Row(0), planes[i].Stride(), ZIMG_BUFFER_MAX};
        output.plane[i] = {targets[i].Row(0), targets[i].Stride(), ZIMG_BUFFER_MAX};
    }
    Require(zimg_filter_graph_process(graph.get(), &input, &output, scratch.Row(0), nullptr, nullptr, nullptr,
                                      nullptr) == 0);
    for (int i = 0; i < 3; ++i)
        for (int32_t row = 0; row < results[i]->height; ++row)
            std::copy_n(targets[i].Row(row), results[i]->width, results[i]->Row(row));
}

template <zimg_resample_filter_e kFilter>
Video DecodeRows(const Video& planes, const Kind& kind, int32_t field) {
    Video pixels = EmptyPixels(planes.y.width, planes.y.height);
    Run<kFilter>(planes, pixels, kind, field);
    return pixels;
}

template <zimg_resample_filter_e kFilter>
Video EncodeRows(const Video& pixels, const Kind& kind, int32_t field) {
    Video planes = EmptyPlanes(pixels.y.width, pixels.y.height);
    Run<kFilter>(pixels, planes, kind, field);
    return planes;
}

const AddWays add = {
    {"zimg bilinear", ByFields<DecodeRows<ZIMG_RESIZE_BILINEAR>>, ByFields<EncodeRows<ZIMG_RESIZE_BILINEAR>>},
    {"zimg bicubic", ByFields<DecodeRows<ZIMG_RESIZE_BICUBIC>>, ByFields<EncodeRows<ZIMG_RESIZE_BICUBIC>>},
};

} // namespace
} // namespace ChromaBench
