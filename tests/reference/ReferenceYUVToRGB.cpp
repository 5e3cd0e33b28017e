// YUV to RGB, 8-bit and float.
#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

struct Matrix {
    float y, uToB, uToG, vToG, vToR;
};

struct BGR {
    float b, g, r;
};

constexpr Matrix k601To8u = {1.16438f, 2.01723f, 0.391762f, 0.812969f, 1.59603f};
constexpr Matrix k709To8u = {1.16438f, 2.1124f, 0.213249f, 0.532909f, 1.79274f};
constexpr Matrix k601To32f = {0.00456621f, 0.00791072f, 0.00153632f, 0.00318811f, 0.00625893f};
constexpr Matrix k709To32f = {0.00456621f, 0.00828393f, 0.00083627f, 0.00208984f, 0.00703036f};

BGR Apply(const Matrix& m, float v, float u, float y) {
    return {m.y * y + m.uToB * u, m.y * y - m.uToG * u - m.vToG * v, m.y * y + m.vToR * v};
}

// Luma has no factor here: not even a product with 1, which would flush a denormal.
BGR Apply601ToFloat(float v, float u, float y) {
    return {y + 1.772f * u, y - 0.344136f * u - 0.714136f * v, y + 1.402f * v};
}

BGR Apply709ToFloat(float v, float u, float y) {
    return {y + 1.8556f * u, y - 0.187324f * u - 0.468124f * v, y + 1.5748f * v};
}

BGR From8u(const Job& job, const Matrix& matrix, int64_t pixel) {
    const float v = static_cast<float>(Get<uint8_t>(job.src, 4 * pixel)) - 128.0f;
    const float u = static_cast<float>(Get<uint8_t>(job.src, 4 * pixel + 1)) - 128.0f;
    const float y = static_cast<float>(Get<uint8_t>(job.src, 4 * pixel + 2)) - 16.0f;
    return Apply(matrix, v, u, y);
}

bool To8u(const Job& job, const Matrix& matrix, bool opaque) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const BGR bgr = From8u(job, matrix, pixel);
        const uint8_t a = Get<uint8_t>(job.src, 4 * pixel + 3);
        Put<uint8_t>(job.dst, 4 * pixel, Nearest8u(bgr.b));
        Put<uint8_t>(job.dst, 4 * pixel + 1, Nearest8u(bgr.g));
        Put<uint8_t>(job.dst, 4 * pixel + 2, Nearest8u(bgr.r));
        Put<uint8_t>(job.dst, 4 * pixel + 3, opaque ? uint8_t{255} : a);
    }
    return true;
}

bool To32f(const Job& job, const Matrix& matrix, bool opaque) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const BGR bgr = From8u(job, matrix, pixel);
        const float a = static_cast<float>(Get<uint8_t>(job.src, 4 * pixel + 3)) * kOneBy255;
        Put<float>(job.dst, 4 * pixel, bgr.b);
        Put<float>(job.dst, 4 * pixel + 1, bgr.g);
        Put<float>(job.dst, 4 * pixel + 2, bgr.r);
        Put<float>(job.dst, 4 * pixel + 3, opaque ? 1.0f : a);
    }
    return true;
}

bool FloatToFloat(const Job& job, BGR (*apply)(float, float, float)) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const float v = Get<float>(job.src, 4 * pixel);
        const float u = Get<float>(job.src, 4 * pixel + 1);
        const float y = Get<float>(job.src, 4 * pixel + 2);
        const BGR bgr = apply(v, u, y);
        Put<float>(job.dst, 4 * pixel, bgr.b);
        Put<float>(job.dst, 4 * pixel + 1, bgr.g);
        Put<float>(job.dst, 4 * pixel + 2, bgr.r);
        Put<float>(job.dst, 4 * pixel + 3, Get<float>(job.src, 4 * pixel + 3));
    }
    return true;
}

// A 4444 YUV source of this depth and matrix.
bool IsFrom(const Job& job, uint32_t depth, uint32_t matrix) {
    return IsYUV4444(job.source, depth) && (job.source & kMatrixMask) == matrix;
}

// A destination in BGR order of this depth, not linear.
bool IsToBGR(const Job& job, uint32_t depth) {
    return IsPacked4444(job.destination) && job.destination == (Alpha(job.destination) | depth);
}

} // namespace

bool RunYUVToRGB(const Job& job) {
    const std::string_view kernel = job.kernel;
    const bool sameAlpha = Alpha(job.source) == Alpha(job.destination);
    const bool to8u = IsToBGR(job, k8u);
    const bool to32f = IsToBGR(job, k32f);
    if (kernel == "YUV601ToRGBRow")
        return IsFrom(job, k8u, 0) && to8u && sameAlpha && To8u(job, k601To8u, false);
    if (kernel == "YUV709ToRGBRow")
        return IsFrom(job, k8u, k709) && to8u && sameAlpha && To8u(job, k709To8u, false);
    if (kernel == "YUV601ToRGB32fRow") {
        return IsFrom(job, k8u, 0) && to32f && sameAlpha && To32f(job, k601To32f, false);
    }
    if (kernel == "YUV709ToRGB32fRow") {
        return IsFrom(job, k8u, k709) && to32f && sameAlpha && To32f(job, k709To32f, false);
    }
    if (kernel == "YUV601ToRGBFloat32Row") {
        return IsFrom(job, k32f, 0) && to32f && sameAlpha && FloatToFloat(job, Apply601ToFloat);
    }
    if (kernel == "YUV709ToRGBFloat32Row") {
        return IsFrom(job, k32f, k709) && to32f && sameAlpha && FloatToFloat(job, Apply709ToFloat);
    }
    if (job.source != kVUYX_4444_8u && job.source != kVUYX_4444_8u_709) return false;
    const bool is601 = Is601(job.source);
    if (kernel == "VUYX8uToRGB8uRow") return to8u && To8u(job, is601 ? k601To8u : k709To8u, true);
    if (kernel == "VUYX8uToRGB32fRow") return to32f && To32f(job, is601 ? k601To32f : k709To32f, true);
    if (kernel == "VUYX8uToBGR8uRow") {
        const bool known = job.destination == kBGRA_4444_8u || job.destination == kBGRX_4444_8u;
        return known && To8u(job, is601 ? k601To8u : k709To8u, true);
    }
    return false;
}

} // namespace reference
