// The row-wise copy of 8-bit images.

#include "primitives/CopyImage.h"

#include <gtest/gtest.h>

namespace PK {

namespace {

constexpr int32_t kNullPointer = -8;

TEST(CopyImage, CopiesTheRectangleOnly) {
    const uint8_t source[] = {1, 2, 3, 4, 5, 6};
    uint8_t destination[] = {0, 0, 0, 0, 0, 0, 0, 0};
    EXPECT_EQ(CopyImage8u(source, 3, destination, 4, 2, 2), 0);
    const uint8_t expected[] = {1, 2, 0, 0, 4, 5, 0, 0};
    EXPECT_TRUE(std::equal(std::begin(expected), std::end(expected), destination));
}

TEST(CopyImage, StepsMayBeNegative) {
    const uint8_t source[] = {1, 2, 3, 4};
    uint8_t destination[] = {0, 0, 0, 0};
    EXPECT_EQ(CopyImage8u(source + 2, -2, destination, 2, 2, 2), 0);
    const uint8_t expected[] = {3, 4, 1, 2};
    EXPECT_TRUE(std::equal(std::begin(expected), std::end(expected), destination));
}

TEST(CopyImage, NullPointersAreAnError) {
    uint8_t byte = 7;
    EXPECT_EQ(CopyImage8u(nullptr, 1, &byte, 1, 1, 1), kNullPointer);
    EXPECT_EQ(CopyImage8u(&byte, 1, nullptr, 1, 1, 1), kNullPointer);
}

TEST(CopyImage, EmptyRectanglesCopyNothing) {
    const uint8_t source = 1;
    uint8_t destination = 7;
    EXPECT_EQ(CopyImage8u(&source, 1, &destination, 1, 0, 1), 0);
    EXPECT_EQ(CopyImage8u(&source, 1, &destination, 1, 1, 0), 0);
    EXPECT_EQ(CopyImage8u(&source, 1, &destination, 1, -1, -1), 0);
    EXPECT_EQ(destination, 7);
}

} // namespace

} // namespace PK
