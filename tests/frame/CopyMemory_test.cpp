// PK_CopyMemory copies exactly the bytes asked for, around the borders of its size classes and at any
// alignment.

#include "support/GuardedRows.h"
#include "support/Random.h"

#include <PixelKiln/Buffers.h>

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>

using namespace PKTest;

namespace {

constexpr size_t kSizes[] = {1,     15,     16,     17,     63,     64,     65,     127,    128,
                             129,   143,    144,    191,    192,    193,    255,    256,    4095,
                             65537, 524272, 524287, 524288, 524289, 524303, 524351, 524352, 1048583};

// Copies between rows that touch an inaccessible page, with distances from it that shift the alignment.
void CheckCopy(size_t size, size_t sourceShift, size_t destinationShift, Guard guard, Random& random) {
    SCOPED_TRACE(testing::Message() << "size " << size << " source shift " << sourceShift
                                    << " destination shift " << destinationShift << " seed "
                                    << random.Seed());
    const GuardedRows source(size + sourceShift, guard);
    const GuardedRows destination(size + destinationShift, guard);
    random.Fill(source.Bytes(), source.Size());
    std::fill_n(destination.Bytes(), destination.Size(), uint8_t{0xa5});
    const bool shiftFirst = guard == Guard::kBefore;
    const uint8_t* from = source.Bytes() + (shiftFirst ? sourceShift : 0);
    uint8_t* to = destination.Bytes() + (shiftFirst ? destinationShift : 0);

    ASSERT_EQ(PK_CopyMemory(to, from, size), PK_Success);

    ASSERT_TRUE(std::equal(from, from + size, to));
    const uint8_t* border = shiftFirst ? destination.Bytes() : to + size;
    ASSERT_TRUE(std::all_of(border, border + destinationShift, [](uint8_t byte) { return byte == 0xa5; }));
}

} // namespace

TEST(CopyMemory, CopiesEverySizeClassAtOddAddresses) {
    Random random(1);
    for (const size_t size : kSizes) {
        for (const size_t shift : {0, 1, 3, 8, 15, 16}) {
            CheckCopy(size, shift, 0, Guard::kAfter, random);
            CheckCopy(size, 0, shift, Guard::kBefore, random);
            CheckCopy(size, shift, 16 - shift, Guard::kBefore, random);
        }
    }
}

TEST(CopyMemory, CopiesEverySmallSize) {
    Random random(2);
    for (size_t size = 1; size <= 300; ++size) {
        CheckCopy(size, 0, 0, Guard::kAfter, random);
        CheckCopy(size, 1, 2, Guard::kBefore, random);
    }
}

// What lies where to a vector of 16 bytes is all that decides about the way; the last bytes are fewer than a step.
TEST(CopyMemory, CopiesLargeBlocksFromEveryPlaceToEveryPlace) {
    Random random(3);
    constexpr size_t kLargest = (size_t{4} << 20) + 63;
    const GuardedRows source(kLargest + 16, Guard::kAfter), destination(kLargest + 64, Guard::kAfter);
    const std::vector<uint8_t> period = random.Bytes(65521); // a prime, so that no two pages are the same
    for (size_t i = 0; i < source.Size(); ++i) source.Bytes()[i] = period[i % period.size()];
    for (size_t from = 0; from < 16; ++from)
        for (size_t to = 0; to < 16; ++to) {
            const size_t size = (size_t{3} << 20) + 1 + random.Below(1u << 20);
            SCOPED_TRACE(testing::Message()
                         << "size " << size << " from " << from << " to " << to << " seed " << random.Seed());
            uint8_t* const first = destination.Bytes() + 16 + to;
            std::fill_n(destination.Bytes(), destination.Size(), uint8_t{0xa5});
            ASSERT_EQ(PK_CopyMemory(first, source.Bytes() + from, size), PK_Success);
            ASSERT_EQ(std::memcmp(first, source.Bytes() + from, size), 0);
            const auto isUntouched = [](uint8_t byte) { return byte == 0xa5; };
            ASSERT_TRUE(std::all_of(destination.Bytes(), first, isUntouched));
            ASSERT_TRUE(std::all_of(first + size, first + size + 16, isUntouched));
        }
}

TEST(CopyMemory, OfNothingSucceedsWithoutAddresses) {
    EXPECT_EQ(PK_CopyMemory(nullptr, nullptr, 0), PK_Success);
}

TEST(CopyMemory, RefusesNullBeforeItTouchesMemory) {
    uint8_t bytes[4] = {1, 2, 3, 4};
    EXPECT_EQ(PK_CopyMemory(nullptr, bytes, 4), PK_ErrFailed);
    EXPECT_EQ(PK_CopyMemory(bytes, nullptr, 4), PK_ErrFailed);
    EXPECT_EQ(bytes[0], 1);
    EXPECT_EQ(bytes[3], 4);
}
