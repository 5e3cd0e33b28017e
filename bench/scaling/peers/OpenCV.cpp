// OpenCV's resize, on floats and, of large frames, on pixels. It knows neither pairs nor planes, which it converts as they
// are, nor rows in the other order.

#include "Reducer.h"
#include "Scaler.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include <algorithm>

namespace Scaling {
namespace {

cv::Mat Wrap(const Grey& grey) {
    return {grey.height, grey.width, CV_32FC1, const_cast<float*>(grey.Row(0))};
}

template <int kInterpolation>
Grey Resize(const Grey& from, int32_t width, int32_t height) {
    Grey to(width, height);
    const cv::Mat result = Wrap(to);
    cv::resize(Wrap(from), result, result.size(), 0, 0, kInterpolation);
    return to;
}

cv::Mat Wrap(const tool::Frame& frame) {
    return {frame.Height(), frame.Width(), CV_8UC4, const_cast<uint8_t*>(frame.Pixels()),
            static_cast<size_t>(frame.RowBytes())};
}

template <int kInterpolation>
Reduction ReducePixels(const tool::Frame& source) {
    return ReductionTo([from = Wrap(source)](tool::Frame& result) {
        const cv::Mat to = Wrap(result);
        cv::resize(from, to, to.size(), 0, 0, kInterpolation);
    });
}

Reduction ReduceVideo(const cv::Mat& video, cv::ColorConversionCodes code) {
    Reduction reduction =
        ReductionTo([=, pixels = cv::Mat(kLargeHeight, kLargeWidth, CV_8UC4)](tool::Frame& result) {
            cv::cvtColor(video, pixels, code);
            const cv::Mat to = Wrap(result);
            cv::resize(pixels, to, to.size(), 0, 0, cv::INTER_AREA);
        });
    reduction.finish = [result = reduction.result] {
        PK_FlipInPlace(result->Pixels(), result->RowBytes(), kHalfWidth, kHalfHeight, kPixels);
    };
    return reduction;
}

Reduction ReducePairs(const tool::Frame& source) {
    return ReduceVideo({kLargeHeight, kLargeWidth, CV_8UC2, const_cast<uint8_t*>(source.Pixels()),
                        static_cast<size_t>(source.RowBytes())},
                       cv::COLOR_YUV2BGRA_UYVY);
}

/// It wants the planes one after the other without padding.
Reduction ReducePlanes(const tool::Frame& source) {
    const cv::Mat planes(kLargeHeight * 3 / 2, kLargeWidth, CV_8UC1);
    uint8_t* to = planes.data;
    for (const tool::Plane& plane : source.Planes())
        for (int32_t row = 0; row < plane.rows; ++row)
            to = std::copy_n(plane.first + ptrdiff_t{row} * plane.rowBytes, plane.packedRowBytes, to);
    return ReduceVideo(planes, cv::COLOR_YUV2BGRA_I420);
}

const AddScalers add = {
    {"OpenCV linear", Resize<cv::INTER_LINEAR>},
    {"OpenCV cubic", Resize<cv::INTER_CUBIC>},
    {"OpenCV area", Resize<cv::INTER_AREA>},
};

const AddReducers addReducers = {
    {kPixels, "OpenCV linear", ReducePixels<cv::INTER_LINEAR>, false}, // draws what its area draws
    {kPixels, "OpenCV area", ReducePixels<cv::INTER_AREA>},
    {kPairs, "OpenCV, pixels, area", ReducePairs},
    {kPlanes, "OpenCV, pixels, area", ReducePlanes},
};

const bool onOneThread = [] {
    cv::setNumThreads(1);
    return true;
}();

} // namespace
} // namespace Scaling
