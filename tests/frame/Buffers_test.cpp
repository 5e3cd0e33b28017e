// Pixel buffers, transient blocks, planes and the corners of rectangles.

#include "frame/TransientMemory.h"

#include <PixelKiln/Buffers.h>

#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <set>
#include <thread>
#include <vector>

namespace {

constexpr int32_t kLargest = std::numeric_limits<int32_t>::max();

struct PixelBuffer {
    void* base = reinterpret_cast<void*>(1);
    void* pixels = reinterpret_cast<void*>(1);
    int32_t rowBytes = 1;
    uint64_t size = 1;

    PK_Result Allocate(PK_PixelFormat format, int32_t width, int32_t height) {
        return PK_AllocatePixelBuffer(format, width, height, &base, &pixels, &rowBytes, &size);
    }
    bool IsEmpty() const { return base == nullptr && pixels == nullptr && size == 0; }
};

uintptr_t Address(const void* pointer) {
    return reinterpret_cast<uintptr_t>(pointer);
}

} // namespace

TEST(Buffers, HoldTheImageAndBeginAligned) {
    for (const PK_PixelFormat format : {0x4u, 0x104u, 0x811u, 0x851u, 0x40u, 0x01000821u, 0x0a000831u}) {
        PixelBuffer buffer;
        ASSERT_EQ(buffer.Allocate(format, 101, 37), PK_Success);
        const uint64_t bytes = static_cast<uint64_t>(PK_PixelFormatSize(format, 101, 37));
        EXPECT_EQ(buffer.rowBytes, PK_PixelFormatRowBytes(format, 101));
        EXPECT_EQ(Address(buffer.pixels) % 16, 0u);
        EXPECT_GE(Address(buffer.pixels), Address(buffer.base));
        EXPECT_LE(Address(buffer.pixels) + bytes, Address(buffer.base) + buffer.size);
        std::memset(buffer.pixels, 0x77, bytes);
        EXPECT_EQ(PK_FreePixelBuffer(format, buffer.base, buffer.size), PK_Success);
    }
}

TEST(Buffers, OfEqualSizeBeginAtDifferentDistancesFromAPage) {
    std::set<uintptr_t> distances;
    for (int i = 0; i < 64; ++i) {
        PixelBuffer buffer;
        ASSERT_EQ(buffer.Allocate(PK_PixelFormat_BGRA_4444_8u, 256, 256), PK_Success);
        const uintptr_t distance = Address(buffer.pixels) - Address(buffer.base);
        EXPECT_EQ(distance / 128 * 128, distance); // the base itself is 16-byte aligned
        EXPECT_LE(distance, 8064u);
        distances.insert(distance);
        PK_FreePixelBuffer(PK_PixelFormat_BGRA_4444_8u, buffer.base, buffer.size);
    }
    EXPECT_GT(distances.size(), 10u);
}

TEST(Buffers, OfNoSizeSucceedAndAreNull) {
    PixelBuffer invalid;
    EXPECT_EQ(invalid.Allocate(PK_PixelFormat_Invalid, 100, 100), PK_Success);
    EXPECT_TRUE(invalid.IsEmpty());
    EXPECT_EQ(invalid.rowBytes, 0);

    PixelBuffer noRows;
    EXPECT_EQ(noRows.Allocate(PK_PixelFormat_BGRA_4444_8u, 17, 0), PK_Success);
    EXPECT_TRUE(noRows.IsEmpty());
    EXPECT_EQ(noRows.rowBytes, 128);

    PixelBuffer unknownDepth;
    EXPECT_EQ(unknownDepth.Allocate(0x1c4, 100, 100), PK_Success);
    EXPECT_TRUE(unknownDepth.IsEmpty());

    PixelBuffer unknownStream;
    EXPECT_EQ(unknownStream.Allocate(0x0d000831, 100, 100), PK_Success);
    EXPECT_TRUE(unknownStream.IsEmpty());
    EXPECT_EQ(unknownStream.rowBytes, 0);
}

