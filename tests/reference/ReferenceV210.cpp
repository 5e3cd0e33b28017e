// The packed 10-bit 4:2:2 format. Its samples stand in the order of UYVY, three in a word.
#include <algorithm>
#include <vector>

#include "ReferenceFamilies.h"
#include "ReferenceKernels.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

// The index-th sample of the row in the order U, Y0, V, Y1.
uint32_t Sample(const void* row, int64_t index) {
    return (Get<uint32_t>(row, index / 3) >> (10 * (index % 3))) & 0x3FF;
}

// Writes whole groups. Samples beyond the last pair of the row are 0.
void PutRow(void* row, int32_t width, const std::vector<uint32_t>& samples) {
    std::vector<uint32_t> padded = samples;
    padded.resize(static_cast<size_t>(12 * Groups(width)), 0);
    for (size_t word = 0; word < padded.size() / 3; ++word) {
        const uint32_t bits = padded[3 * word] | padded[3 * word + 1] << 10 | padded[3 * word + 2] << 20;
        Put<uint32_t>(row, static_cast<int64_t>(word), bits);
    }
}

bool FromUYVY8u(const Job& job) {
    std::vector<uint32_t> samples;
    for (int64_t i = 0; i < 4 * Pairs(job.width); ++i) samples.push_back(Get<uint8_t>(job.src, i) * 4u);
    PutRow(job.dst, job.width, samples);
    return true;
}

// The half stays in the offset although the conversion rounds to nearest by itself: results depend on it.
bool FromUYVY32f(const Job& job) {
    std::vector<uint32_t> samples;
    for (int64_t i = 0; i < 4 * Pairs(job.width); ++i) {
        const float c = Get<float>(job.src, i);
        samples.push_back(NearestClamped(i % 2 == 0 ? 896.0f * c + 512.5f : 876.0f * c + 64.5f, 1023));
    }
    PutRow(job.dst, job.width, samples);
    return true;
}

bool ToUYVY8u(const Job& job) {
    for (int64_t i = 0; i < 4 * Pairs(job.width); ++i) {
        Put<uint8_t>(job.dst, i, static_cast<uint8_t>(Sample(job.src, i) >> 2));
    }
    return true;
}

bool ToUYVY32f(const Job& job) {
    for (int64_t i = 0; i < 4 * Pairs(job.width); ++i) {
        const float c = static_cast<float>(Sample(job.src, i));
        Put<float>(job.dst, i, i % 2 == 0 ? (c - 512.0f) * 0.0011160715f : (c - 64.0f) * 0.0011415525f);
    }
    return true;
}

struct VUY {
    uint32_t v, u, y;
};

// One pixel's samples, each first shifted down: the odd pixel has the truncated average of its neighbours'
// chroma, and the odd pixel of the row's last pair repeats it.
VUY Pixel(const Job& job, int64_t pixel, int shift) {
    const int64_t pair = pixel / 2;
    const int64_t next = std::min(pair + 1, Pairs(job.width) - 1);
    const bool odd = pixel % 2 == 1;
    const auto chroma = [&](int64_t at) {
        const uint32_t own = Sample(job.src, 4 * pair + at) >> shift;
        const uint32_t following = Sample(job.src, 4 * next + at) >> shift;
        return odd ? (own + following) >> 1 : own;
    };
    return {chroma(2), chroma(0), Sample(job.src, 4 * pair + (odd ? 3 : 1)) >> shift};
}

bool ToVUY8u(const Job& job) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const VUY vuy = Pixel(job, pixel, 2);
        Put<uint8_t>(job.dst, 4 * pixel, static_cast<uint8_t>(vuy.v));
        Put<uint8_t>(job.dst, 4 * pixel + 1, static_cast<uint8_t>(vuy.u));
        Put<uint8_t>(job.dst, 4 * pixel + 2, static_cast<uint8_t>(vuy.y));
        Put<uint8_t>(job.dst, 4 * pixel + 3, 255);
    }
    return true;
}

// Two kernels, one after the other.
bool ToVUY601_8u(const Job& job) {
    std::vector<uint8_t> scratch(4 * static_cast<size_t>(job.width));
    const uint32_t vuy709 = job.destination | k709;
    Run("V210ToVUY8uRow", job.source, vuy709, job.vectorMember, job.src, scratch.data(), job.width);
    Run("YUV709To601Row", vuy709, job.destination, job.vectorMember, scratch.data(), job.dst, job.width);
    return true;
}

bool ToBGR8u(const Job& job) {
    const bool is601 = Is601(job.source);
    const float uToB = is601 ? 0.504308f : 0.5281f;
    const float uToG = is601 ? 0.0979404f : 0.0533122f;
    const float vToG = is601 ? 0.203242f : 0.133227f;
    const float vToR = is601 ? 0.399007f : 0.448185f;
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const VUY vuy = Pixel(job, pixel, 0);
        const float v = static_cast<float>(vuy.v) - 512.0f;
        const float u = static_cast<float>(vuy.u) - 512.0f;
        const float y = static_cast<float>(vuy.y) - 64.0f;
        Put<uint8_t>(job.dst, 4 * pixel, Nearest8u(0.291096f * y + uToB * u));
        Put<uint8_t>(job.dst, 4 * pixel + 1, Nearest8u(0.291096f * y - uToG * u - vToG * v));
        Put<uint8_t>(job.dst, 4 * pixel + 2, Nearest8u(0.291096f * y + vToR * v));
        Put<uint8_t>(job.dst, 4 * pixel + 3, 255);
    }
    return true;
}

// The V210 format of the same matrix.
constexpr uint32_t AsV210(uint32_t format) {
    return kV210_422_10u | (format & kMatrixMask);
}

bool RunFromV210(const Job& job) {
    const std::string_view kernel = job.kernel;
    const bool sameMatrix = AsV210(job.destination) == job.source;
    const bool toUYVY = Is422(job.destination) && !HasOrderBit(job.destination) && sameMatrix;
    const bool toVUY8u = IsYUV4444(job.destination, k8u);
    const bool toBGR8u = IsPacked4444(job.destination) && job.destination == Alpha(job.destination);
    if (kernel == "V210ToUYVY8uRow") return toUYVY && Depth(job.destination) == k8u && ToUYVY8u(job);
    if (kernel == "V210ToUYVY32fRow") return toUYVY && Depth(job.destination) == k32f && ToUYVY32f(job);
    if (kernel == "V210ToVUY8uRow") return toVUY8u && sameMatrix && ToVUY8u(job);
    if (kernel == "V210709ToVUY601_8uRow") {
        return job.source == kV210_422_10u_709 && toVUY8u && Is601(job.destination) && ToVUY601_8u(job);
    }
    if (kernel == "V210ToBGR8uRow") return toBGR8u && ToBGR8u(job);
    return false;
}

} // namespace

bool RunV210(const Job& job) {
    if (IsV210(job.source)) return RunFromV210(job);
    if (!IsV210(job.destination) || AsV210(job.source) != job.destination) return false;
    const bool isUYVY = Is422(job.source) && !HasOrderBit(job.source);
    if (job.kernel == "UYVY8uToV210Row") return isUYVY && Depth(job.source) == k8u && FromUYVY8u(job);
    if (job.kernel == "UYVY32fToV210Row") return isUYVY && Depth(job.source) == k32f && FromUYVY32f(job);
    return false;
}

} // namespace reference
