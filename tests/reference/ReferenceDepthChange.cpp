// Samples between 8 bit, 15 bit and float, and the two kernels that premultiply on the way.
#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

enum class Kind { kFullScale, kChroma, kLuma };

// What the sample-th of four samples in memory is: of a 4444 pixel, or of a 4:2:2 pair.
Kind KindOf(uint32_t format, int sample) {
    if (IsRGB(format)) return Kind::kFullScale;
    if (Is422(format)) return (sample % 2 == 0) == HasOrderBit(format) ? Kind::kLuma : Kind::kChroma;
    if (sample == AlphaIndex(format)) return Kind::kFullScale;
    return sample == 2 ? Kind::kLuma : Kind::kChroma;
}

float Expand8u(uint8_t value, Kind kind) {
    const float c = static_cast<float>(value);
    if (kind == Kind::kChroma) return (c - 128.0f) * kOneBy224;
    if (kind == Kind::kLuma) return (c - 16.0f) * kOneBy219;
    return c * kOneBy255;
}

uint8_t PackTo8u(float c, Kind kind) {
    if (kind == Kind::kChroma) return Nearest8u(224.0f * c + 128.0f);
    if (kind == Kind::kLuma) return Nearest8u(219.0f * c + 16.0f);
    return Nearest8u(255.0f * c);
}

uint16_t PackTo15u(float c) {
    return static_cast<uint16_t>(LimitToUnit(c) * 32768.0f + 0.5f);
}

// Samples of a row, whole pairs in 4:2:2.
int64_t SampleCount(uint32_t format, int32_t width) {
    return 4 * (Is422(format) ? Pairs(width) : int64_t{width});
}

bool ExpandTo32f(const Job& job) {
    if (Depth(job.destination) != k32f || !SameButForDepth(job.source, job.destination)) return false;
    const int64_t count = SampleCount(job.source, job.width);
    if (Is4444(job.source, k8u) || Is422OfDepth(job.source, k8u)) {
        for (int64_t i = 0; i < count; ++i) {
            const Kind kind = KindOf(job.source, static_cast<int>(i % 4));
            Put<float>(job.dst, i, Expand8u(Get<uint8_t>(job.src, i), kind));
        }
        return true;
    }
    if (!IsRGB4444(job.source, k15u)) return false;
    for (int64_t i = 0; i < count; ++i) {
        Put<float>(job.dst, i, static_cast<float>(Get<uint16_t>(job.src, i)) * 3.0517578e-05f);
    }
    return true;
}

bool PackFrom32f(const Job& job) {
    if (Depth(job.source) != k32f || !SameButForDepth(job.source, job.destination)) return false;
    const int64_t count = SampleCount(job.source, job.width);
    if (Is4444(job.destination, k8u) || Is422OfDepth(job.destination, k8u)) {
        for (int64_t i = 0; i < count; ++i) {
            const Kind kind = KindOf(job.source, static_cast<int>(i % 4));
            Put<uint8_t>(job.dst, i, PackTo8u(Get<float>(job.src, i), kind));
        }
        return true;
    }
    if (!IsRGB4444(job.destination, k15u)) return false;
    for (int64_t i = 0; i < count; ++i) Put<uint16_t>(job.dst, i, PackTo15u(Get<float>(job.src, i)));
    return true;
}

// The quotient and the rounded product differ, and callers compare against both: the vector bodies start at
// the first 16-byte boundary of the destination, the pixels before it and the plain body take the quotient.
bool Expand8uTo15u(const Job& job) {
    if (!IsRGB4444(job.source, k8u) || job.destination != WithDepth(job.source, k15u)) return false;
    const uintptr_t start = reinterpret_cast<uintptr_t>(job.dst);
    const uintptr_t boundary = (start + 15) / 16 * 16;
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const bool inHead = start + static_cast<uintptr_t>(pixel) * 8 < boundary;
        for (int sample = 0; sample < 4; ++sample) {
            const int64_t at = 4 * pixel + sample;
            const uint8_t c = Get<uint8_t>(job.src, at);
            const int quotient = (c * 32768) / 255;
            const float product = static_cast<float>(c) * 128.50196838f + 0.5f;
            const bool takesQuotient = inHead || !job.vectorMember;
            Put<uint16_t>(job.dst, at,
                          static_cast<uint16_t>(takesQuotient ? quotient : static_cast<int>(product)));
        }
    }
    return true;
}

bool Pack15uTo8u(const Job& job) {
    if (!IsRGB4444(job.source, k15u) || job.destination != WithDepth(job.source, k8u)) return false;
    for (int64_t i = 0; i < SampleCount(job.source, job.width); ++i) {
        Put<uint8_t>(job.dst, i, Nearest8u(static_cast<float>(Get<uint16_t>(job.src, i)) * 0.0077819824f));
    }
    return true;
}

bool ExpandAndPremultiply(const Job& job) {
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        const float a = Expand8u(Get<uint8_t>(job.src, 4 * pixel + 3), Kind::kFullScale);
        for (int sample = 0; sample < 3; ++sample) {
            const int64_t at = 4 * pixel + sample;
            Put<float>(job.dst, at, Expand8u(Get<uint8_t>(job.src, at), KindOf(job.source, sample)) * a);
        }
        Put<float>(job.dst, 4 * pixel + 3, a);
    }
    return true;
}

} // namespace

bool RunDepthChange(const Job& job) {
    if (job.kernel == "ExpandTo32fRow") return ExpandTo32f(job);
    if (job.kernel == "PackFrom32fRow") return PackFrom32f(job);
    if (job.kernel == "Expand8uTo15uRow") return Expand8uTo15u(job);
    if (job.kernel == "Pack15uTo8uRow") return Pack15uTo8u(job);
    if (job.kernel == "BGRA8uToBGRP32fRow") {
        return job.source == kBGRA_4444_8u && job.destination == kBGRP_4444_32f && ExpandAndPremultiply(job);
    }
    if (job.kernel == "VUYA8uToVUYP32fRow") {
        const bool known = job.source == kVUYA_4444_8u || job.source == kVUYA_4444_8u_709;
        const uint32_t twin = WithDepth(WithAlpha(job.source, kPremultiplied), k32f);
        return known && job.destination == twin && ExpandAndPremultiply(job);
    }
    return false;
}

} // namespace reference
