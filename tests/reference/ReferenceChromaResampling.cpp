// Chroma between one sample a pixel and one sample a pair.
#include <algorithm>
#include <vector>

#include "ReferenceFamilies.h"
#include "ReferenceKernels.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

// Chroma of a VUYA pixel: channel 0 is V, 1 is U. A pair's even pixel is `pixel`.
uint8_t Filtered8u(const Job& job, int64_t pixel, int channel) {
    const auto c = [&](int64_t at) { return int{Get<uint8_t>(job.src, 4 * at + channel)}; };
    if (pixel + 1 == job.width) return static_cast<uint8_t>(c(pixel));
    if (pixel == 0) return static_cast<uint8_t>((3 * c(0) + c(1) + 2) >> 2);
    return static_cast<uint8_t>((c(pixel - 1) + 2 * c(pixel) + c(pixel + 1) + 2) >> 2);
}

float Filtered32f(const Job& job, int64_t pixel, int channel) {
    const auto c = [&](int64_t at) { return Get<float>(job.src, 4 * at + channel); };
    if (pixel + 1 == job.width) return c(pixel);
    if (pixel == 0) return (3.0f * c(0) + c(1)) * 0.25f;
    return (c(pixel - 1) + 2.0f * c(pixel) + c(pixel + 1)) * 0.25f;
}

// A lone last pixel repeats its luma at 8 bit and leaves 0.0 in float.
bool Downsample8u(const Job& job) {
    for (int64_t pixel = 0; pixel < job.width; pixel += 2) {
        const int64_t second = pixel + 1 == job.width ? pixel : pixel + 1;
        Put<uint8_t>(job.dst, 2 * pixel, Filtered8u(job, pixel, 1));
        Put<uint8_t>(job.dst, 2 * pixel + 1, Get<uint8_t>(job.src, 4 * pixel + 2));
        Put<uint8_t>(job.dst, 2 * pixel + 2, Filtered8u(job, pixel, 0));
        Put<uint8_t>(job.dst, 2 * pixel + 3, Get<uint8_t>(job.src, 4 * second + 2));
    }
    return true;
}

bool Downsample32f(const Job& job) {
    for (int64_t pixel = 0; pixel < job.width; pixel += 2) {
        const bool alone = pixel + 1 == job.width;
        Put<float>(job.dst, 2 * pixel, Filtered32f(job, pixel, 1));
        Put<float>(job.dst, 2 * pixel + 1, Get<float>(job.src, 4 * pixel + 2));
        Put<float>(job.dst, 2 * pixel + 2, Filtered32f(job, pixel, 0));
        Put<float>(job.dst, 2 * pixel + 3, alone ? 0.0f : Get<float>(job.src, 4 * (pixel + 1) + 2));
    }
    return true;
}

// The vector bodies round up, the plain body truncates; callers compare against both.
bool Upsample8u(const Job& job) {
    const int rounding = job.vectorMember ? 1 : 0;
    const int atU = HasOrderBit(job.source) ? 1 : 0;
    const int atY0 = 1 - atU;
    const int64_t lastPair = Pairs(job.width) - 1;
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const int64_t pair = pixel / 2;
        const int64_t next = std::min(pair + 1, lastPair);
        const bool odd = pixel % 2 == 1;
        const auto chroma = [&](int at) {
            const int own = Get<uint8_t>(job.src, 4 * pair + at);
            const int following = Get<uint8_t>(job.src, 4 * next + at);
            return static_cast<uint8_t>(odd ? (own + following + rounding) >> 1 : own);
        };
        Put<uint8_t>(job.dst, 4 * pixel, chroma(atU + 2));
        Put<uint8_t>(job.dst, 4 * pixel + 1, chroma(atU));
        Put<uint8_t>(job.dst, 4 * pixel + 2, Get<uint8_t>(job.src, 4 * pair + atY0 + (odd ? 2 : 0)));
        Put<uint8_t>(job.dst, 4 * pixel + 3, 255);
    }
    return true;
}

float Interpolated(const Job& job, int64_t pair, int at) {
    const int64_t lastPair = Pairs(job.width) - 1;
    const auto c = [&](int64_t k) {
        return Get<float>(job.src, 4 * std::clamp(k, int64_t{0}, lastPair) + at);
    };
    return (9.0f * (c(pair) + c(pair + 1)) - c(pair - 1) - c(pair + 2)) * 0.0625f;
}

bool Upsample32f(const Job& job) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const int64_t pair = pixel / 2;
        const bool odd = pixel % 2 == 1;
        const auto chroma = [&](int at) {
            return odd && job.quality > 1 ? Interpolated(job, pair, at) : Get<float>(job.src, 4 * pair + at);
        };
        Put<float>(job.dst, 4 * pixel, chroma(2));
        Put<float>(job.dst, 4 * pixel + 1, chroma(0));
        Put<float>(job.dst, 4 * pixel + 2, Get<float>(job.src, 4 * pair + (odd ? 3 : 1)));
        Put<float>(job.dst, 4 * pixel + 3, 1.0f);
    }
    return true;
}

// Two kernels, one after the other.
bool UpsampleToBGR(const Job& job, uint32_t source, uint32_t hub, std::string_view matrixKernel) {
    if (job.source != source) return false;
    if (!IsPacked4444(job.destination) || job.destination != Alpha(job.destination)) return false;
    std::vector<uint8_t> scratch(4 * static_cast<size_t>(job.width));
    const uint32_t vuy = WithAlpha(hub, Alpha(job.destination));
    Run("Upsample422To444Row", source, vuy, job.vectorMember, job.src, scratch.data(), job.width);
    Run(matrixKernel, vuy, job.destination, job.vectorMember, scratch.data(), job.dst, job.width);
    return true;
}

// The 4:2:2 format of the same depth and matrix as a 4444 format.
constexpr uint32_t As422(uint32_t format) {
    return WithAlpha(format, 0) | k422;
}

} // namespace

bool RunChromaResampling(const Job& job) {
    const std::string_view kernel = job.kernel;
    const bool down = IsPacked4444(job.source) && job.destination == As422(job.source);
    const bool up = IsPacked4444(job.destination) && job.source == As422(job.destination);
    const bool upFromYUYV = IsPacked4444(job.destination) && job.source == (As422(job.destination) | kOrder);
    if (kernel == "Downsample444To422Row") return down && IsYUV4444(job.source, k8u) && Downsample8u(job);
    if (kernel == "Downsample444To422Float32Row")
        return down && IsYUV4444(job.source, k32f) && Downsample32f(job);
    if (kernel == "Upsample422To444Row") {
        return (up || upFromYUYV) && IsYUV4444(job.destination, k8u) && Upsample8u(job);
    }
    if (kernel == "Upsample422To444Float32Row") {
        return up && IsYUV4444(job.destination, k32f) && Upsample32f(job);
    }
    if (kernel == "UYVY601ToBGR8uRow")
        return UpsampleToBGR(job, kUYVY_422_8u, kVUYX_4444_8u, "YUV601ToRGBRow");
    if (kernel == "YUYV601ToBGR8uRow")
        return UpsampleToBGR(job, kYUYV_422_8u, kVUYX_4444_8u, "YUV601ToRGBRow");
    if (kernel == "UYVY709ToBGR8uRow") {
        return UpsampleToBGR(job, kUYVY_422_8u_709, kVUYX_4444_8u_709, "YUV709ToRGBRow");
    }
    if (kernel == "YUYV709ToBGR8uRow") {
        return UpsampleToBGR(job, kYUYV_422_8u_709, kVUYX_4444_8u_709, "YUV709ToRGBRow");
    }
    return false;
}

} // namespace reference
