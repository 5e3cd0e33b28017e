// Quadrilaterals drawn with both kinds of sampling, blended and not, with and without a soft rim.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/QuadWarp.h>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 61;

struct Warp {
    int32_t quality;
    int32_t opacity;
    bool blend;
    PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
    int32_t field = 0;
    bool featherOver = false;
    float feather = 0;

    PK_Result Draw(const uint8_t* source, uint8_t* destination) const {
        constexpr PK_Rect kRect = {0, 0, kWidth, kHeight};
        constexpr double kSource[8] = {3.1, 1.7, 90.2, 5.9, 94.3, 58.1, 1.4, 55.5};
        constexpr double kDestination[8] = {-4.6, 8.3, 71.7, -2.1, 101.9, 40.2, 22.8, 59.4};
        return PK_WarpAffineQuad(nullptr, nullptr, source, 4 * kWidth, &kRect, kSource, destination,
                                 4 * kWidth, &kRect, kDestination, quality, opacity, blend, false, format,
                                 field, false, featherOver, feather);
    }
};

constexpr Warp kWarps[] = {
    {2, 255, false},
    {3, 255, false},
    {3, 171, true},
    {3, 171, true, PK_PixelFormat_VUYA_4444_8u, 2},
    {3, 200, true, PK_PixelFormat_BGRA_4444_8u, 0, false, 5.7f},
    {3, 255, false, PK_PixelFormat_BGRA_4444_8u, 1, true, 3.1f},
};

std::function<bool()> PrepareQuadWarp() {
    PKTest::Random random(61);
    constexpr size_t kBytes = 4 * kWidth * kHeight;
    std::vector<Call> calls;
    for (const Warp& warp : kWarps)
        calls.push_back({random.Bytes(kBytes), [warp, source = random.Bytes(kBytes)](uint8_t* image) {
                             return warp.Draw(source.data(), image);
                         }});
    return Repeat(calls);
}

const Operation sQuadWarp("quad-warp", PrepareQuadWarp);

} // namespace
