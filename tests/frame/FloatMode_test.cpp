// The floating-point mode of operations holds inside its scope and leaves no trace behind it.

#include "frame/FloatMode.h"

#include <gtest/gtest.h>

namespace {

uint16_t X87Status() {
    uint16_t status = 0;
    asm volatile("fnstsw %0" : "=m"(status));
    return status;
}

// Divides 1 by 0 on the x87 stack, which raises the zero-divide flag (4) of its status.
void RaiseX87ZeroDivide() {
    asm volatile("fld1\n\tfldz\n\tfdivrp %%st, %%st(1)\n\tfstp %%st(0)" ::: "memory");
}

// Restores MXCSR whatever the test does.
struct SavedMXCSR {
    uint32_t value = _mm_getcsr();
    ~SavedMXCSR() { _mm_setcsr(value); }
};

constexpr uint32_t kDefault = 0x1f80;
constexpr uint32_t kRoundUp = 0x4000;
constexpr uint32_t kZeroDivideFlag = 0x0004;

} // namespace

TEST(FloatMode, AddsFlushToZeroAndPrecisionAndKeepsTheRest) {
    const SavedMXCSR saved;
    _mm_setcsr(kDefault | kRoundUp | kZeroDivideFlag);
    {
        const PK::FloatMode mode;
        EXPECT_EQ(_mm_getcsr(), 0x1f80u | 0x4000u | 0x0004u | 0x8020u);
    }
    EXPECT_EQ(_mm_getcsr(), kDefault | kRoundUp | kZeroDivideFlag);
}

TEST(FloatMode, FlushesDenormalResultsInsideOnly) {
    const SavedMXCSR saved;
    _mm_setcsr(kDefault);
    const volatile float smallest = 1.17549435e-38f; // 0x00800000
    {
        const PK::FloatMode mode;
        const volatile float half = smallest * 0.5f;
        EXPECT_EQ(half, 0.0f);
    }
    const volatile float half = smallest * 0.5f;
    EXPECT_GT(half, 0.0f);
}

TEST(FloatMode, ForgetsStickyFlagsRaisedInside) {
    const SavedMXCSR saved;
    _mm_setcsr(kDefault);
    {
        const PK::FloatMode mode;
        const volatile float zero = 0.0f;
        const volatile float infinite = 1.0f / zero;
        EXPECT_GT(infinite, 1.0f);
        EXPECT_EQ(_mm_getcsr() & kZeroDivideFlag, kZeroDivideFlag);
    }
    EXPECT_EQ(_mm_getcsr(), kDefault);
}

TEST(FloatMode, ClearsPendingX87Exceptions) {
    RaiseX87ZeroDivide();
    ASSERT_EQ(X87Status() & 4, 4);
    { const PK::FloatMode mode; }
    EXPECT_EQ(X87Status() & 0xff, 0);
}

TEST(FloatMode, Nests) {
    const SavedMXCSR saved;
    _mm_setcsr(kDefault);
    {
        const PK::FloatMode outer;
        { const PK::FloatMode inner; }
        EXPECT_EQ(_mm_getcsr(), kDefault | 0x8020u);
    }
    EXPECT_EQ(_mm_getcsr(), kDefault);
}
