// Gains in every working format, and sums of images of several formats.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Accumulate.h>

namespace {

using namespace PKStress;

struct Scaling {
    PK_PixelFormat from, to;
    float gain = 0.7f;
    int32_t width = 97, height = 33; // odd: ends of rows take part
};

constexpr Scaling kScalings[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYP_4444_8u_709},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_ARGB_4444_15u},
    {PK_PixelFormat_ARGB_4444_32f, PK_PixelFormat_PRGB_4444_32f},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_32f},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, 0},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_VUYA_4444_32f, 1.3f, 17001,
     2}, // scratch rows of the recycler
};

std::function<bool()> PrepareGains() {
    PKTest::Random random(53);
    std::vector<Call> calls;
    for (const Scaling& scaling : kScalings)
        calls.push_back({RandomImage(scaling.to, scaling.width, scaling.height, random),
                         [scaling, source = RandomImage(scaling.from, scaling.width, scaling.height, random)](
                             uint8_t* image) {
                             const auto rowBytes = [&](PK_PixelFormat format) {
                                 return PK_PixelFormatRowBytes(format, scaling.width);
                             };
                             return PK_AlphaGain(source.data(), rowBytes(scaling.from), scaling.from, image,
                                                 rowBytes(scaling.to), scaling.to, scaling.width,
                                                 scaling.height, scaling.gain, 4);
                         }});
    return Repeat(calls);
}

constexpr PK_PixelFormat kSummed[] = {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u,
                                      PK_PixelFormat_V210_422_10u, PK_PixelFormat_PRGB_4444_8u,
                                      PK_PixelFormat_BGRA_4444_8u};

Call Sum(size_t count, PK_PixelFormat to, int32_t width, int32_t height, int32_t quality,
         PKTest::Random& random) {
    std::vector<std::vector<uint8_t>> images;
    std::vector<int32_t> rowBytes;
    std::vector<PK_PixelFormat> formats;
    std::vector<double> weights;
    for (size_t i = 0; i < count; ++i) {
        formats.push_back(kSummed[i % std::size(kSummed)]);
        images.push_back(RandomImage(formats[i], width, height, random));
        rowBytes.push_back(PK_PixelFormatRowBytes(formats[i], width));
        weights.push_back(i == 2 ? 0 : 0.31);
    }
    return {RandomImage(to, width, height, random), [=](uint8_t* image) {
                std::vector<const void*> pixels;
                for (const std::vector<uint8_t>& source : images) pixels.push_back(source.data());
                return PK_Accumulate(pixels.data(), rowBytes.data(), formats.data(), weights.data(),
                                     static_cast<int32_t>(count), image, PK_PixelFormatRowBytes(to, width),
                                     to, width, height, quality);
            }};
}

std::function<bool()> PrepareSums() {
    PKTest::Random random(54);
    return Repeat({
        Sum(5, PK_PixelFormat_BGRA_4444_8u, 97, 33, 4, random),
        Sum(5, PK_PixelFormat_UYVY_422_8u, 97, 33, 5, random),
        Sum(13, PK_PixelFormat_BGRP_4444_32f, 97, 9, 4, random),
        Sum(3, PK_PixelFormat_ARGB_4444_15u, 17001, 2, 4, random), // scratch rows of the recycler
    });
}

const Operation sGains("alpha-gain", PrepareGains);
const Operation sSums("accumulate", PrepareSums);

} // namespace
