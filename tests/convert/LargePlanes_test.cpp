// Fills of planes about the size that 32 bits can tell.

#include <PixelKiln/PixelKiln.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <new>
#include <sys/mman.h>
#include <unistd.h>
#include <utility>

namespace {

/// Addresses without memory behind them: whoever writes there is stopped.
class AddressRange {
public:
    explicit AddressRange(size_t bytes)
        : fBytes(bytes),
          fFirst(mmap(nullptr, bytes, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0)) {
        if (fFirst == MAP_FAILED) throw std::bad_alloc();
    }
    ~AddressRange() { munmap(fFirst, fBytes); }
    AddressRange(const AddressRange&) = delete;
    AddressRange& operator=(const AddressRange&) = delete;

    void* First() const { return fFirst; }

    /// Puts the same memory behind every `bytes` of the addresses.
    void Back(int file, size_t bytes) const {
        for (size_t at = 0; at < fBytes; at += bytes) {
            void* const place = static_cast<uint8_t*>(fFirst) + at;
            if (mmap(place, bytes, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_FIXED | MAP_POPULATE, file, 0) ==
                MAP_FAILED)
                throw std::bad_alloc();
        }
    }

private:
    size_t fBytes;
    void* fFirst;
};

constexpr size_t kGiB = size_t{1} << 30;
constexpr PK_PixelFormat kPlanar[] = {PK_PixelFormat_YUV_420_MPEG2_FIELD,
                                      PK_PixelFormat_YUV_420_MPEG4_FRAME_709,
                                      PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange};

} // namespace

// A luma plane of 2^31 bytes has no length in 32 bits; one of 2^32 and a little would seem small in them.
TEST(LargePlanes, OfTwoGiBAndMoreAreRefusedBeforeTheyAreTouched) {
    const AddressRange block(10 * kGiB);
    const uint8_t pixel[4] = {1, 2, 3, 255};
    for (const auto& [width, height] : {std::pair{65536, 32768},
                                        {65536 - 127, 32768 - 31},
                                        {32768, 65536},
                                        {67108737, 32},
                                        {65536, 49152},
                                        {65536, 65504},
                                        {65536, 65536},
                                        {65536, 65568},
                                        {128, 16777216},
                                        {1, 16777185}}) {
        for (const PK_PixelFormat format : kPlanar) {
            SCOPED_TRACE(testing::Message() << width << " x " << height);
            EXPECT_EQ(PK_FillWithOpaqueBlack(block.First(), 0, width, height, format), PK_ErrFailed);
            EXPECT_EQ(PK_FillWithOpaqueWhite(block.First(), 0, width, height, format), PK_ErrFailed);
            EXPECT_EQ(
                PK_FillWithColor(block.First(), 0, width, height, format, pixel, PK_PixelFormat_BGRA_4444_8u),
                PK_ErrFailed);
        }
    }
}

// 4096 bytes less than what is refused: 3 GiB of addresses that share 2 MiB of memory.
TEST(LargePlanes, OfJustBelowTwoGiBAreFilled) {
    constexpr size_t kShared = size_t{2} << 20;
    const AddressRange block(3 * kGiB);
    const int file = memfd_create("planes", MFD_CLOEXEC);
    ASSERT_GE(file, 0);
    ASSERT_EQ(ftruncate(file, kShared), 0);
    block.Back(file, kShared);
    close(file);
    ASSERT_EQ(PK_FillWithOpaqueWhite(block.First(), 0, 67108736, 32, PK_PixelFormat_YUV_420_MPEG2_FRAME),
              PK_Success);
    const auto* bytes = static_cast<const uint8_t*>(block.First());
    EXPECT_EQ(bytes[0], 128); // what was written last: chroma
}
