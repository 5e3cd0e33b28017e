#pragma once

// What an encoder of DV is free to decide: all of it.

#include <cstdint>

namespace PK {

struct DVPolicy {
    enum class Class : uint8_t {
        ByMagnitude, ///< The greater a block's greatest coefficient, the higher; chroma one or two higher than luma.
        Two,         ///< 2 for all, and 3 where a level would pass 255.
    };
    enum class Quantiser : uint8_t {
        OfSegment,    ///< One for its five macroblocks: the finest that fits.
        OfMacroblock, ///< The finest that fits all five, and then finer ones for those where there is room.
    };
    enum class Mode : uint8_t {
        MoreZeros, ///< 2-4-8 where its coefficients have more zeros.
        LessMagnitude, ///< 2-4-8 where the sum of log2(1 + coefficient) is less, unless the lines of the frame differ by less
        ///< than 3/4 of what those of a field do.
    };
    enum class Fields : uint8_t {
        Never,
        WhereSmoother, ///< In 1080i, macroblocks of fields where the lines of one field differ less.
    };

    Class classes;
    Quantiser quantiser;
    Mode mode;
    Fields fields;
    float
        roundUp; ///< The part of a step that is added to a coefficient before its level is cut, DV25 and DV50
    float roundUpHD;         ///< and DV100.
    int32_t sampleBits;      ///< Fractional bits of the samples that are transformed
    int32_t coefficientBits; ///< and of the weighted coefficients.
};

/// The fast one. The little that it adds makes up for what a product of floats may be short of a whole number.
inline constexpr DVPolicy kPlainDVPolicy = {DVPolicy::Class::ByMagnitude,
                                            DVPolicy::Quantiser::OfSegment,
                                            DVPolicy::Mode::MoreZeros,
                                            DVPolicy::Fields::Never,
                                            0x1p-10f,
                                            0x1p-10f,
                                            0,
                                            0};

/// The one whose pictures are nearest to what they were.
inline constexpr DVPolicy kBestDVPolicy = {DVPolicy::Class::Two,
                                           DVPolicy::Quantiser::OfMacroblock,
                                           DVPolicy::Mode::LessMagnitude,
                                           DVPolicy::Fields::WhereSmoother,
                                           1 / 3.0f,
                                           0.5f,
                                           3,
                                           4};

} // namespace PK
