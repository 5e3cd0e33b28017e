// Memory of bands: on the stack as far as row scratch is, and beyond that one block beforehand and more where bands meet.

#include "frame/BandMemory.h"

#include <gtest/gtest.h>

#include <cstring>
#include <latch>
#include <limits>
#include <thread>

using namespace PK;

namespace {

constexpr uint64_t kOnStack = 0x40000, kBeyond = kOnStack + 1;

/// The address that a band is given, which writes all of its memory.
uint8_t* MemoryOf(BandMemory& memory, uint64_t bytes) {
    uint8_t* given = nullptr;
    EXPECT_EQ(memory.With([&](uint8_t* scratch) -> PK_Result {
        std::memset(scratch, 0x5a, bytes);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(scratch) % 64, 0u);
        given = scratch;
        return 7;
    }),
              7);
    return given;
}

} // namespace

TEST(BandMemory, BandsThatFollowOneAnotherShareABlock) {
    BandMemory memory(kBeyond);
    ASSERT_EQ(memory.Result(), PK_Success);
    uint8_t* const first = MemoryOf(memory, kBeyond);
    EXPECT_NE(first, nullptr);
    EXPECT_EQ(MemoryOf(memory, kBeyond), first);
}

TEST(BandMemory, BandsThatMeetHaveMemoryOfTheirOwn) {
    for (const uint64_t bytes : {uint64_t{1}, kOnStack, kBeyond}) {
        BandMemory memory(bytes);
        ASSERT_EQ(memory.Result(), PK_Success);
        std::latch bothHave(2);
        uint8_t* given[2] = {};
        const auto band = [&](int which) {
            return memory.With([&](uint8_t* scratch) -> PK_Result {
                given[which] = scratch;
                bothHave.arrive_and_wait();
                return PK_Success;
            });
        };
        std::thread other([&] { EXPECT_EQ(band(1), PK_Success); });
        EXPECT_EQ(band(0), PK_Success);
        other.join();
        EXPECT_NE(given[0], nullptr);
        EXPECT_NE(given[1], nullptr);
        EXPECT_NE(given[0], given[1]);
    }
}

TEST(BandMemory, TellsThatThereIsNone) {
    EXPECT_EQ(BandMemory(std::numeric_limits<uint64_t>::max() / 2).Result(), PK_ErrOutOfMemory);
    EXPECT_EQ(BandMemory(kOnStack).Result(), PK_Success);
}
