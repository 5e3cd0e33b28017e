// The kernels of the box blur, beyond what images of ordinary size ask of them.

#include "filters/BoxBlurKernels.h"

#include "reference/ReferenceBoxBlur.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

using namespace PKTest;

constexpr int32_t kRenormalise = 16;

const PK::BoxBlurKernels& Kernels() {
    return PK::Best<PK::BoxBlurKernels>();
}

} // namespace

// Around 7900 the quotient changes its method; the sums of white are the largest there are.
TEST(BoxBlurKernels, BundlesAreExactUpToTheLargestSize) {
    Random random(7);
    for (const int32_t size : {2, 14, 15, 16, 17, 3949, 3950, 3951, 4000, 9001, PK::kLargestBundleSize})
        for (const int32_t weight : {0, 1, 127, 255})
            for (const bool white : {false, true}) {
                const int32_t length = size * 2 + 40;
                std::vector<uint8_t> bundle(static_cast<size_t>(length) * PK::kBundleStep, 255),
                    blurred(bundle);
                if (!white) random.Fill(bundle.data(), bundle.size());
                const PK::BoxPass pass = {length, size, weight, size % 2 == 0, 0xffffffff};
                AtEveryTarget([&] {
                    Kernels().bundle(pass, bundle.data(), blurred.data());
                    for (const size_t offset : {0, 36, 60}) {
                        std::vector<uint8_t> line(static_cast<size_t>(length) * 4), expected(line), got(line);
                        for (size_t i = 0; i < line.size(); ++i) {
                            line[i] = bundle[i / 4 * PK::kBundleStep + offset + i % 4];
                            got[i] = blurred[i / 4 * PK::kBundleStep + offset + i % 4];
                        }
                        Kernels().line(pass, line.data(), expected.data());
                        ASSERT_EQ(got, expected)
                            << "size " << size << ", weight " << weight << ", seed " << random.Seed();
                    }
                });
            }
}

TEST(BoxBlurKernels, ASingleLineIsFilteredAsBundlesAre) {
    Random random(8);
    for (int32_t length = 4; length <= 60; ++length)
        for (int32_t size = 1; size <= length - 2; ++size)
            for (const int32_t weight : {0, 1, 128, 254}) {
                if (size == 1 && weight == 0) continue; // is no pass
                BoxLine line(static_cast<size_t>(length)), got(line);
                random.Fill(line[0].data(), line.size() * 4);
                for (const int32_t flags : {7, 7 | kRenormalise}) {
                    const BoxLine expected = ReferenceBoxPass(line, {size, weight}, flags);
                    AtEveryTarget([&] {
                        Kernels().line({length, size, weight, flags != 7, 0x00ffffff}, line[0].data(),
                                       got[0].data());
                        ASSERT_EQ(got, expected) << "length " << length << ", size " << size << ", weight "
                                                 << weight << ", seed " << random.Seed();
                    });
                    if (HasFatalFailure()) return;
                }
            }
}

TEST(BoxBlurKernels, ASingleLineSumsBeyond32Bits) {
    const int32_t size = 200000;
    BoxLine line(2 * size + 100, {255, 254, 1, 0});
    AtEveryTarget([&] {
        BoxLine got(line.size());
        Kernels().line({static_cast<int32_t>(line.size()), size, 100, true, 0xffffffff}, line[0].data(),
                       got[0].data());
        EXPECT_EQ(got, line);
    });
}
