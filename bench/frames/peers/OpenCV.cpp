// OpenCV, on one thread. It has no rows in the other direction, so that it leaves a picture as it lies.

#include "frames/Peer.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include <cmath>

namespace FrameBench {
namespace {

template <int kType>
cv::Mat Wrap(const Image& image) {
    return {image.size.height, image.size.width, kType, image.bytes.get(),
            static_cast<size_t>(image.rowBytes)};
}

template <int kType>
Run ReverseChannels(const Image& source, const Image& destination) {
    return [from = Wrap<kType>(source), to = Wrap<kType>(destination)]() mutable {
        constexpr int pairs[] = {0, 3, 1, 2, 2, 1, 3, 0};
        cv::mixChannels(&from, 1, &to, 1, pairs, 4);
    };
}

Run ForceOpaque(const Image& source, const Image& destination) {
    return [from = Wrap<CV_8UC4>(source), to = Wrap<CV_8UC4>(destination)] {
        cv::bitwise_or(from, cv::Scalar(0, 0, 0, 255), to);
    };
}

template <int kSourceType, int kDestinationType, int kNumerator, int kDenominator>
Run ChangeDepth(const Image& source, const Image& destination) {
    return [from = Wrap<kSourceType>(source), to = Wrap<kDestinationType>(destination)] {
        from.convertTo(to, kDestinationType, static_cast<double>(kNumerator) / kDenominator);
    };
}

template <int kCode, int kSourceType>
Run ChangeColour(const Image& source, const Image& destination) {
    return [from = Wrap<kSourceType>(source), to = Wrap<CV_8UC4>(destination)] {
        cv::cvtColor(from, to, kCode);
    };
}

Run LookUpLinear(const Image& source, const Image& destination) {
    cv::Mat table(1, 256, CV_32FC4);
    for (int code = 0; code < 256; ++code) {
        const auto linear = static_cast<float>(std::pow(code / 255.0, 2.4));
        table.at<cv::Vec4f>(code) = {linear, linear, linear, static_cast<float>(code / 255.0)};
    }
    return
        [table, from = Wrap<CV_8UC4>(source), to = Wrap<CV_32FC4>(destination)] { cv::LUT(from, table, to); };
}

const AddPeers add = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_8u, "OpenCV mixChannels", Likeness::Same,
     ReverseChannels<CV_8UC4>},
    {PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_ARGB_4444_15u, "OpenCV mixChannels", Likeness::Same,
     ReverseChannels<CV_16UC4>},
    {PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_ARGB_4444_32f, "OpenCV mixChannels", Likeness::Same,
     ReverseChannels<CV_32FC4>},
    {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u, "OpenCV bitwise_or", Likeness::Same,
     ForceOpaque},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, "OpenCV cvtColor", Likeness::Same,
     ChangeColour<cv::COLOR_RGBA2mRGBA, CV_8UC4>},
    {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRA_4444_8u, "OpenCV cvtColor", Likeness::Same,
     ChangeColour<cv::COLOR_mRGBA2RGBA, CV_8UC4>},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_32f, "OpenCV convertTo", Likeness::Same,
     ChangeDepth<CV_8UC4, CV_32FC4, 1, 255>},
    {PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_8u, "OpenCV convertTo", Likeness::Same,
     ChangeDepth<CV_32FC4, CV_8UC4, 255, 1>},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_15u, "OpenCV convertTo", Likeness::Same,
     ChangeDepth<CV_8UC4, CV_16UC4, 32768, 255>},
    {PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRA_4444_8u, "OpenCV convertTo", Likeness::Same,
     ChangeDepth<CV_16UC4, CV_8UC4, 255, 32768>},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_8u, "OpenCV cvtColor (picture not turned over)",
     Likeness::OtherLayout, ChangeColour<cv::COLOR_YUV2BGRA_UYVY, CV_8UC2>},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_32f_Linear, "OpenCV LUT", Likeness::Same,
     LookUpLinear},
};

const bool onOneThread = [] {
    cv::setNumThreads(1);
    return true;
}();

} // namespace
} // namespace FrameBench
