// OpenCV, on one thread.

#include "operations/OpaqueImages.h"
#include "operations/Operation.h"
#include "operations/WarpQuad.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include <vector>

namespace OperationBench {
namespace {

cv::Mat Wrap(const uint8_t* bytes, int32_t width, int32_t height, int type) {
    return {height, width, type, const_cast<uint8_t*>(bytes)};
}

cv::Mat Upright(const uint8_t* bytes, int type = CV_8UC4) {
    return Wrap(bytes, kWidth, kHeight, type);
}
cv::Mat Turned(const uint8_t* bytes, int type = CV_8UC4) {
    return Wrap(bytes, kHeight, kWidth, type);
}

Run FromRGB(const uint8_t* source, uint8_t* destination) {
    return [from = Wrap(source, kWidth, kHeight, CV_8UC3), to = Upright(destination)] {
        cv::cvtColor(from, to, cv::COLOR_RGB2BGRA);
    };
}

template <int kType>
Run Transpose(const uint8_t* source, uint8_t* destination) {
    return [from = Upright(source, kType), to = Turned(destination, kType)] { cv::transpose(from, to); };
}

template <int kCode>
Run Rotate(const uint8_t* source, uint8_t* destination) {
    const cv::Mat to = kCode == cv::ROTATE_180 ? Upright(destination) : Turned(destination);
    return [from = Upright(source), to] { cv::rotate(from, to, kCode); };
}

template <int kWindowWidth, int kWindowHeight>
Run BoxFilter(const uint8_t* source, uint8_t* destination) {
    return [from = Upright(source), to = Upright(destination)] {
        cv::boxFilter(from, to, -1, cv::Size(kWindowWidth, kWindowHeight), cv::Point(-1, -1), true,
                      cv::BORDER_CONSTANT);
    };
}

/// By as many pixels to each side as it takes for the type: three sigmas of bytes, four of floats.
template <int kType, int kSigma>
Run GaussianBlur(const uint8_t* source, uint8_t* destination) {
    return [from = Upright(source, kType), to = Upright(destination, kType)] {
        cv::GaussianBlur(from, to, cv::Size(), kSigma, kSigma, cv::BORDER_REPLICATE);
    };
}

// Its pixel centres are at whole numbers.
template <int kInterpolation>
Run Warp(const uint8_t* source, uint8_t* destination) {
    const WarpMatrix m;
    const double x = m.offsetX + (m.a - m.b - 1) / 2;
    const double y = m.offsetY + (m.b + m.a - 1) / 2;
    const cv::Mat matrix = (cv::Mat_<double>(2, 3) << m.a, -m.b, x, m.b, m.a, y);
    return [matrix, from = Upright(source), to = Upright(destination)] {
        cv::warpAffine(from, to, matrix, to.size(), kInterpolation, cv::BORDER_TRANSPARENT);
    };
}

/// By a mask of bytes, the second image everywhere first.
Run MaskedCopy(const uint8_t* source, uint8_t* destination) {
    const uint8_t* mask = source + 8 * static_cast<ptrdiff_t>(kPixels);
    cv::Mat bytes(kHeight, kWidth, CV_8UC1);
    for (int32_t i = 0; i < kPixels; ++i) bytes.data[i] = (mask[i / 8] >> (7 - i % 8) & 1) != 0 ? 255 : 0;
    return [bytes, first = Upright(source), second = Upright(source + 4 * static_cast<ptrdiff_t>(kPixels)),
            to = Upright(destination)] {
        second.copyTo(to);
        first.copyTo(to, bytes);
    };
}

template <int kType>
Run Scaled(const uint8_t* source, uint8_t* destination) {
    return [from = Upright(source, kType), to = Upright(destination, kType)] {
        from.convertTo(to, kType, 0.7F);
    };
}

constexpr int kImages = 5;

/// One after the other into a float image, as it has no sum of several.
template <int kType>
Run MeanOfFive(const uint8_t* source, uint8_t* destination) {
    std::vector<cv::Mat> images;
    const size_t bytes = CV_ELEM_SIZE(kType) * static_cast<size_t>(kPixels);
    for (size_t i = 0; i < kImages; ++i) images.push_back(Upright(source + i * bytes, kType));
    return [images, sum = cv::Mat(kHeight, kWidth, CV_32FC4), to = Upright(destination, kType)] {
        images[0].convertTo(sum, CV_32F);
        for (size_t i = 1; i < kImages; ++i) cv::accumulate(images[i], sum);
        sum.convertTo(to, kType, 1.0 / kImages);
    };
}

Run WeightedSum(const uint8_t* source, uint8_t* destination) {
    return [images = MakeOpaqueImages(source), to = Upright(destination)] {
        cv::addWeighted(Upright(images->First()), 1 - kDissolveRatio, Upright(images->Second()),
                        kDissolveRatio, 0, to);
    };
}

template <int kType, int kInterpolation, int32_t kFromWidth, int32_t kFromHeight, int32_t kToWidth,
          int32_t kToHeight>
Run Scale(const uint8_t* source, uint8_t* destination) {
    return [from = Wrap(source, kFromWidth, kFromHeight, kType),
            to = Wrap(destination, kToWidth, kToHeight, kType)] {
        cv::resize(from, to, to.size(), 0, 0, kInterpolation);
    };
}

constexpr int32_t kHalfWidth = kWidth / 2, kHalfHeight = kHeight / 2;

template <int kType, int kInterpolation>
constexpr Prepare Enlarge = Scale<kType, kInterpolation, kHalfWidth, kHalfHeight, kWidth, kHeight>;

template <int kInterpolation>
constexpr Prepare Reduce = Scale<CV_8UC4, kInterpolation, kWidth, kHeight, kHalfWidth, kHalfHeight>;

/// About the middle, to 0.8 of the size.
template <int kType, int kInterpolation>
Run Turn(const uint8_t* source, uint8_t* destination) {
    const cv::Mat matrix = cv::getRotationMatrix2D({kWidth / 2.0F, kHeight / 2.0F}, 15, 0.8);
    return [matrix, from = Upright(source, kType), to = Upright(destination, kType)] {
        cv::warpAffine(from, to, matrix, to.size(), kInterpolation, cv::BORDER_TRANSPARENT);
    };
}

const AddPeers add = {
    {"Gain of BGRP 8u", "OpenCV convertTo", true, Scaled<CV_8UC4>},
    {"Gain of BGRP 32f", "OpenCV convertTo", false, Scaled<CV_32FC4>},
    {"Mean of five BGRP 8u", "OpenCV accumulate", true, MeanOfFive<CV_8UC4>},
    {"Mean of five BGRP 32f", "OpenCV accumulate", false, MeanOfFive<CV_32FC4>},
    {"Dissolve of opaque BGRA 8u", "OpenCV addWeighted", true, WeightedSum},
    {"Composite of two BGRA 8u by a one-bit mask", "OpenCV copyTo (mask of bytes)", false, MaskedCopy},
    {"RGB 8u to BGRA 8u", "OpenCV cvtColor", true, FromRGB},
    {"Transpose BGRA 8u", "OpenCV transpose", true, Transpose<CV_8UC4>},
    {"Transpose pixels of 1 byte", "OpenCV transpose", true, Transpose<CV_8UC1>},
    {"Transpose pixels of 2 bytes", "OpenCV transpose", true, Transpose<CV_16UC1>},
    {"Transpose pixels of 8 bytes", "OpenCV transpose", true, Transpose<CV_16UC4>},
    {"Transpose pixels of 16 bytes", "OpenCV transpose", true, Transpose<CV_32FC4>},
    {"Rotate BGRA 8u by 90 degrees", "OpenCV rotate", true, Rotate<cv::ROTATE_90_CLOCKWISE>},
    {"Rotate BGRA 8u by 180 degrees", "OpenCV rotate", true, Rotate<cv::ROTATE_180>},
    {"Rotate BGRA 8u by 270 degrees", "OpenCV rotate", true, Rotate<cv::ROTATE_90_COUNTERCLOCKWISE>},
    {"Box blur of rows, radius 10", "OpenCV boxFilter 21 x 1", false, BoxFilter<21, 1>},
    {"Box blur of columns, radius 10", "OpenCV boxFilter 1 x 21", false, BoxFilter<1, 21>},
    {"Gaussian blur of BGRP 8u, sigma 1", "OpenCV GaussianBlur", false, GaussianBlur<CV_8UC4, 1>},
    {"Gaussian blur of BGRP 32f, sigma 1", "OpenCV GaussianBlur", false, GaussianBlur<CV_32FC4, 1>},
    {"Placing of BGRP 8u turned, bilinear", "OpenCV warpAffine", false, Turn<CV_8UC4, cv::INTER_LINEAR>},
    {"Placing of BGRP 32f turned, bilinear", "OpenCV warpAffine", false, Turn<CV_32FC4, cv::INTER_LINEAR>},
    {"Placing of BGRP 32f turned, cubic", "OpenCV warpAffine", false, Turn<CV_32FC4, cv::INTER_CUBIC>},
    {"Placing of BGRP 8u at twice the size, bilinear", "OpenCV resize", false,
     Enlarge<CV_8UC4, cv::INTER_LINEAR>},
    {"Placing of BGRP 32f at twice the size, bilinear", "OpenCV resize", false,
     Enlarge<CV_32FC4, cv::INTER_LINEAR>},
    {"Placing of BGRP 32f at twice the size, cubic", "OpenCV resize", false,
     Enlarge<CV_32FC4, cv::INTER_CUBIC>},
    {"Scaling of BGRP 8u to half the size, quality 2", "OpenCV resize", true, Reduce<cv::INTER_LINEAR>},
    {"Scaling of BGRA 8u to half the size, quality 2", "OpenCV resize", false, Reduce<cv::INTER_LINEAR>},
    {"Scaling of BGRA 8u to half the size, quality 3", "OpenCV resize (area)", false, Reduce<cv::INTER_AREA>},
    {"Scaling of BGRA 8u to half the size, quality 5", "OpenCV resize (cubic of codes, not widened)", false,
     Reduce<cv::INTER_CUBIC>},
    {"Quad warp, bilinear", "OpenCV warpAffine", false, Warp<cv::INTER_LINEAR>},
    {"Quad warp, nearest", "OpenCV warpAffine", false, Warp<cv::INTER_NEAREST>},
};

// They take seconds on large frames.
const bool areWideBlursAdded = [] {
    if (kHeight > 1080) return false;
    AddPeers{
        {"Gaussian blur of BGRP 8u, sigma 10", "OpenCV GaussianBlur", false, GaussianBlur<CV_8UC4, 10>},
        {"Gaussian blur of BGRP 8u, sigma 40", "OpenCV GaussianBlur", false, GaussianBlur<CV_8UC4, 40>},
        {"Gaussian blur of BGRP 32f, sigma 10", "OpenCV GaussianBlur", false, GaussianBlur<CV_32FC4, 10>},
        {"Gaussian blur of BGRP 32f, sigma 40", "OpenCV GaussianBlur", false, GaussianBlur<CV_32FC4, 40>},
    };
    return true;
}();

const bool onOneThread = [] {
    cv::setNumThreads(1);
    return true;
}();

} // namespace
} // namespace OperationBench
