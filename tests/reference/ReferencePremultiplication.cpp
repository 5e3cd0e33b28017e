// Colour times alpha and colour by alpha.
#include <xmmintrin.h>

#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

// Colour moves about its own zero: 128 for chroma, 16 for luma, 0 for RGB.
float Offset(uint32_t format, int sample) {
    return IsYUV(format) ? VUYAOffset(sample) : 0.0f;
}

void Premultiply8u(const Job& job, int64_t pixel, int alpha) {
    const uint8_t a = Get<uint8_t>(job.src, 4 * pixel + alpha);
    const float k = static_cast<float>(a) * 0.003921569f;
    for (int sample = 0; sample < 4; ++sample) {
        const int64_t at = 4 * pixel + sample;
        const float offset = Offset(job.source, sample);
        const float colour = static_cast<float>(Get<uint8_t>(job.src, at)) - offset;
        Put<uint8_t>(job.dst, at, sample == alpha ? a : Nearest8u(colour * k + offset));
    }
}

void Premultiply15u(const Job& job, int64_t pixel, int alpha) {
    const uint16_t a = Get<uint16_t>(job.src, 4 * pixel + alpha);
    const float k = static_cast<float>(a) * 3.0517578e-05f;
    for (int sample = 0; sample < 4; ++sample) {
        const int64_t at = 4 * pixel + sample;
        const float colour = static_cast<float>(Get<uint16_t>(job.src, at));
        Put<uint16_t>(job.dst, at, sample == alpha ? a : Nearest15u(colour * k));
    }
}

void Premultiply32f(const Job& job, int64_t pixel, int alpha) {
    const float a = Get<float>(job.src, 4 * pixel + alpha);
    for (int sample = 0; sample < 4; ++sample) {
        const int64_t at = 4 * pixel + sample;
        Put<float>(job.dst, at, sample == alpha ? a : Get<float>(job.src, at) * a);
    }
}

void Unpremultiply8u(const Job& job, int64_t pixel, int alpha) {
    const uint8_t a = Get<uint8_t>(job.src, 4 * pixel + alpha);
    const float f = a == 0 ? 0.0f : 255.0f / static_cast<float>(a);
    for (int sample = 0; sample < 4; ++sample) {
        const int64_t at = 4 * pixel + sample;
        const float offset = Offset(job.source, sample);
        const float colour = static_cast<float>(Get<uint8_t>(job.src, at)) - offset;
        const uint8_t result = sample == alpha ? a : Nearest8u(colour * f + offset);
        Put<uint8_t>(job.dst, at, a == 0 ? uint8_t{0} : result);
    }
}

void Unpremultiply15u(const Job& job, int64_t pixel, int alpha) {
    const uint16_t a = Get<uint16_t>(job.src, 4 * pixel + alpha);
    const float f = a == 0 ? 0.0f : 32768.0f / static_cast<float>(a);
    for (int sample = 0; sample < 4; ++sample) {
        const int64_t at = 4 * pixel + sample;
        const float colour = static_cast<float>(Get<uint16_t>(job.src, at));
        Put<uint16_t>(job.dst, at, sample == alpha ? a : Nearest15u(colour * f));
    }
}

// The reciprocal is the processor's estimate, without refinement. A NaN alpha is not below the threshold.
void Unpremultiply32f(const Job& job, int64_t pixel, int alpha) {
    const float a = Get<float>(job.src, 4 * pixel + alpha);
    const float r = _mm_cvtss_f32(_mm_rcp_ss(_mm_set_ss(a)));
    for (int sample = 0; sample < 4; ++sample) {
        const int64_t at = 4 * pixel + sample;
        const float result = sample == alpha ? a : Get<float>(job.src, at) * r;
        Put<float>(job.dst, at, a < 8e-06f ? 0.0f : result);
    }
}

using PixelFunction = void (*)(const Job&, int64_t pixel, int alpha);

bool ForAllPixels(const Job& job, PixelFunction of8u, PixelFunction of15u, PixelFunction of32f) {
    if (!IsPacked4444(job.source) || !SameButForAlpha(job.source, job.destination)) return false;
    PixelFunction function = nullptr;
    if (Depth(job.source) == k8u) function = of8u;
    if (Depth(job.source) == k15u && IsRGB(job.source)) function = of15u;
    if (Depth(job.source) == k32f) function = of32f;
    if (function == nullptr) return false;
    for (int64_t pixel = 0; pixel < job.width; ++pixel) function(job, pixel, AlphaIndex(job.source));
    return true;
}

} // namespace

bool RunPremultiplication(const Job& job) {
    if (job.kernel == "PremultiplyRow")
        return ForAllPixels(job, Premultiply8u, Premultiply15u, Premultiply32f);
    if (job.kernel == "UnpremultiplyRow") {
        return ForAllPixels(job, Unpremultiply8u, Unpremultiply15u, Unpremultiply32f);
    }
    return false;
}

} // namespace reference
