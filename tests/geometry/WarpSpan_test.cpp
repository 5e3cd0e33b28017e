// Every body of the quad warp against the restatement, pixel for pixel.

#include "reference/ReferenceQuadWarp.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <PixelKiln/QuadWarp.h>

#include <algorithm>
#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;
using PKReference::QuadWarp;

namespace {

/// Memory that ends with the last pixel of the rectangle, or begins with the first.
class Area {
public:
    Area(const PK_Rect& rect, int32_t stride, Guard guard, Random& random)
        : fRows(4 * static_cast<size_t>((rect.bottom - rect.top - 1) * stride + rect.right - rect.left),
                guard),
          fOffset(4 * (ptrdiff_t{rect.top} * stride + rect.left)) {
        random.Fill(fRows.Bytes(), fRows.Size());
    }

    /// Pixel (0, 0), which need not be in the area.
    uint8_t* Origin() const {
        return reinterpret_cast<uint8_t*>(reinterpret_cast<uintptr_t>(fRows.Bytes()) -
                                          static_cast<uintptr_t>(fOffset));
    }
    std::vector<uint8_t> Copy() const { return {fRows.Bytes(), fRows.Bytes() + fRows.Size()}; }
    void Restore(const std::vector<uint8_t>& bytes) const {
        std::copy(bytes.begin(), bytes.end(), fRows.Bytes());
    }

private:
    GuardedRows fRows;
    ptrdiff_t fOffset;
};

int32_t Between(Random& random, int32_t low, int32_t high) {
    return low + static_cast<int32_t>(random.Below(static_cast<uint32_t>(high - low + 1)));
}

PK_Rect DrawRect(Random& random) {
    const int32_t left = Between(random, -3, 9), top = Between(random, -3, 9);
    return {left, top, left + Between(random, 1, 70), top + Between(random, 1, 20)};
}

/// Any corners in and around the rectangle; now and then on a grid of quarters, where centres lie on borders.
void DrawQuad(Random& random, const PK_Rect& rect, double quad[8]) {
    const bool onGrid = random.Below(3) == 0;
    const int32_t grid = onGrid ? 4 : 9973;
    const bool isBox = random.Below(4) == 0;
    for (int32_t i = 0; i < 8; ++i) {
        const int32_t low = i % 2 == 0 ? rect.left : rect.top, high = i % 2 == 0 ? rect.right : rect.bottom;
        quad[i] = Between(random, (low - 6) * grid, (high + 6) * grid) / static_cast<double>(grid);
    }
    if (isBox) {
        quad[2] = quad[4];
        quad[3] = quad[1];
        quad[6] = quad[0];
        quad[7] = quad[5];
    }
    if (random.Below(8) == 0) std::copy_n(quad, 2, quad + 2); // a triangle
}

QuadWarp DrawWarp(Random& random) {
    QuadWarp warp;
    warp.sourceRect = DrawRect(random);
    warp.destinationRect = DrawRect(random);
    DrawQuad(random, warp.sourceRect, warp.sourceQuad);
    DrawQuad(random, warp.destinationRect, warp.destinationQuad);
    warp.quality = Between(random, 2, 3);
    warp.opacity = random.Below(2) == 0 ? 255 : Between(random, 0, 255);
    warp.blend = random.Below(3) != 0;
    warp.keepSourceAlpha = random.Below(2) == 0;
    constexpr PK_PixelFormat kFormats[] = {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u,
                                           PK_PixelFormat_VUYA_4444_8u_709};
    warp.format = kFormats[random.Below(3)];
    warp.field = Between(random, 0, 2);
    warp.ignoreFields = random.Below(4) == 0;
    warp.featherOver = random.Below(4) == 0;
    warp.feather = random.Below(2) == 0 ? 0 : static_cast<float>(Between(random, 1, 900)) / 100;
    return warp;
}

PK_Result Call(const QuadWarp& warp) {
    return PK_WarpAffineQuad(nullptr, nullptr, warp.source, warp.sourceRowBytes, &warp.sourceRect,
                             warp.sourceQuad, warp.destination, warp.destinationRowBytes,
                             &warp.destinationRect, warp.destinationQuad, warp.quality, warp.opacity,
                             warp.blend, warp.keepSourceAlpha, warp.format, warp.field, warp.ignoreFields,
                             warp.featherOver, warp.feather);
}

} // namespace

