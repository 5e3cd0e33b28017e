// The reference as a whole: it knows every kernel that the router can name, and refuses what it does not
// know.
#include "ReferenceKernels.h"

#include <random>
#include <set>
#include <string>

#include "ReferenceFormats.h"
#include "ReferenceRouter.h"
#include "ReferenceTestRow.h"

namespace {

using namespace reference;

Bytes RandomRow(uint32_t format, int32_t width) {
    std::mt19937 random(width + format);
    Bytes bytes(static_cast<size_t>(RowLength(format, width)));
    for (uint8_t& byte : bytes) byte = static_cast<uint8_t>(random());
    return bytes;
}

struct Member {
    std::string kernel;
    uint32_t source, destination;
    auto operator<=>(const Member&) const = default;
};

// Every kernel with formats that any chain runs it on.
std::set<Member> AllMembers() {
    std::set<Member> members;
    for (const bool sse2 : {false, true}) {
        for (const uint32_t source : kRasterFormats) {
            for (const uint32_t destination : kRasterFormats) {
                uint32_t current = source;
                for (const Step& step : Chain(source, destination, 3, sse2)) {
                    members.insert({step.kernel, current, step.next});
                    current = step.next;
                }
            }
        }
    }
    return members;
}

// ConvertRow also checks that nothing past the row's end is written.
TEST(ReferenceKernels, KnowEveryStepOfEveryChain) {
    const auto members = AllMembers();
    std::set<std::string> kernels;
    for (const auto& [kernel, source, destination] : members) {
        kernels.insert(kernel);
        for (const int32_t width : {0, 1, 2, 6, 7, 13}) {
            for (const bool vectorMember : {false, true}) {
                EXPECT_NO_THROW(ConvertRow<uint8_t>(kernel, source, destination, RandomRow(source, width),
                                                    width, {vectorMember, 3}));
            }
        }
    }
    EXPECT_EQ(kernels.size(), 59u) << "some kernel is named by no chain, or one is new";
}

TEST(ReferenceKernels, RefuseTheUnknown) {
    uint8_t row[64] = {};
    uint8_t result[64] = {};
    const auto run = [&](const char* kernel, uint32_t source, uint32_t destination) {
        reference::Run(kernel, source, destination, false, row, result, 1);
    };
    EXPECT_THROW(run("NoSuchRow", kBGRA_4444_8u, kBGRA_4444_8u), std::invalid_argument);
    EXPECT_THROW(run("CopyRow", kBGRA_4444_8u, kBGRP_4444_8u), std::invalid_argument);
    EXPECT_THROW(run("CopyRow", 0x841, 0x841), std::invalid_argument);
    EXPECT_THROW(run("PremultiplyRow", kUYVY_422_8u, kUYVY_422_8u), std::invalid_argument);
    EXPECT_THROW(run("YUV601ToRGBRow", kVUYA_4444_8u_709, kBGRA_4444_8u), std::invalid_argument);
    EXPECT_THROW(run("RGBToYUV601Row", kBGRA_4444_8u, kVUYA_4444_8u_709), std::invalid_argument);
    EXPECT_THROW(run("Upsample422To444Row", kUYVY_422_8u, kVUYA_4444_8u_709), std::invalid_argument);
    EXPECT_THROW(run("Expand8uTo15uRow", kVUYA_4444_8u, 0x885), std::invalid_argument);
    EXPECT_THROW(reference::Run("CopyRow", kBGRA_4444_8u, kBGRA_4444_8u, false, row, result, -1),
                 std::invalid_argument);
}

TEST(ReferenceKernels, RowLengthsIncludeWholePairsAndGroups) {
    EXPECT_EQ(RowLength(kUYVY_422_8u, 3), 8);
    EXPECT_EQ(RowLength(kYUYV_422_32f, 1), 16);
    EXPECT_EQ(RowLength(kV210_422_10u, 6), 16);
    EXPECT_EQ(RowLength(kV210_422_10u_709, 7), 32);
    EXPECT_EQ(RowLength(kRGB_444_10u, 3), 12);
    EXPECT_EQ(RowLength(kPRGB_4444_15u, 3), 24);
    EXPECT_EQ(RowLength(kBGRX_4444_32f_Linear, 3), 48);
    EXPECT_EQ(RowLength(0x01000821, 3), 0);
}

TEST(ReferenceCopyAndAlpha, CopyTakesTheWholeLastPair) {
    EXPECT_EQ(ConvertRow<uint8_t>("CopyRow", kUYVY_422_8u, kUYVY_422_8u, Bytes{1, 2, 3, 4, 9}, 1),
              (Bytes{1, 2, 3, 4}));
}

TEST(ReferenceCopyAndAlpha, OpaqueByDepthAndOrder) {
    const char* kernel = "ForceOpaqueRow";
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kVUYP_4444_8u, kVUYX_4444_8u, Bytes{1, 2, 3, 4}, 1),
              (Bytes{1, 2, 3, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kPRGB_4444_8u, kXRGB_4444_8u, Bytes{1, 2, 3, 4}, 1),
              (Bytes{255, 2, 3, 4}));
    EXPECT_EQ(ConvertRow<uint16_t>(kernel, kBGRP_4444_15u, kBGRX_4444_15u, Words{1, 2, 3, 4}, 1),
              (Words{1, 2, 3, 32768}));
    EXPECT_EQ(ConvertRow<uint16_t>(kernel, kPRGB_4444_15u, kXRGB_4444_15u, Words{1, 2, 3, 4}, 1),
              (Words{32768, 2, 3, 4}));
    EXPECT_EQ(ConvertRow<float>(kernel, kBGRX_4444_32f, kBGRA_4444_32f, Floats{1, 2, 3, 4}, 1),
              (Floats{1, 2, 3, 1}));
    EXPECT_EQ(ConvertRow<float>(kernel, kXRGB_4444_32f, kPRGB_4444_32f, Floats{5, 2, 3, 4}, 1),
              (Floats{1, 2, 3, 4}));
}

TEST(ReferenceCopyAndAlpha, SwapReversesPixelsAndExchangesWithinPairs) {
    const char* kernel = "SwapOrderRow";
    const Bytes pixels = {1, 2, 3, 4, 5, 6, 7, 8};
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kBGRA_4444_8u, kARGB_4444_8u, pixels, 2),
              (Bytes{4, 3, 2, 1, 8, 7, 6, 5}));
    EXPECT_EQ(ConvertRow<uint16_t>(kernel, kXRGB_4444_15u, kBGRX_4444_15u, Words{1, 2, 3, 4}, 1),
              (Words{4, 3, 2, 1}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kUYVY_422_8u, kYUYV_422_8u, pixels, 3),
              (Bytes{2, 1, 4, 3, 6, 5, 8, 7}));
    EXPECT_EQ(ConvertRow<float>(kernel, kYUYV_422_32f_709, kUYVY_422_32f_709, Floats{1, 2, 3, 4}, 1),
              (Floats{2, 1, 4, 3}));
}

} // namespace