TEST(Buffers, RefuseSizesThat32BitsCannotHold) {
    struct {
        PK_PixelFormat format;
        int32_t width, height;
    } const cases[] = {
        {0x4, 16384, 32768},         // 2^31: negative
        {0x4, 16384, 65536},         // 2^32: wraps to 0
        {0x4, 16384, 65537},         // wraps to one row
        {0x104, 0x08000000, 1},      // the row alone is 2^31
        {0x104, 0x10000001, 1},      // the row wraps to 64
        {0x851, kLargest, kLargest}, //
    };
    for (const auto& size : cases) {
        PixelBuffer buffer;
        EXPECT_EQ(buffer.Allocate(size.format, size.width, size.height), PK_ErrOutOfMemory)
            << size.width << "x" << size.height;
        EXPECT_TRUE(buffer.IsEmpty());
        EXPECT_EQ(buffer.rowBytes, 0);
    }
}

TEST(Buffers, RefuseMoreThanThereIs) {
    PixelBuffer buffer; // the planar size is formed in 64 bits: 2^62 bytes and more
    EXPECT_EQ(buffer.Allocate(PK_PixelFormat_YUV_420_MPEG2_FRAME, kLargest, kLargest), PK_ErrOutOfMemory);
    EXPECT_TRUE(buffer.IsEmpty());
    EXPECT_EQ(buffer.rowBytes, 0);
}

TEST(Buffers, RefuseNegativeSizesAndMissingOutputs) {
    for (const PK_PixelFormat format : {0x4u, 0x0u, 0x0a000831u}) {
        PixelBuffer buffer;
        EXPECT_EQ(buffer.Allocate(format, -1, 1), PK_ErrFailed);
        EXPECT_TRUE(buffer.IsEmpty());
        EXPECT_EQ(buffer.Allocate(format, 1, -1), PK_ErrFailed);
        EXPECT_EQ(buffer.Allocate(format, -16, -16), PK_ErrFailed);
    }
    PixelBuffer b;
    EXPECT_EQ(PK_AllocatePixelBuffer(4, 1, 1, nullptr, &b.pixels, &b.rowBytes, &b.size), PK_ErrFailed);
    EXPECT_EQ(b.pixels, nullptr);
    EXPECT_EQ(PK_AllocatePixelBuffer(4, 1, 1, &b.base, nullptr, &b.rowBytes, &b.size), PK_ErrFailed);
    EXPECT_EQ(PK_AllocatePixelBuffer(4, 1, 1, &b.base, &b.pixels, nullptr, &b.size), PK_ErrFailed);
    EXPECT_EQ(PK_AllocatePixelBuffer(4, 1, 1, &b.base, &b.pixels, &b.rowBytes, nullptr), PK_ErrFailed);
}

TEST(Buffers, FreeIgnoresNull) {
    EXPECT_EQ(PK_FreePixelBuffer(4, nullptr, 100), PK_Success);
    EXPECT_EQ(PK_FreeTransientPixelBuffer(4, nullptr, 100), PK_Success);
    PK_FreeTransientMemoryBlock(nullptr, 100);
}

TEST(Buffers, TransientImageIsGivenBackByItsScope) {
    const PK::TransientPixelBuffer image(PK_PixelFormat_UYVY_422_8u, 100, 10);
    ASSERT_EQ(image.Result(), PK_Success);
    EXPECT_EQ(image.RowBytes(), 208);
    std::memset(image.Pixels(), 1, 2080);

    const PK::TransientPixelBuffer none(PK_PixelFormat_BGRA_4444_8u, 16384, 65536);
    EXPECT_EQ(none.Result(), PK_ErrOutOfMemory);
    EXPECT_EQ(none.Pixels(), nullptr);
}

TEST(Buffers, TransientBlockIsAlignedAndHoldsItsBytes) {
    for (const uint64_t bytes : {1u, 15u, 4096u, 262145u, 3000001u}) {
        void* base = nullptr;
        uint64_t size = 0;
        void* block = PK_AllocateTransientMemoryBlock(bytes, &base, &size);
        ASSERT_NE(block, nullptr);
        EXPECT_EQ(Address(block) % 16, 0u);
        EXPECT_GE(Address(block), Address(base));
        EXPECT_LE(Address(block) + bytes, Address(base) + size);
        std::memset(block, 0x33, bytes);
        PK_FreeTransientMemoryBlock(base, size);
    }
}

TEST(Buffers, TransientBlockOfNothingIsNull) {
    void* base = reinterpret_cast<void*>(1);
    uint64_t size = 1;
    EXPECT_EQ(PK_AllocateTransientMemoryBlock(0, &base, &size), nullptr);
    EXPECT_EQ(base, nullptr);
    EXPECT_EQ(size, 0u);
}

