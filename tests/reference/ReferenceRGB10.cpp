// The packed 10-bit RGB format: one word a pixel, B at bits 2 to 11, G at 12 to 21, R at 22 to 31.
#include <algorithm>

#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

uint32_t From8u(const void* row, int64_t at) {
    return Get<uint8_t>(row, at) * 1023u / 255u;
}

// Above full scale the quotient no longer fits ten bits; it stops at the largest value, away from its
// neighbours.
uint32_t From15u(const void* row, int64_t at) {
    return std::min(Get<uint16_t>(row, at) * 1023u >> 15, 1023u);
}

uint32_t From32f(const void* row, int64_t at) {
    return static_cast<uint32_t>(LimitToUnit(Get<float>(row, at)) * 1023.0f + 0.5f);
}

bool Pack(const Job& job, uint32_t (*convert)(const void*, int64_t)) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const uint32_t b = convert(job.src, 4 * pixel);
        const uint32_t g = convert(job.src, 4 * pixel + 1);
        const uint32_t r = convert(job.src, 4 * pixel + 2);
        Put<uint32_t>(job.dst, pixel, b << 2 | g << 12 | r << 22);
    }
    return true;
}

template <typename T>
bool Unpack(const Job& job, T (*convert)(float), T opaque) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const uint32_t word = Get<uint32_t>(job.src, pixel);
        for (int sample = 0; sample < 3; ++sample) {
            const uint32_t c = (word >> (2 + 10 * sample)) & 0x3FF;
            Put<T>(job.dst, 4 * pixel + sample, convert(static_cast<float>(c)));
        }
        Put<T>(job.dst, 4 * pixel + 3, opaque);
    }
    return true;
}

uint8_t To8u(float c) {
    return Nearest8u(c * 0.24926686f);
}
uint16_t To15u(float c) {
    return Nearest15u(c * 32.03128f);
}
float To32f(float c) {
    return c * 0.0009775171f;
}

// In BGR order, not linear.
bool IsBGR(uint32_t format, uint32_t depth) {
    return IsPacked4444(format) && format == (Alpha(format) | depth);
}

} // namespace

bool RunRGB10(const Job& job) {
    const std::string_view kernel = job.kernel;
    if (job.destination == kRGB_444_10u) {
        if (kernel == "BGR8uToRGB10uRow") return IsBGR(job.source, k8u) && Pack(job, From8u);
        if (kernel == "BGR15uToRGB10uRow") return IsBGR(job.source, k15u) && Pack(job, From15u);
        if (kernel == "BGR32fToRGB10uRow") return IsBGR(job.source, k32f) && Pack(job, From32f);
    }
    if (job.source == kRGB_444_10u) {
        if (kernel == "RGB10uToBGR8uRow")
            return IsBGR(job.destination, k8u) && Unpack<uint8_t>(job, To8u, 255);
        if (kernel == "RGB10uToBGR15uRow")
            return IsBGR(job.destination, k15u) && Unpack<uint16_t>(job, To15u, 32768);
        if (kernel == "RGB10uToBGR32fRow")
            return IsBGR(job.destination, k32f) && Unpack<float>(job, To32f, 1.0f);
    }
    return false;
}

} // namespace reference
