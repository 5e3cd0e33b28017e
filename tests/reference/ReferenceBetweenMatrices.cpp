// YUV of one matrix to YUV of the other: 4444 at 8 bit and float, 4:2:2 at 8 bit.
#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

struct VUY {
    float v, u, y;
};

VUY To709(float v, float u, float y) {
    return {0.07504945f * u + 1.02532709f * v, 1.01863968f * u + 0.11461795f * v,
            y - 0.11554975f * u - 0.20793764f * v};
}

VUY To601(float v, float u, float y) {
    return {-0.07245296f * u + 0.98339784f * v, 0.98985380f * u - 0.11065251f * v,
            y + 0.09931166f * u + 0.19169955f * v};
}

using Formula = VUY (*)(float v, float u, float y);

VUY Apply8u(Formula formula, uint8_t v, uint8_t u, uint8_t y) {
    return formula(static_cast<float>(v) - 128.0f, static_cast<float>(u) - 128.0f,
                   static_cast<float>(y) - 16.0f);
}

bool Convert4444_8u(const Job& job, Formula formula) {
    for (int64_t at = 0; at < 4 * int64_t{job.width}; at += 4) {
        const VUY vuy = Apply8u(formula, Get<uint8_t>(job.src, at), Get<uint8_t>(job.src, at + 1),
                                Get<uint8_t>(job.src, at + 2));
        Put<uint8_t>(job.dst, at, Nearest8u(vuy.v + 128.0f));
        Put<uint8_t>(job.dst, at + 1, Nearest8u(vuy.u + 128.0f));
        Put<uint8_t>(job.dst, at + 2, Nearest8u(vuy.y + 16.0f));
        Put<uint8_t>(job.dst, at + 3, Get<uint8_t>(job.src, at + 3));
    }
    return true;
}

bool Convert4444_32f(const Job& job, Formula formula) {
    for (int64_t at = 0; at < 4 * int64_t{job.width}; at += 4) {
        const VUY vuy =
            formula(Get<float>(job.src, at), Get<float>(job.src, at + 1), Get<float>(job.src, at + 2));
        Put<float>(job.dst, at, vuy.v);
        Put<float>(job.dst, at + 1, vuy.u);
        Put<float>(job.dst, at + 2, vuy.y);
        Put<float>(job.dst, at + 3, Get<float>(job.src, at + 3));
    }
    return true;
}

// Each of the two lumas goes with the chroma of its pair.
bool Convert422_8u(const Job& job, Formula formula) {
    const int atU = HasOrderBit(job.source) ? 1 : 0;
    const int atY0 = 1 - atU;
    for (int64_t at = 0; at < 4 * Pairs(job.width); at += 4) {
        const uint8_t u = Get<uint8_t>(job.src, at + atU);
        const uint8_t v = Get<uint8_t>(job.src, at + atU + 2);
        const VUY first = Apply8u(formula, v, u, Get<uint8_t>(job.src, at + atY0));
        const VUY second = Apply8u(formula, v, u, Get<uint8_t>(job.src, at + atY0 + 2));
        Put<uint8_t>(job.dst, at + atU, Nearest8u(first.u + 128.0f));
        Put<uint8_t>(job.dst, at + atU + 2, Nearest8u(first.v + 128.0f));
        Put<uint8_t>(job.dst, at + atY0, Nearest8u(first.y + 16.0f));
        Put<uint8_t>(job.dst, at + atY0 + 2, Nearest8u(second.y + 16.0f));
    }
    return true;
}

// Alpha is carried over as it stands, also where a meaningless one becomes premultiplied on the way to 4:2:2.
bool RunMember(const Job& job, uint32_t sourceMatrix, Formula formula, std::string_view of4444,
               std::string_view ofFloat, std::string_view ofUYVY, std::string_view ofYUYV) {
    const uint32_t source = job.source;
    if ((source & kMatrixMask) != sourceMatrix || !SameButForAlpha(job.destination, source ^ k709))
        return false;
    if (job.kernel == of4444) return IsYUV4444(source, k8u) && Convert4444_8u(job, formula);
    if (job.kernel == ofFloat) return IsYUV4444(source, k32f) && Convert4444_32f(job, formula);
    if (!Is422OfDepth(source, k8u)) return false;
    if (job.kernel == ofUYVY) return !HasOrderBit(source) && Convert422_8u(job, formula);
    if (job.kernel == ofYUYV) return HasOrderBit(source) && Convert422_8u(job, formula);
    return false;
}

} // namespace

bool RunBetweenMatrices(const Job& job) {
    return RunMember(job, 0, To709, "YUV601To709Row", "YUV601To709Float32Row", "UYVY601To709Row",
                     "YUYV601To709Row") ||
           RunMember(job, k709, To601, "YUV709To601Row", "YUV709To601Float32Row", "UYVY709To601Row",
                     "YUYV709To601Row");
}

} // namespace reference
