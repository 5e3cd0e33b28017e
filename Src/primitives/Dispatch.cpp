#include "primitives/Dispatch.h"

#include "primitives/CapabilityFlags.h"
#include "primitives/CpuFeatures.h"

#include <algorithm>

namespace PK {
namespace {

constinit Relaxed<Target> sHighestTarget{Target::avx512};

bool FlagsAllow(Target target) {
    const uint8_t flags[] = {1, sCPUHasSSE2, sCPUHasSSSE3, sCPUHasSSE4, sCPUHasAVX2, sCPUHasAVX512};
    static_assert(std::size(flags) == std::size(kFlagTargets));
    for (std::size_t i = 0; i < std::size(flags) && flags[i] != 0; ++i)
        if (kFlagTargets[i] == target) return true;
    return false;
}

} // namespace

const char* TargetName(Target target) noexcept {
    constexpr const char* names[kTargetCount] = {"plain", "SSE2", "SSSE3",        "SSE4.1",
                                                 "AVX",   "AVX2", "AVX2 and FMA", "AVX-512"};
    return names[static_cast<std::size_t>(target)];
}

std::optional<Target> TargetOfWord(std::string_view word) noexcept {
    constexpr std::string_view words[kTargetCount] = {"plain", "sse2", "ssse3",   "sse41",
                                                      "avx",   "avx2", "avx2fma", "avx512"};
    const auto found = std::ranges::find(words, word);
    if (found == std::end(words)) return std::nullopt;
    return static_cast<Target>(found - words);
}

Target HighestTarget() noexcept {
    return sHighestTarget;
}

void HoldTo(Target highest) noexcept {
    sHighestTarget = highest;
}

bool Runs(const CpuFlags& processor, Target target) noexcept {
    switch (target) {
    case Target::plain:
        return true;
    case Target::sse2:
        return processor.sse2 != 0;
    case Target::ssse3:
        return processor.ssse3 != 0;
    case Target::sse41:
        return processor.sse41 != 0;
    case Target::avx:
        return processor.avx != 0;
    case Target::avx2:
        return processor.avx2 != 0;
    case Target::avx2fma:
        return processor.avx2 != 0 && processor.fma3 != 0;
    case Target::avx512: // the record does not tell
        break;
    }
    return false;
}

bool IsEnabled(Target target, Offer offer) noexcept {
    if (offer == Offer::flags) return FlagsAllow(target); // detection has left out what is above the highest
    return target <= HighestTarget() && Runs(CpuFeatures::Flags(), target);
}

Target BestTarget(Offer offer) noexcept {
    const std::span<const Target> targets = TargetsOf(offer);
    std::size_t best = targets.size() - 1;
    while (!IsEnabled(targets[best], offer)) --best;
    return targets[best];
}

} // namespace PK