TEST(WarpSpan, EveryBodyDrawsAsTheRestatement) {
    Random random(53);
    for (int32_t round = 0; round < 6000; ++round) {
        QuadWarp warp = DrawWarp(random);
        const int32_t sourceStride = warp.sourceRect.right - warp.sourceRect.left + Between(random, 0, 5);
        const int32_t destinationStride =
            warp.destinationRect.right - warp.destinationRect.left + Between(random, 0, 5);
        const Guard guard = random.Below(2) == 0 ? Guard::kBefore : Guard::kAfter;
        const Area source(warp.sourceRect, sourceStride, guard, random);
        const Area destination(warp.destinationRect, destinationStride, guard, random);
        warp.source = source.Origin();
        warp.destination = destination.Origin();
        warp.sourceRowBytes = 4 * (random.Below(2) == 0 ? sourceStride : -sourceStride);
        warp.destinationRowBytes = 4 * (random.Below(2) == 0 ? destinationStride : -destinationStride);

        constexpr uint32_t kModes[] = {0, 0, kRoundUp, kRoundDown};
        const FloatEnvironment rounding(kModes[random.Below(4)]);
        const std::vector<uint8_t> before = destination.Copy();
        DrawQuadWarp(warp);
        const std::vector<uint8_t> expected = destination.Copy();
        AtEveryTarget([&] {
            destination.Restore(before);
            ASSERT_EQ(Call(warp), PK_Success);
            const std::vector<uint8_t> actual = destination.Copy();
            const auto place = std::mismatch(expected.begin(), expected.end(), actual.begin());
            ASSERT_TRUE(place.first == expected.end())
                << "round " << round << ", seed " << random.Seed() << ", byte "
                << place.first - expected.begin() << ": expected " << int{*place.first} << ", is "
                << int{*place.second} << "; quality " << warp.quality << ", blend " << warp.blend
                << ", format " << warp.format << ", field " << warp.field << ", feather " << warp.feather;
        });
        if (HasFatalFailure()) return;
    }
}

/// Strips of less than a pixel, which are between two columns for thousands of rows and then in one.
TEST(WarpSpan, DrawsFarDownAsTheRestatement) {
    constexpr PK_Rect kRect = {0, -40000, 3, 160000};
    Random random(55);
    const uint8_t source[4] = {1, 2, 3, 4};
    const Area destination(kRect, 3, Guard::kAfter, random);
    const std::vector<uint8_t> before = destination.Copy();
    for (int32_t round = 0; round < 12; ++round) {
        QuadWarp warp;
        warp.source = source;
        warp.sourceRowBytes = 4;
        warp.sourceRect = {0, 0, 1, 1};
        warp.destination = destination.Origin();
        warp.destinationRowBytes = 12;
        warp.destinationRect = kRect;
        const double top = Between(random, -400, 80) / 173.0, bottom = Between(random, 440, 800) / 173.0;
        const double width = Between(random, 10, 100) / 173.0;
        const double quad[8] = {top, -5e4, top + width, -5e4, bottom + width, 2e5, bottom, 1.5e5};
        std::copy_n(quad, 8, warp.destinationQuad);
        warp.field = Between(random, 0, 2);
        destination.Restore(before);
        DrawQuadWarp(warp);
        const std::vector<uint8_t> expected = destination.Copy();
        ASSERT_TRUE(expected != before);
        destination.Restore(before);
        ASSERT_EQ(Call(warp), PK_Success);
        ASSERT_TRUE(destination.Copy() == expected) << "round " << round << ", seed " << random.Seed();
    }
}

/// Every alpha over every alpha, as one row of pixels. The quotients are those of integers in every rounding mode.
TEST(WarpSpan, EveryBodyMixesAsTheRestatement) {
    constexpr int32_t kWidth = 65536;
    std::vector<uint8_t> source(4 * kWidth), before(4 * kWidth);
    Random random(54);
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u}) {
        for (int32_t round = 0; round < 20; ++round) {
            constexpr uint32_t kModes[] = {0, kRoundDown, kRoundUp, kRoundToZero};
            const bool isFlat = round < 16; // black and white, where quotients are at their ends
            const FloatEnvironment rounding(kModes[isFlat ? round / 4 : round % 4]);
            random.Fill(source.data(), source.size());
            random.Fill(before.data(), before.size());
            for (size_t i = 0; i < kWidth; ++i) {
                if (isFlat) {
                    std::fill_n(&source[4 * i], 3, static_cast<uint8_t>(round & 1 ? 255 : 0));
                    std::fill_n(&before[4 * i], 3, static_cast<uint8_t>(round & 2 ? 255 : 0));
                }
                source[4 * i + 3] = static_cast<uint8_t>(i & 255);
                before[4 * i + 3] = static_cast<uint8_t>(i >> 8);
            }
            QuadWarp warp;
            warp.source = source.data();
            warp.sourceRowBytes = warp.destinationRowBytes = 4 * kWidth;
            warp.sourceRect = warp.destinationRect = {0, 0, kWidth, 1};
            const double quad[8] = {0, 0, kWidth, 0, kWidth, 1, 0, 1};
            std::copy_n(quad, 8, warp.sourceQuad);
            std::copy_n(quad, 8, warp.destinationQuad);
            warp.quality = 3;
            warp.blend = true;
            warp.format = format;
            std::vector<uint8_t> expected = before;
            warp.destination = expected.data();
            DrawQuadWarp(warp);
            AtEveryTarget([&] {
                std::vector<uint8_t> actual = before;
                warp.destination = actual.data();
                ASSERT_EQ(Call(warp), PK_Success);
                ASSERT_TRUE(actual == expected) << "round " << round;
            });
            if (HasFatalFailure()) return;
        }
    }
}
