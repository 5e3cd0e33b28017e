// zimg, its colours on planes without alpha: a quarter less memory than pixels with it. "Approximate" allows its gamma by table.

#include "frames/peers/ZimgGraph.h"
#include "operations/Operation.h"

namespace OperationBench {
namespace {

struct Colour {
    zimg_color_primaries_e primaries;
    zimg_transfer_characteristics_e transfer;
};

// Transfers of display light: Rec. 709 and Rec. 2020 have the 2.4 power law.
constexpr Colour kRec709 = {ZIMG_PRIMARIES_BT709, ZIMG_TRANSFER_BT709};
constexpr Colour kRec2020 = {ZIMG_PRIMARIES_BT2020, ZIMG_TRANSFER_BT2020_10};
constexpr Colour kP3 = {ZIMG_PRIMARIES_ST432_1, ZIMG_TRANSFER_BT709};
constexpr Colour kPQ = {ZIMG_PRIMARIES_BT2020, ZIMG_TRANSFER_ST2084};
constexpr Colour kHLG = {ZIMG_PRIMARIES_BT2020, ZIMG_TRANSFER_ARIB_B67};

zimg_image_format FormatOf(const Colour& colour) {
    zimg_image_format format = FrameBench::OfSize(kWidth, kHeight, ZIMG_PIXEL_FLOAT);
    format.color_family = ZIMG_COLOR_RGB;
    format.matrix_coefficients = ZIMG_MATRIX_RGB;
    format.color_primaries = colour.primaries;
    format.transfer_characteristics = colour.transfer;
    return format;
}

template <const Colour& kFrom, const Colour& kTo, bool kApproximate>
Run Convert(const uint8_t*, uint8_t*) {
    constexpr int32_t kRowBytes = 4 * kWidth;
    const auto from = std::make_shared<FrameBench::Planes>(3, kRowBytes, kHeight);
    const auto to = std::make_shared<FrameBench::Planes>(3, kRowBytes, kHeight);
    from->Fill<float>(kWidth, 0, 1);
    const auto graph = std::make_shared<FrameBench::Graph>(FormatOf(kFrom), FormatOf(kTo), kApproximate);
    return [=] {
        graph->Process(FrameBench::BufferOf<zimg_image_buffer_const>(*from, kRowBytes),
                       FrameBench::BufferOf<zimg_image_buffer>(*to, kRowBytes));
    };
}

struct FloatPlanes {
    using Sample = float;
    static constexpr auto kType = ZIMG_PIXEL_FLOAT;
    static void Fill(FrameBench::Planes& planes, int32_t width) { planes.Fill<float>(width, 0, 1); }
};
struct BytePlanes {
    using Sample = uint8_t;
    static constexpr auto kType = ZIMG_PIXEL_BYTE;
    static void Fill(FrameBench::Planes& planes, int32_t width) { planes.Fill<uint8_t>(width, 0, 256); }
};

/// Four planes one after the other; the cubic is that of motion.
template <class Kind, zimg_resample_filter_e kFilter, int32_t kFromWidth, int32_t kFromHeight,
          int32_t kToWidth, int32_t kToHeight>
Run Scale(const uint8_t*, uint8_t*) {
    constexpr int32_t kSample = sizeof(typename Kind::Sample);
    constexpr int32_t kFromRowBytes = kSample * kFromWidth, kToRowBytes = kSample * kToWidth;
    const auto from = std::make_shared<FrameBench::Planes>(4, kFromRowBytes, kFromHeight);
    const auto to = std::make_shared<FrameBench::Planes>(4, kToRowBytes, kToHeight);
    Kind::Fill(*from, kFromWidth);
    zimg_graph_builder_params params = FrameBench::ParamsOfZimg();
    params.resample_filter = kFilter;
    params.filter_param_a = 0;
    params.filter_param_b = 0.75;
    const auto graph =
        std::make_shared<FrameBench::Graph>(FrameBench::OfSize(kFromWidth, kFromHeight, Kind::kType),
                                            FrameBench::OfSize(kToWidth, kToHeight, Kind::kType), params);
    return [=] {
        for (int plane = 0; plane < 4; ++plane) {
            auto source = FrameBench::EmptyBuffer<zimg_image_buffer_const>();
            auto destination = FrameBench::EmptyBuffer<zimg_image_buffer>();
            source.plane[0].data = from->Plane(plane);
            source.plane[0].stride = kFromRowBytes;
            destination.plane[0].data = to->Plane(plane);
            destination.plane[0].stride = kToRowBytes;
            graph->Process(source, destination);
        }
    };
}

constexpr int32_t kHalfWidth = kWidth / 2, kHalfHeight = kHeight / 2;

template <class Kind, zimg_resample_filter_e kFilter>
constexpr Prepare Reduce = Scale<Kind, kFilter, kWidth, kHeight, kHalfWidth, kHalfHeight>;

const AddPeers addScaling = {
    {"Placing of BGRP 32f at twice the size, cubic", "zimg bicubic (planes)", false,
     Scale<FloatPlanes, ZIMG_RESIZE_BICUBIC, kHalfWidth, kHalfHeight, kWidth, kHeight>},
    {"Placing of BGRP 32f at half the size, cubic", "zimg bicubic (planes)", false,
     Reduce<FloatPlanes, ZIMG_RESIZE_BICUBIC>},
    {"Scaling of BGRA 8u to half the size, quality 3", "zimg bilinear (planes)", false,
     Reduce<BytePlanes, ZIMG_RESIZE_BILINEAR>},
    {"Scaling of BGRA 8u to half the size, quality 5", "zimg bicubic (planes of codes)", false,
     Reduce<BytePlanes, ZIMG_RESIZE_BICUBIC>},
};

template <const Colour& kFrom, const Colour& kTo>
void AddBoth(const char* operation) {
    AddPeers{{operation, "zimg", false, Convert<kFrom, kTo, false>},
             {operation, "zimg, approximate", false, Convert<kFrom, kTo, true>, false}};
}

const bool areAdded = [] {
    AddBoth<kRec709, kRec2020>("Rec. 709 to Rec. 2020");
    AddBoth<kRec2020, kRec709>("Rec. 2020 to Rec. 709");
    AddBoth<kRec709, kP3>("Rec. 709 to P3");
    AddBoth<kP3, kRec709>("P3 to Rec. 709");
    AddBoth<kRec709, kPQ>("Rec. 709 to PQ");
    AddBoth<kPQ, kRec709>("PQ to Rec. 709");
    AddBoth<kRec709, kHLG>("Rec. 709 to HLG");
    AddBoth<kHLG, kRec709>("HLG to Rec. 709");
    return true;
}();

} // namespace
} // namespace OperationBench
