// The quotients of the box blur are those of integers, at all borders of a whole number, in every body and rounding mode.

#include "filters/BoxDivisorProbes.h"

#include "filters/BoxBlurKernels.h"
#include "support/FloatEnvironment.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

namespace {

using namespace PKTest;

/// The numerators that a divisor meets, about every multiple of it: sums of samples up to 255 and half a unit of 255.
std::vector<int32_t> Borders(int64_t divisor) {
    const int64_t largest = std::min<int64_t>(255 * divisor + 128, INT32_MAX);
    std::vector<int32_t> numerators = {0, static_cast<int32_t>(largest)};
    for (int64_t multiple = divisor; multiple - 1 <= largest; multiple += divisor)
        for (const int64_t numerator : {multiple - 1, multiple, multiple + 1})
            if (numerator <= largest) numerators.push_back(static_cast<int32_t>(numerator));
    numerators.resize((numerators.size() + 15) / 16 * 16);
    return numerators;
}

class BoxDivisors : public testing::TestWithParam<PK::Target> {
protected:
    const BoxDivisorProbes& probes = PK::KernelsFor<BoxDivisorProbes>(GetParam());

    static void Check(BoxDivisorProbes::Divide divide, int64_t divisor) {
        const std::vector<int32_t> numerators = Borders(divisor);
        std::vector<int32_t> expected(numerators.size()), quotients(numerators.size());
        for (size_t i = 0; i < numerators.size(); ++i)
            expected[i] = static_cast<int32_t>(numerators[i] / divisor);
        for (const uint32_t mode : {0u, kRoundDown, kRoundUp, kRoundToZero}) {
            {
                const FloatEnvironment environment(mode);
                divide(numerators.data(), quotients.data(), static_cast<int64_t>(numerators.size()), divisor);
            }
            const auto [wrong, right] = std::ranges::mismatch(quotients, expected);
            ASSERT_TRUE(wrong == quotients.end())
                << numerators[static_cast<size_t>(wrong - quotients.begin())] << " / " << divisor << " is "
                << *right << ", not " << *wrong << "; MXCSR bits " << mode;
        }
    }
};

} // namespace

INSTANTIATE_TEST_SUITE_P(Targets, BoxDivisors, EveryTarget(), TargetOf);

TEST_P(BoxDivisors, SmallOnesNeedNoRemainder) {
    for (int64_t divisor = 1; divisor <= probes.largestSmall; ++divisor)
        ASSERT_NO_FATAL_FAILURE(Check(probes.small, divisor));
}

TEST_P(BoxDivisors, AnyThatABundleMeets) {
    constexpr int64_t kLargest = 255 * (2 * int64_t{PK::kLargestBundleSize} - 1) + 2 * 255;
    for (int64_t divisor = 1; divisor <= 2000; ++divisor)
        ASSERT_NO_FATAL_FAILURE(Check(probes.large, divisor));
    for (int64_t fromEnd = 0; fromEnd < 100; ++fromEnd)
        ASSERT_NO_FATAL_FAILURE(Check(probes.large, kLargest - fromEnd));
    Random random(21);
    for (int i = 0; i < 2000; ++i)
        ASSERT_NO_FATAL_FAILURE(Check(probes.large, 2000 + random.Below(uint32_t{kLargest - 2000})))
            << "seed " << random.Seed();
}
