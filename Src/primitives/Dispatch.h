#pragma once

// Which targets may run at this moment, and the choice among the bodies of a family of kernels (Targets.h):
//
//   Best<TransposeKernels>().pixels4(area);

#include "primitives/simd/Targets.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <optional>
#include <span>
#include <string_view>
#include <utility>

namespace PK {

struct CpuFlags;

inline constexpr Target kFlagTargets[] = {Target::plain, Target::sse2, Target::ssse3,
                                          Target::sse41, Target::avx2, Target::avx512};
inline constexpr Target kProcessorTargets[] = {Target::plain, Target::sse2, Target::sse41, Target::avx,
                                               Target::avx2fma};

/// The targets of an offer, from the lowest up.
constexpr std::span<const Target> TargetsOf(Offer offer) {
    if (offer == Offer::processor) return kProcessorTargets;
    return kFlagTargets;
}

const char* TargetName(Target target) noexcept;

/// The target that a setting names as Targets.h spells it ("sse41"), if there is one.
std::optional<Target> TargetOfWord(std::string_view word) noexcept;

/// Every target above this one counts as missing in this process, whatever the processor has: AVX-512, unless HoldTo was
/// called. So any machine runs the bodies of all that are older.
Target HighestTarget() noexcept;

/// What was detected or chosen before is left as it is: call it before the library starts and before a colour space
/// converts for the first time.
void HoldTo(Target highest) noexcept;

/// Whether a processor of this record runs the bodies of a target.
bool Runs(const CpuFlags& processor, Target target) noexcept;

/// Whether the bodies of a target of the offer may run at this moment. By the flags, a target stands on all lower ones:
/// switching SSE2 off leaves the plain bodies.
bool IsEnabled(Target target, Offer offer = Offer::flags) noexcept;

/// The highest target of the offer that is enabled at this moment.
Target BestTarget(Offer offer = Offer::flags) noexcept;

/// The functions of one target of the family's offer.
template <class Family>
const Family& KernelsFor(Target target) noexcept {
    static constexpr std::span<const Target> kTargets = TargetsOf(Family::kOffer);
    using Kernels = const Family& (*)();
    constexpr auto list = []<std::size_t... kIndices>(std::index_sequence<kIndices...>) {
        return std::array<Kernels, kTargets.size()>{Family::template For<kTargets[kIndices]>...};
    };
    static constexpr auto kKernels = list(std::make_index_sequence<kTargets.size()>());
    return kKernels[std::ranges::find(kTargets, target) - kTargets.begin()]();
}

/// The functions of the highest target that is enabled at this moment.
template <class Family>
const Family& Best() noexcept {
    return KernelsFor<Family>(BestTarget(Family::kOffer));
}

} // namespace PK
