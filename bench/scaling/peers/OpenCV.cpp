// OpenCV's resize, on floats.

#include "Scaler.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

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

const AddScalers add = {
    {"OpenCV linear", Resize<cv::INTER_LINEAR>},
    {"OpenCV cubic", Resize<cv::INTER_CUBIC>},
    {"OpenCV area", Resize<cv::INTER_AREA>},
};

} // namespace
} // namespace Scaling
