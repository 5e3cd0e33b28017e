// Component order and forced alpha: every sample is found again at its new place.

#include "convert/KernelBodies.h"

#include <algorithm>

namespace {

using PK::Kernel;
using PK::RowKernel;
using PK::Target;
using namespace PKTest;

constexpr int32_t kLongest = 70; // two groups of every body and a tail

/// Samples that differ from all near them. Floats are compared as bits, so that NaN passes through.
template <class Sample>
std::vector<Sample> Samples(size_t count) {
    std::vector<Sample> samples(count);
    for (size_t i = 0; i < count; ++i) samples[i] = static_cast<Sample>((i + 1) * 0x9E3779B1u >> 3);
    return samples;
}

template <class Sample>
void CheckForceOpaque(Kernel kernel, size_t alphaPlace, Sample opaque) {
    ForEachBody(kernel, [&](Target, RowKernel body) {
        for (int32_t width = 0; width <= kLongest; ++width) {
            const auto source = Samples<Sample>(4 * static_cast<size_t>(width));
            auto expected = source;
            for (size_t i = alphaPlace; i < expected.size(); i += 4) expected[i] = opaque;
            ASSERT_EQ(RunRow<Sample>(body, source, width, source.size()), expected) << "width " << width;
            ASSERT_EQ(RunRowInPlace(body, source, width), expected) << "in place, width " << width;
        }
    });
}

TEST(ForceOpaqueRow, WritesFullScaleToTheLastSampleOfBGRA) {
    CheckForceOpaque<uint8_t>(Kernel::ForceOpaqueRow_BGRA_8u, 3, 255);
    CheckForceOpaque<uint16_t>(Kernel::ForceOpaqueRow_BGRA_15u, 3, 32768);
    CheckForceOpaque<uint32_t>(Kernel::ForceOpaqueRow_BGRA_32f, 3, 0x3f800000);
}

TEST(ForceOpaqueRow, WritesFullScaleToTheFirstSampleOfARGB) {
    CheckForceOpaque<uint8_t>(Kernel::ForceOpaqueRow_ARGB_8u, 0, 255);
    CheckForceOpaque<uint16_t>(Kernel::ForceOpaqueRow_ARGB_15u, 0, 32768);
    CheckForceOpaque<uint32_t>(Kernel::ForceOpaqueRow_ARGB_32f, 0, 0x3f800000);
}

TEST(ForceOpaqueRow, KeepsSpecialFloatsInTheColour) {
    const std::vector<uint32_t> source = {0x7fa00000, 0xff800000, 0x80000000,
                                          0x7fc00000}; // signalling NaN first
    ForEachBody(Kernel::ForceOpaqueRow_BGRA_32f, [&](Target, RowKernel body) {
        const std::vector<uint32_t> expected = {0x7fa00000, 0xff800000, 0x80000000, 0x3f800000};
        EXPECT_EQ(RunRow<uint32_t>(body, source, 1, 4), expected);
    });
}

template <class Sample>
void CheckReversal(Kernel kernel) {
    ForEachBody(kernel, [&](Target, RowKernel body) {
        const std::vector<Sample> pixel = {1, 2, 3, 4}, reversed = {4, 3, 2, 1};
        EXPECT_EQ(RunRow<Sample>(body, pixel, 1, 4), reversed);
        for (int32_t width = 0; width <= kLongest; ++width) {
            const auto source = Samples<Sample>(4 * static_cast<size_t>(width));
            auto expected = source;
            for (auto first = expected.begin(); first != expected.end(); first += 4)
                std::reverse(first, first + 4);
            ASSERT_EQ(RunRow<Sample>(body, source, width, source.size()), expected) << "width " << width;
            ASSERT_EQ(RunRowInPlace(body, source, width), expected) << "in place, width " << width;
        }
    });
}

TEST(SwapOrderRow, ReversesTheSamplesOfAPixel) {
    CheckReversal<uint8_t>(Kernel::SwapOrderRow_4444_8u);
    CheckReversal<uint16_t>(Kernel::SwapOrderRow_4444_15u);
    CheckReversal<uint32_t>(Kernel::SwapOrderRow_4444_32f);
}

template <class Sample>
void CheckPairSwap(Kernel kernel) {
    ForEachBody(kernel, [&](Target, RowKernel body) {
        const std::vector<Sample> uyvy = {1, 2, 3, 4}, yuyv = {2, 1, 4, 3};
        EXPECT_EQ(RunRow<Sample>(body, uyvy, 2, 4), yuyv);
        EXPECT_EQ(RunRow<Sample>(body, uyvy, 1, 4), yuyv) << "an odd width takes its whole last pair";
        for (int32_t width = 0; width <= kLongest; ++width) {
            const auto source = Samples<Sample>(4 * static_cast<size_t>((width + 1) / 2));
            auto expected = source;
            for (size_t i = 0; i < expected.size(); i += 2) std::swap(expected[i], expected[i + 1]);
            ASSERT_EQ(RunRow<Sample>(body, source, width, source.size()), expected) << "width " << width;
            ASSERT_EQ(RunRowInPlace(body, source, width), expected) << "in place, width " << width;
        }
    });
}

TEST(SwapOrderRow, SwapsLumaAndChromaOfAPair) {
    CheckPairSwap<uint8_t>(Kernel::SwapOrderRow_422_8u);
    CheckPairSwap<uint32_t>(Kernel::SwapOrderRow_422_32f);
}

} // namespace
