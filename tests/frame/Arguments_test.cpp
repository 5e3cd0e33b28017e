// What is answered before any memory is touched.

#include "frame/Arguments.h"

#include <gtest/gtest.h>

namespace PK {
namespace {

constexpr int32_t kLeast = INT32_MIN, kTooWide = kMaximumWidth + 1;

TEST(Arguments, NegativeSizesCanBeRefusedEvenWithoutPixels) {
    const auto result = [](int32_t width, int32_t height) {
        return ResultOfSize(width, height, BelowZero::Refused);
    };
    EXPECT_EQ(result(-1, 1), PK_ErrFailed);
    EXPECT_EQ(result(1, -1), PK_ErrFailed);
    EXPECT_EQ(result(0, kLeast), PK_ErrFailed);
    EXPECT_EQ(result(kLeast, 0), PK_ErrFailed);
    EXPECT_EQ(result(0, 1), PK_Success);
    EXPECT_EQ(result(1, 0), PK_Success);
    EXPECT_EQ(result(1, 1), std::nullopt);
}

TEST(Arguments, ANegativeHeightCanBeAnImageWithoutRows) {
    const auto result = [](int32_t width, int32_t height) {
        return ResultOfSize(width, height, BelowZero::EmptyHeight);
    };
    EXPECT_EQ(result(1, kLeast), PK_Success);
    EXPECT_EQ(result(-1, -1), PK_Success);
    EXPECT_EQ(result(-1, 0), PK_Success);
    EXPECT_EQ(result(0, 1), PK_Success);
    EXPECT_EQ(result(-1, 1), PK_ErrFailed);
    EXPECT_EQ(result(1, 1), std::nullopt);
}

TEST(Arguments, NegativeSizesCanBeAnImageWithoutPixels) {
    const auto result = [](int32_t width, int32_t height) {
        return ResultOfSize(width, height, BelowZero::Empty);
    };
    EXPECT_EQ(result(-1, 1), PK_Success);
    EXPECT_EQ(result(1, kLeast), PK_Success);
    EXPECT_EQ(result(0, 0), PK_Success);
    EXPECT_EQ(result(1, 1), std::nullopt);
}

TEST(Arguments, AnImageWithPixelsNeedsMemoryAndRowsThat32BitsTell) {
    const int some = 0;
    EXPECT_EQ(ResultWithoutWork(1, 1, {&some, &some}), std::nullopt);
    EXPECT_EQ(ResultWithoutWork(kMaximumWidth, 1, {&some}), std::nullopt);
    EXPECT_EQ(ResultWithoutWork(kTooWide, 1, {&some}), PK_ErrFailed);
    EXPECT_EQ(ResultWithoutWork(1, 1, {&some, nullptr}), PK_ErrFailed);
    EXPECT_EQ(ResultWithoutWork(1, 1, {nullptr, &some}), PK_ErrFailed);
}

TEST(Arguments, AnImageWithoutPixelsNeedsNothing) {
    EXPECT_EQ(ResultWithoutWork(kTooWide, 0, {nullptr}), PK_Success);
    EXPECT_EQ(ResultWithoutWork(0, 1, {nullptr}), PK_Success);
    EXPECT_EQ(ResultWithoutWork(1, -1, {nullptr}), PK_Success); // as conversions take it
    EXPECT_EQ(ResultWithoutWork(1, -1, {nullptr}, BelowZero::Refused), PK_ErrFailed);
}

} // namespace
} // namespace PK
