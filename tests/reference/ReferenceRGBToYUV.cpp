// RGB to YUV, 8-bit and float.
#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

#include <cmath>

namespace reference {
namespace {

// Coefficients of R, G, B, with their signs.
struct Weights {
    float r, g, b;
};

struct Matrix {
    std::string_view kernel;
    uint32_t sourceDepth;
    uint32_t destinationDepth;
    uint32_t matrix;
    Weights v, u, y;
};

constexpr Matrix kMatrices[] = {
    {"RGBToYUV601Row",
     k8u,
     k8u,
     0,
     {0.43921486f, -0.36778906f, -0.07142578f},
     {-0.14822266f, -0.29099220f, 0.43921486f},
     {0.25678906f, 0.50412893f, 0.09790625f}},
    {"RGBToYUV709Row",
     k8u,
     k8u,
     k709,
     {0.43921569f, -0.39894217f, -0.04027352f},
     {-0.10064373f, -0.33857197f, 0.43921569f},
     {0.18258588f, 0.61423057f, 0.06200706f}},
    {"RGBToYUV601Float32Row",
     k32f,
     k32f,
     0,
     {0.5f, -0.418688f, -0.081312f},
     {-0.168736f, -0.331264f, 0.5f},
     {0.299f, 0.587f, 0.114f}},
    {"RGBToYUV709Float32Row",
     k32f,
     k32f,
     k709,
     {0.5f, -0.454153f, -0.045847f},
     {-0.114572f, -0.385428f, 0.5f},
     {0.2126f, 0.7152f, 0.0722f}},
    {"RGB32fToYUV601_8uRow",
     k32f,
     k8u,
     0,
     {112.0f, -93.78611f, -18.21389f},
     {-37.79686f, -74.20313f, 112.0f},
     {65.481f, 128.553f, 24.966f}},
    {"RGB32fToYUV709_8uRow",
     k32f,
     k8u,
     k709,
     {112.0f, -101.73027f, -10.26973f},
     {-25.66413f, -86.33588f, 112.0f},
     {46.5594f, 156.6288f, 15.8118f}},
};

// A negative term is subtracted, as the formulas are written: under a directed rounding mode that differs. By the
// magnitude, since a compiler adds what has a minus in front.
float AddTerm(float sum, float weight, float x) {
    return weight < 0 ? sum - std::abs(weight) * x : sum + weight * x;
}

float Apply(const Weights& weights, float r, float g, float b) {
    return AddTerm(AddTerm(weights.r * r, weights.g, g), weights.b, b);
}

float Sample(const Job& job, uint32_t depth, int64_t at) {
    return depth == k8u ? static_cast<float>(Get<uint8_t>(job.src, at)) : Get<float>(job.src, at);
}

void ConvertPixel(const Job& job, const Matrix& matrix, int64_t pixel) {
    const float b = Sample(job, matrix.sourceDepth, 4 * pixel);
    const float g = Sample(job, matrix.sourceDepth, 4 * pixel + 1);
    const float r = Sample(job, matrix.sourceDepth, 4 * pixel + 2);
    const float a = Sample(job, matrix.sourceDepth, 4 * pixel + 3);
    const float vuy[3] = {Apply(matrix.v, r, g, b), Apply(matrix.u, r, g, b), Apply(matrix.y, r, g, b)};
    const bool to8u = matrix.destinationDepth == k8u;
    for (int sample = 0; sample < 3; ++sample) {
        if (to8u) {
            Put<uint8_t>(job.dst, 4 * pixel + sample, Nearest8u(vuy[sample] + VUYAOffset(sample)));
        } else {
            Put<float>(job.dst, 4 * pixel + sample, vuy[sample]);
        }
    }
    if (to8u) {
        Put<uint8_t>(job.dst, 4 * pixel + 3, Nearest8u(matrix.sourceDepth == k8u ? a : 255.0f * a));
    } else {
        Put<float>(job.dst, 4 * pixel + 3, a);
    }
}

} // namespace

bool RunRGBToYUV(const Job& job) {
    for (const Matrix& matrix : kMatrices) {
        if (matrix.kernel != job.kernel) continue;
        if (!IsPacked4444(job.source) || job.source != (Alpha(job.source) | matrix.sourceDepth)) return false;
        const uint32_t yuv = Alpha(job.source) | matrix.destinationDepth | matrix.matrix | kVideoRange | kYUV;
        if (job.destination != yuv) return false;
        for (int64_t pixel = 0; pixel < job.width; ++pixel) ConvertPixel(job, matrix, pixel);
        return true;
    }
    return false;
}

} // namespace reference
