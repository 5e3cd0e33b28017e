// The bridges of four-word pixels, whose rows have no padding at either end.

#include "reference/ReferenceBridges.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/CodecBridges.h>

#include <csignal>
#include <cstring>
#include <sys/mman.h>
#include <unistd.h>
#include <vector>

using namespace PKTest;

namespace {

/// What another thread may do just when a call is about to write to a page for the first time.
class AtFirstWrite {
public:
    using Action = void (*)(uint8_t* bytes, size_t size);

    /// \param bytes  whole pages, which may be written again from the first write on.
    AtFirstWrite(uint8_t* bytes, size_t size, Action action) {
        sBytes = bytes;
        sSize = size;
        sAction = action;
        struct sigaction act = {};
        act.sa_handler = Act;
        act.sa_flags = SA_RESETHAND; // a second fault is one of its own
        EXPECT_EQ(sigaction(SIGSEGV, &act, &fSaved), 0);
        EXPECT_EQ(mprotect(bytes, size, PROT_READ), 0);
    }
    ~AtFirstWrite() { EXPECT_EQ(sigaction(SIGSEGV, &fSaved, nullptr), 0); }
    AtFirstWrite(const AtFirstWrite&) = delete;
    AtFirstWrite& operator=(const AtFirstWrite&) = delete;

private:
    static void Act(int) {
        mprotect(sBytes, sSize, PROT_READ | PROT_WRITE);
        sAction(sBytes, sSize);
    }

    static inline uint8_t* sBytes;
    static inline size_t sSize;
    static inline Action sAction;
    struct sigaction fSaved = {};
};

/// All rows as one, since nothing lies between them.
ImageShape OneRun(int width, int32_t height, size_t pixelBytes) {
    return {pixelBytes * static_cast<size_t>(width) * static_cast<size_t>(height), 1, 0, false};
}

void CheckBothWays(int width, int32_t height, Random& random) {
    SCOPED_TRACE(testing::Message() << width << " x " << height << ", seed " << random.Seed());
    const GuardedImage words(OneRun(width, height, 8), random);
    const GuardedImage packed(OneRun(width, height, 4), random);
    const Bytes wordsBefore = words.RowContent(0), packedBefore = packed.RowContent(0);
    AtEveryTarget([&] {
        ASSERT_EQ(PK_Convert_DNxHD16u_To_RGB_444_10u(words.Pixels(), packed.Pixels(), width, height),
                  PK_Success);
        packed.ExpectRows({ReferenceDNxHDToRGB10(wordsBefore, width * height)});
        packed.Restore();
        ASSERT_EQ(PK_Convert_RGB_444_10u_To_DNxHD16u(packed.Pixels(), words.Pixels(), width, height),
                  PK_Success);
        words.ExpectRows({ReferenceRGB10ToDNxHD(packedBefore, width * height, wordsBefore)});
        words.Restore();
    });
}

} // namespace

TEST(DNxHD, GivesWhatTheRuleSays) {
    Random random(42);
    for (int width = 1; width <= 70; ++width)
        CheckBothWays(width, 1 + static_cast<int32_t>(random.Below(3)), random);
}

TEST(DNxHD, ReadsTheHighestTenBitsOfThreeWords) {
    const uint16_t source[4] = {0x003f, 0xffff, 0x8040, 0xffff};
    uint32_t destination = 0;
    ASSERT_EQ(PK_Convert_DNxHD16u_To_RGB_444_10u(source, &destination, 1, 1), PK_Success);
    EXPECT_EQ(destination, 1023u << 12 | 0x201u << 22);
}

TEST(DNxHD, DoesNotTouchTheFourthWord) {
    const uint32_t source[2] = {0xffffffff, 1u << 2 | 2u << 12 | 3u << 22 | 3};
    // The last word of the last pixel lies on the guard page.
    const GuardedRows memory(14, Guard::kAfter);
    std::fill_n(memory.Bytes(), 14, uint8_t{0xa5});
    ASSERT_EQ(PK_Convert_RGB_444_10u_To_DNxHD16u(source, memory.Bytes(), 2, 1), PK_Success);
    const Bytes expected = {0xc0, 0xff, 0xc0, 0xff, 0xc0, 0xff, 0xa5, 0xa5, 0x40, 0, 0x80, 0, 0xc0, 0};
    EXPECT_EQ(Bytes(memory.Bytes(), memory.Bytes() + 14), expected);
}

// Writing back what was read would undo what the other thread stores in between.
TEST(DNxHD, LeavesTheFourthWordToOtherThreads) {
    static constexpr uint16_t kStored = 0x1234;
    const auto page = static_cast<size_t>(sysconf(_SC_PAGESIZE));
    const GuardedRows memory(page, Guard::kAfter);
    const std::vector<uint32_t> source(page / 8, 0xffffffff);
    AtEveryTarget([&] {
        std::fill_n(memory.Bytes(), page, uint8_t{0xa5});
        const AtFirstWrite storing(memory.Bytes(), page, [](uint8_t* bytes, size_t size) {
            for (size_t i = 6; i < size; i += 8) std::memcpy(bytes + i, &kStored, sizeof kStored);
        });
        ASSERT_EQ(PK_Convert_RGB_444_10u_To_DNxHD16u(source.data(), memory.Bytes(),
                                                     static_cast<int32_t>(source.size()), 1),
                  PK_Success);
        for (size_t i = 0; i < page; i += 8) {
            uint16_t words[4];
            std::memcpy(words, memory.Bytes() + i, sizeof words);
            ASSERT_EQ(words[2], 0xffc0) << i / 8;
            ASSERT_EQ(words[3], kStored) << i / 8;
        }
    });
}

TEST(DNxHD, SucceedsWithoutWorkAndRefusesWhatItCannotKnow) {
    uint64_t pixel = 0;
    for (const auto convert : {PK_Convert_DNxHD16u_To_RGB_444_10u, PK_Convert_RGB_444_10u_To_DNxHD16u}) {
        EXPECT_EQ(convert(nullptr, nullptr, 16, 0), PK_Success);
        EXPECT_EQ(convert(nullptr, nullptr, 16, INT32_MIN), PK_Success);
        EXPECT_EQ(convert(nullptr, nullptr, 0, 16), PK_Success);
        EXPECT_EQ(convert(nullptr, &pixel, 1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(&pixel, nullptr, 1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(&pixel, &pixel, -1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(&pixel, &pixel, INT32_MAX, INT32_MAX), PK_ErrFailed);
    }
}