TEST(Buffers, TransientBlockThatCannotBeHadWritesNothing) {
    for (const uint64_t bytes :
         {std::numeric_limits<uint64_t>::max(), std::numeric_limits<uint64_t>::max() - 8000,
          std::numeric_limits<uint64_t>::max() / 2}) {
        void* base = reinterpret_cast<void*>(1);
        uint64_t size = 7;
        EXPECT_EQ(PK_AllocateTransientMemoryBlock(bytes, &base, &size), nullptr);
        EXPECT_EQ(base, reinterpret_cast<void*>(1));
        EXPECT_EQ(size, 7u);
    }
    uint64_t size = 7;
    EXPECT_EQ(PK_AllocateTransientMemoryBlock(16, nullptr, &size), nullptr);
    EXPECT_EQ(size, 7u);
}

TEST(Buffers, ServeManyThreadsAtOnce) {
    const auto work = [](uint8_t mark) {
        for (int i = 0; i < 500; ++i) {
            const PK::TransientBlock block(300000 + static_cast<uint64_t>(i) * 100);
            ASSERT_NE(block.Bytes(), nullptr);
            std::memset(block.Bytes(), mark, 300000);
            EXPECT_EQ(block.Bytes()[0], mark);
            EXPECT_EQ(block.Bytes()[299999], mark);
        }
    };
    std::vector<std::thread> threads;
    for (uint8_t mark = 1; mark <= 4; ++mark) threads.emplace_back(work, mark);
    for (std::thread& thread : threads) thread.join();
}

TEST(Buffers, PlanesFollowOneAnother) {
    std::vector<uint8_t> block(1);
    void* planes[3] = {};
    int32_t rowBytes[3] = {};
    struct {
        int32_t width, height, lumaRow, chromaRow, u, v;
    } const cases[] = {
        {720, 480, 768, 384, 768 * 480, 768 * 480 + 384 * 240},
        {1920, 1080, 1920, 1024, 1920 * 1088, 1920 * 1088 + 1024 * 544},
        {1, 1, 128, 0, 128 * 32, 128 * 32},
        {129, 33, 256, 128, 256 * 64, 256 * 64 + 128 * 32},
        {0, 0, 0, 0, 0, 0},
    };
    for (const auto& image : cases) {
        ASSERT_EQ(PK_GetPlanarBuffers(block.data(), 0, image.width, image.height, planes, rowBytes),
                  PK_Success);
        EXPECT_EQ(rowBytes[0], image.lumaRow);
        EXPECT_EQ(rowBytes[1], image.chromaRow);
        EXPECT_EQ(rowBytes[2], image.chromaRow);
        EXPECT_EQ(planes[0], block.data());
        EXPECT_EQ(Address(planes[1]) - Address(block.data()), static_cast<uintptr_t>(image.u));
        EXPECT_EQ(Address(planes[2]) - Address(block.data()), static_cast<uintptr_t>(image.v));
    }
}

TEST(Buffers, PlaneOffsetsWrapIn32Bits) {
    uint8_t byte = 0;
    void* planes[3] = {};
    int32_t rowBytes[3] = {};
    // Y takes 65536 x 32768 bytes, which is -2^31; U and V take 32768 x 32768, of which half is 2^29
    ASSERT_EQ(PK_GetPlanarBuffers(&byte, 0, 65536, 32768, planes, rowBytes), PK_Success);
    EXPECT_EQ(static_cast<int64_t>(Address(planes[1]) - Address(&byte)), -2147483648LL);
    EXPECT_EQ(static_cast<int64_t>(Address(planes[2]) - Address(&byte)), -2147483648LL + 536870912);
    // Y takes 2^32 bytes, which is 0; U and V take 32768 x 65536, which is -2^31 before it is halved
    ASSERT_EQ(PK_GetPlanarBuffers(&byte, 0, 65536, 65536, planes, rowBytes), PK_Success);
    EXPECT_EQ(planes[1], &byte);
    EXPECT_EQ(static_cast<int64_t>(Address(planes[2]) - Address(&byte)), -1073741824);
}

