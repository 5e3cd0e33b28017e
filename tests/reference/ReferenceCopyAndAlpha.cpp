// Copying, forcing alpha to opaque, and the order of samples.
#include <cstring>

#include "ReferenceFamilies.h"
#include "ReferenceKernels.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

bool Copy(const Job& job) {
    if (job.source != job.destination || RowLength(job.source, 6) == 0) return false;
    const int64_t bytes = RowLength(job.source, job.width);
    if (bytes != 0) std::memcpy(job.dst, job.src, static_cast<size_t>(bytes));
    return true;
}

template <typename T>
bool ForceAlpha(const Job& job, T opaque) {
    const int alpha = AlphaIndex(job.source);
    for (int64_t pixel = 0; pixel < job.width; ++pixel) {
        for (int sample = 0; sample < 4; ++sample) {
            const int64_t at = 4 * pixel + sample;
            Put(job.dst, at, sample == alpha ? opaque : Get<T>(job.src, at));
        }
    }
    return true;
}

bool ForceOpaque(const Job& job) {
    if (!IsPacked4444(job.source) || !IsPacked4444(job.destination)) return false;
    if (!SameButForAlpha(job.source, job.destination)) return false;
    switch (Depth(job.source)) {
    case k8u:
        return ForceAlpha<uint8_t>(job, 255);
    case k15u:
        return ForceAlpha<uint16_t>(job, 32768);
    case k32f:
        return ForceAlpha<float>(job, 1.0f);
    default:
        return false;
    }
}

// Samples are moved as bits, so that no NaN changes on the way.
template <typename T>
bool SwapSamples(const Job& job) {
    const bool pairs = Is422(job.source);
    const int64_t fours = pairs ? Pairs(job.width) : job.width;
    const int from4444[4] = {3, 2, 1, 0};
    const int from422[4] = {1, 0, 3, 2};
    const int* from = pairs ? from422 : from4444;
    for (int64_t four = 0; four < fours; ++four) {
        for (int sample = 0; sample < 4; ++sample) {
            Put(job.dst, 4 * four + sample, Get<T>(job.src, 4 * four + from[sample]));
        }
    }
    return true;
}

bool SwapOrder(const Job& job) {
    if ((job.source ^ job.destination) != kOrder) return false;
    if (!Is422(job.source) && !(IsRGB(job.source) && IsPacked4444(job.source))) return false;
    switch (Depth(job.source)) {
    case k8u:
        return SwapSamples<uint8_t>(job);
    case k15u:
        return !Is422(job.source) && SwapSamples<uint16_t>(job);
    case k32f:
        return SwapSamples<uint32_t>(job);
    default:
        return false;
    }
}

} // namespace

bool RunCopyAndAlpha(const Job& job) {
    if (job.kernel == "CopyRow") return Copy(job);
    if (job.kernel == "ForceOpaqueRow") return ForceOpaque(job);
    if (job.kernel == "SwapOrderRow") return SwapOrder(job);
    return false;
}

} // namespace reference
