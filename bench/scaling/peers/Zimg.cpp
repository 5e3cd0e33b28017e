// zimg on the planes of large frames, which are made of pixels and pixels of them before and after what is measured. Its
// cubic is that of motion.

#include "Reducer.h"

#include "frames/peers/ZimgGraph.h"

#include <algorithm>

namespace Scaling {
namespace {

using FrameBench::Graph;
using FrameBench::Planes;

constexpr int32_t kChannels = 4;

/// Channels of pixels, Y, U and V of pairs, or planes as they are; rows from the first in memory.
std::shared_ptr<Planes> PlanesOf(const tool::Frame& source) {
    const auto planes = std::make_shared<Planes>(kChannels, kLargeWidth, kLargeHeight);
    const std::vector<tool::Plane> from = source.Planes();
    const auto row = [&](int32_t plane, int32_t y) {
        return planes->Plane(plane) + ptrdiff_t{y} * kLargeWidth;
    };
    const auto spread = [&](int32_t plane, int32_t first, int32_t step) {
        for (int32_t y = 0; y < kLargeHeight; ++y) {
            const uint8_t* sample = from[0].first + ptrdiff_t{y} * from[0].rowBytes + first;
            for (int32_t x = 0; x < from[0].packedRowBytes / step; ++x, sample += step)
                row(plane, y)[x] = *sample;
        }
    };
    if (source.Format() == kPixels) {
        for (int32_t channel = 0; channel < kChannels; ++channel) spread(channel, channel, 4);
    } else if (source.Format() == kPairs) {
        spread(0, 1, 2);
        spread(1, 0, 4);
        spread(2, 2, 4);
    } else {
        for (int32_t i = 0; i < 3; ++i) {
            const tool::Plane& plane = from[static_cast<size_t>(i)];
            for (int32_t y = 0; y < plane.rows; ++y)
                std::copy_n(plane.first + ptrdiff_t{y} * plane.rowBytes, plane.packedRowBytes, row(i, y));
        }
    }
    return planes;
}

/// \param isTurned  whether the planes begin at the bottom, as a frame does.
void ToPixels(const Planes& planes, tool::Frame& frame, bool isTurned) {
    for (int32_t y = 0; y < kHalfHeight; ++y) {
        const ptrdiff_t at = ptrdiff_t{isTurned ? kHalfHeight - 1 - y : y} * kHalfWidth;
        for (int32_t x = 0; x < kHalfWidth; ++x)
            for (int32_t channel = 0; channel < kChannels; ++channel)
                frame.Row(y)[4 * x + channel] = planes.Plane(channel)[at + x];
    }
}

template <zimg_resample_filter_e kFilter>
zimg_graph_builder_params Params() {
    zimg_graph_builder_params params = FrameBench::ParamsOfZimg();
    params.resample_filter = params.resample_filter_uv = kFilter;
    params.filter_param_a = params.filter_param_a_uv = 0;
    params.filter_param_b = params.filter_param_b_uv = 0.75;
    return params;
}

zimg_image_format ColourOf(int32_t width, int32_t height) {
    zimg_image_format format = FrameBench::OfSize(width, height, ZIMG_PIXEL_BYTE);
    format.color_family = ZIMG_COLOR_RGB;
    format.matrix_coefficients = ZIMG_MATRIX_RGB;
    return format;
}

zimg_image_format VideoOf(PK_PixelFormat kind) {
    zimg_image_format format = FrameBench::OfSize(kLargeWidth, kLargeHeight, ZIMG_PIXEL_BYTE);
    format.color_family = ZIMG_COLOR_YUV;
    format.matrix_coefficients = ZIMG_MATRIX_BT470_BG;
    format.pixel_range = ZIMG_RANGE_LIMITED;
    format.chroma_location = ZIMG_CHROMA_LEFT;
    format.subsample_w = 1;
    format.subsample_h = kind == kPlanes ? 1 : 0;
    return format;
}

/// \param run  given planes of the source and of the result.
template <typename Run>
Reduction ReductionOf(const tool::Frame& source, Run run) {
    const auto to = std::make_shared<Planes>(kChannels, kHalfWidth, kHalfHeight);
    const auto result = std::make_shared<tool::Frame>(kPixels, kHalfWidth, kHalfHeight);
    return {result, [=, from = PlanesOf(source)] { run(*from, *to); },
            [=, isTurned = source.Format() == kPixels] { ToPixels(*to, *result, isTurned); }};
}

/// Four planes one after the other.
template <zimg_resample_filter_e kFilter>
Reduction ReducePixels(const tool::Frame& source) {
    const auto graph = std::make_shared<Graph>(FrameBench::OfSize(kLargeWidth, kLargeHeight, ZIMG_PIXEL_BYTE),
                                               FrameBench::OfSize(kHalfWidth, kHalfHeight, ZIMG_PIXEL_BYTE),
                                               Params<kFilter>());
    return ReductionOf(source, [graph](const Planes& from, const Planes& to) {
        for (int32_t plane = 0; plane < kChannels; ++plane) {
            auto input = FrameBench::EmptyBuffer<zimg_image_buffer_const>();
            auto output = FrameBench::EmptyBuffer<zimg_image_buffer>();
            input.plane[0].data = from.Plane(plane);
            input.plane[0].stride = kLargeWidth;
            output.plane[0].data = to.Plane(plane);
            output.plane[0].stride = kHalfWidth;
            graph->Process(input, output);
        }
    });
}

zimg_image_buffer_const InputOf(const Planes& planes) {
    return FrameBench::BufferOf<zimg_image_buffer_const>(planes, kLargeWidth);
}

/// Its first three planes are red, green and blue, those of a result blue, green and red.
zimg_image_buffer OutputOf(const Planes& planes) {
    auto output = FrameBench::BufferOf<zimg_image_buffer>(planes, kHalfWidth);
    std::swap(output.plane[0], output.plane[2]);
    return output;
}

template <zimg_resample_filter_e kFilter>
Reduction ReduceVideo(const tool::Frame& source) {
    const auto graph = std::make_shared<Graph>(VideoOf(source.Format()), ColourOf(kHalfWidth, kHalfHeight),
                                               Params<kFilter>());
    return ReductionOf(source, [graph](const Planes& from, const Planes& to) {
        graph->Process(InputOf(from), OutputOf(to));
    });
}

/// Colour alone: to light, which is then reduced and encoded again.
/// \param kIsApproximate  whether curves may come from tables.
template <bool kIsApproximate>
Reduction ReduceLight(const tool::Frame& source) {
    constexpr int32_t kFloats = 4 * kLargeWidth;
    const auto coded = [](int32_t width, int32_t height) {
        zimg_image_format format = ColourOf(width, height);
        format.color_primaries = ZIMG_PRIMARIES_BT709;
        format.transfer_characteristics = ZIMG_TRANSFER_BT709; // the power of 2.4, as displays have it
        return format;
    };
    zimg_image_format light = coded(kLargeWidth, kLargeHeight);
    light.pixel_type = ZIMG_PIXEL_FLOAT;
    light.depth = 32;
    light.transfer_characteristics = ZIMG_TRANSFER_LINEAR;
    zimg_graph_builder_params params = Params<ZIMG_RESIZE_BICUBIC>();
    params.allow_approximate_gamma = kIsApproximate;
    const auto decode = std::make_shared<Graph>(coded(kLargeWidth, kLargeHeight), light, params);
    const auto reduce = std::make_shared<Graph>(light, coded(kHalfWidth, kHalfHeight), params);
    const auto floats = std::make_shared<Planes>(3, kFloats, kLargeHeight);
    return ReductionOf(source, [=](const Planes& from, const Planes& to) {
        decode->Process(InputOf(from), FrameBench::BufferOf<zimg_image_buffer>(*floats, kFloats));
        reduce->Process(FrameBench::BufferOf<zimg_image_buffer_const>(*floats, kFloats),
                        FrameBench::BufferOf<zimg_image_buffer>(to, kHalfWidth));
    });
}

const AddReducers add = {
    {kPixels, "zimg bilinear (planes)", ReducePixels<ZIMG_RESIZE_BILINEAR>},
    {kPixels, "zimg bicubic (planes)", ReducePixels<ZIMG_RESIZE_BICUBIC>},
    {kPixels, "zimg bicubic, of light", ReduceLight<false>},
    {kPixels, "zimg bicubic, of light, approximate", ReduceLight<true>, false},
    {kPairs, "zimg bilinear (planes)", ReduceVideo<ZIMG_RESIZE_BILINEAR>},
    {kPairs, "zimg bicubic (planes)", ReduceVideo<ZIMG_RESIZE_BICUBIC>},
    {kPlanes, "zimg bilinear (planes)", ReduceVideo<ZIMG_RESIZE_BILINEAR>},
    {kPlanes, "zimg bicubic (planes)", ReduceVideo<ZIMG_RESIZE_BICUBIC>},
};

} // namespace
} // namespace Scaling