TEST(Buffers, PlanesOfNoBlockAreTheirOffsets) {
    void* planes[3] = {&planes, &planes, &planes};
    int32_t rowBytes[3] = {};
    ASSERT_EQ(PK_GetPlanarBuffers(nullptr, 0, 720, 480, planes, rowBytes), PK_Success);
    EXPECT_EQ(Address(planes[0]), 0u);
    EXPECT_EQ(Address(planes[1]), 768u * 480);
    EXPECT_EQ(Address(planes[2]), 768u * 480 + 384 * 240);
    EXPECT_EQ(rowBytes[0], 768);
    EXPECT_EQ(rowBytes[1], 384);
}

TEST(Buffers, PlanesOfImpossibleArgumentsAreRefused) {
    uint8_t byte = 0;
    void* planes[3] = {};
    int32_t rowBytes[3] = {5, 5, 5};
    EXPECT_EQ(PK_GetPlanarBuffers(&byte, 0, 16, 16, nullptr, rowBytes), PK_ErrFailed);
    EXPECT_EQ(PK_GetPlanarBuffers(&byte, 0, 16, 16, planes, nullptr), PK_ErrFailed);
    EXPECT_EQ(PK_GetPlanarBuffers(&byte, 0, -1, 16, planes, rowBytes), PK_ErrFailed);
    EXPECT_EQ(PK_GetPlanarBuffers(&byte, 0, 16, -1, planes, rowBytes), PK_ErrFailed);
    EXPECT_EQ(planes[0], nullptr);
    EXPECT_EQ(rowBytes[0], 5);
}

TEST(Buffers, ClippingMovesToTheCorner) {
    std::vector<uint8_t> image(4096);
    uint8_t* base = image.data() + 2048;
    struct {
        PK_PixelFormat format;
        int32_t rowBytes, left, top, distance;
    } const cases[] = {
        {PK_PixelFormat_BGRA_4444_8u, 64, 3, 2, 2 * 64 + 12},
        {PK_PixelFormat_BGRA_4444_8u, -64, 3, 2, -2 * 64 + 12},
        {PK_PixelFormat_VUYP_4444_8u_709, 100, 1, 1, 104},
        {PK_PixelFormat_XRGB_4444_15u, 64, 3, 2, 2 * 64 + 24},
        {PK_PixelFormat_BGRA_4444_32f_Linear, 64, 3, 2, 2 * 64 + 48},
        {0x44, 64, 3, 2, 2 * 64 + 12}, // 10-bit RGB with an alpha kind
        {PK_PixelFormat_BGRA_4444_8u, 64, 0, 0, 0},
    };
    for (const auto& corner : cases) {
        void* clipped = nullptr;
        ASSERT_EQ(PK_ClipBufferToRect(base, corner.rowBytes, -1, -1, corner.format, corner.left, corner.top,
                                      &clipped),
                  PK_Success);
        EXPECT_EQ(clipped, base + corner.distance);
    }
}

TEST(Buffers, ClippingRefusesAllButFourChannels) {
    uint8_t byte = 0;
    for (const PK_PixelFormat format :
         {0x811u, 0x40u, 0x851u, 0x0u, 0x100u, 0x845u, 0xc4u, 0x144u, 0x1c4u, 0x01000821u, 0x09000831u}) {
        void* clipped = &byte;
        EXPECT_EQ(PK_ClipBufferToRect(&byte, 64, 1, 1, format, 1, 1, &clipped), PK_ErrBadSrcFormat) << format;
        EXPECT_EQ(clipped, &byte);
    }
}

TEST(Buffers, ClippingNoBufferGivesTheCornersOffset) {
    uint8_t byte = 0;
    void* clipped = &byte;
    ASSERT_EQ(PK_ClipBufferToRect(nullptr, 64, 1, 1, 4, 3, 2, &clipped), PK_Success);
    EXPECT_EQ(Address(clipped), 2u * 64 + 12);
    ASSERT_EQ(PK_ClipBufferToRect(nullptr, -64, 1, 1, 4, 3, 2, &clipped), PK_Success);
    EXPECT_EQ(static_cast<int64_t>(Address(clipped)), -2 * 64 + 12);
    EXPECT_EQ(PK_ClipBufferToRect(nullptr, 64, 1, 1, 0x811, 3, 2, &clipped), PK_ErrBadSrcFormat);
}

TEST(Buffers, ClippingRefusesANullOutput) {
    uint8_t byte = 0;
    EXPECT_EQ(PK_ClipBufferToRect(&byte, 64, 1, 1, 4, 1, 1, nullptr), PK_ErrFailed);
}
