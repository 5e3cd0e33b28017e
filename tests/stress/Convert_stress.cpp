// Conversions between formats whose chains have little in common, against what one thread made of them.

#include "stress/Operation.h"

#include "support/Random.h"

#include "frame/TransientMemory.h"

#include <PixelKiln/Convert.h>

#include <algorithm>
#include <cstring>
#include <vector>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 21; // odd: ends of rows take part
constexpr int32_t kQuality = 4;

struct FormatPair {
    PK_PixelFormat source, destination;
};

constexpr FormatPair kPairs[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_15u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f_Linear},
    {PK_PixelFormat_YUYV_422_8u_709, PK_PixelFormat_RGB_444_10u},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_V210_422_10u_709},
};

struct Conversion {
    PK_PixelFormat sourceFormat, destinationFormat;
    std::vector<uint8_t> source, expected; // rows without padding

    PK_Result Run(void* destination, int32_t rowBytes) const {
        return PK_Convert(source.data(), PK_PixelFormatPackedRowBytes(sourceFormat, kWidth), sourceFormat,
                          destination, rowBytes, destinationFormat, kWidth, kHeight, kQuality);
    }

    bool ComesOutRight() const {
        const PK::TransientPixelBuffer made(destinationFormat, kWidth, kHeight);
        if (made.Result() != PK_Success || Run(made.Pixels(), made.RowBytes()) != PK_Success) return false;
        const int32_t packed = PK_PixelFormatPackedRowBytes(destinationFormat, kWidth);
        for (int32_t row = 0; row < kHeight; ++row)
            if (std::memcmp(made.Pixels() + row * made.RowBytes(),
                            &expected[static_cast<size_t>(row * packed)], static_cast<size_t>(packed)) != 0)
                return false;
        return true;
    }
};

size_t ImageBytes(PK_PixelFormat format) {
    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, kWidth) * kHeight);
}

std::function<bool()> PrepareConvert() {
    PKTest::Random random(11);
    std::vector<Conversion> conversions;
    for (const auto [source, destination] : kPairs) {
        Conversion conversion{source, destination, random.Bytes(ImageBytes(source)), {}};
        conversion.expected.resize(ImageBytes(destination));
        conversion.Run(conversion.expected.data(), PK_PixelFormatPackedRowBytes(destination, kWidth));
        conversions.push_back(conversion);
    }
    return [conversions] { return std::ranges::all_of(conversions, &Conversion::ComesOutRight); };
}

const Operation sConvert("convert", PrepareConvert);

} // namespace
