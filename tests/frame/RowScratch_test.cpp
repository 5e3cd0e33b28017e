// Row scratch comes from the stack up to 256 KiB and from transient memory beyond.

#include "frame/RowScratch.h"

#include <cstring>
#include <gtest/gtest.h>
#include <limits>

namespace {

// Whether an address lies in the frames below the caller's.
bool IsOnStack(const uint8_t* address) {
    const uint8_t* here = static_cast<const uint8_t*>(__builtin_frame_address(0));
    return address > here - 0x100000 && address < here + 0x100000;
}

} // namespace

TEST(RowScratch, OfNothingIsNull) {
    const PK_Result result = PK::WithRowScratch(0, [](uint8_t* scratch) -> PK_Result {
        EXPECT_EQ(scratch, nullptr);
        return 7;
    });
    EXPECT_EQ(result, 7);
}

TEST(RowScratch, IsWritableAndAlignedAtEverySize) {
    for (const uint64_t bytes : {1u, 63u, 64u, 4097u, 262143u, 262144u, 262145u, 1048576u}) {
        const PK_Result result = PK::WithRowScratch(bytes, [bytes](uint8_t* scratch) -> PK_Result {
            const bool onStack = bytes <= 262144;
            EXPECT_EQ(reinterpret_cast<uintptr_t>(scratch) % (onStack ? 64 : 16), 0u);
            EXPECT_EQ(IsOnStack(scratch), onStack) << bytes;
            std::memset(scratch, 0x5a, bytes);
            return scratch[bytes - 1] == 0x5a ? PK_Success : PK_ErrFailed;
        });
        EXPECT_EQ(result, PK_Success) << bytes;
    }
}

TEST(RowScratch, LeavesTheStackAtTheEndOfEveryCall) {
    for (int row = 0; row < 10000; ++row) { // 2.5 GB in all
        const PK_Result result = PK::WithRowScratch(0x40000, [row](uint8_t* scratch) -> PK_Result {
            scratch[0] = static_cast<uint8_t>(row);
            return PK_Success;
        });
        ASSERT_EQ(result, PK_Success);
    }
}

TEST(RowScratch, ReportsMemoryThatCannotBeHad) {
    bool called = false;
    const PK_Result result =
        PK::WithRowScratch(std::numeric_limits<uint64_t>::max() / 2, [&called](uint8_t*) -> PK_Result {
            called = true;
            return PK_Success;
        });
    EXPECT_EQ(result, PK_ErrOutOfMemory);
    EXPECT_FALSE(called);
}
