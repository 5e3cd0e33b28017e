// Reductions and copies of planar images, against what one thread made of them.

#include "stress/Operation.h"

#include "support/Random.h"

#include <PixelKiln/Planar.h>
#include <PixelKiln/QuarterScale.h>

#include <vector>

namespace {

using namespace PKStress;

constexpr uint32_t kWidth = 131, kHeight = 22; // of luma; odd: ends of rows take part
constexpr int32_t kRowBytes[3] = {2 * kWidth, kWidth, kWidth};
constexpr size_t kPlaneBytes = 2 * kWidth * kHeight;

/// Planes large enough for all operations.
struct Image {
    std::vector<uint8_t> planes[3];

    explicit Image(PKTest::Random& random) {
        for (std::vector<uint8_t>& plane : planes) plane = random.Bytes(kPlaneBytes);
    }
    Image() {
        for (std::vector<uint8_t>& plane : planes) plane.resize(kPlaneBytes);
    }
    bool operator==(const Image&) const = default;
};

PK_Result RunAll(const Image& source, Image& copy, Image& reduced, std::vector<uint8_t>& packed) {
    const void* const from[3] = {source.planes[0].data(), source.planes[1].data(), source.planes[2].data()};
    void* const toCopy[3] = {copy.planes[0].data(), copy.planes[1].data(), copy.planes[2].data()};
    void* const toReduced[3] = {reduced.planes[0].data(), reduced.planes[1].data(), reduced.planes[2].data()};
    packed.resize(kPlaneBytes);
    const PK_Result results[] = {
        PK_CopyPlanar_8u(from, kRowBytes, toCopy, kRowBytes, kWidth, kHeight),
        PK_QuarterScalePlanar420_8u(from, kRowBytes, toReduced, kRowBytes, kWidth, kHeight, 2),
        PK_QuarterScalePlanar_8uAndConvertTo422_8u(from, kRowBytes, packed.data(), 2 * kWidth + 2, kWidth,
                                                   kHeight, false, 1)};
    for (const PK_Result result : results)
        if (result != PK_Success) return result;
    return PK_Success;
}

std::function<bool()> PrepareQuarterScale() {
    PKTest::Random random(332);
    const Image source(random);
    Image copy, reduced;
    std::vector<uint8_t> packed;
    const PK_Result first = RunAll(source, copy, reduced, packed);
    return [=] {
        Image copyNow, reducedNow;
        std::vector<uint8_t> packedNow;
        return first == PK_Success && RunAll(source, copyNow, reducedNow, packedNow) == PK_Success &&
               copyNow == copy && reducedNow == reduced && packedNow == packed;
    };
}

const Operation sQuarterScale("quarter-scale", PrepareQuarterScale);

} // namespace
